// The C interface of libunzipfile.so.
#pragma once

// What Minizip returns, apart from the 0 of success.
enum MinizipResult {
    kMinizipDone = 0,
    kMinizipBadArgument = 1,    // a null or empty path
    kMinizipNoArchive = 2,      // not a regular file, or cannot be read
    kMinizipDamaged = 3,        // no zip archive, or not a whole one
    kMinizipEncrypted = 4,      // an entry is encrypted
    kMinizipUnknownMethod = 5,  // an entry is neither stored nor deflated
    kMinizipUnsafeName = 6,     // an entry would leave the directory, or its name is unusable
    kMinizipNotAFile = 7,       // an entry is a link, a device or the like
    kMinizipNameTwice = 8,      // two entries want the same place
    kMinizipTooMuch = 9,        // more than `limits.h` allows
    kMinizipCannotWrite = 10,   // the directory, a folder or a file in it cannot be made
    kMinizipNoMemory = 11,
};

// Unpacks the zip archive at `archive` into `directory`, which is made if it is missing, with its
// parents; files that are there already are replaced. Returns a MinizipResult.
//
// All entries are looked at before the first is written, so an archive with results 4 to 9, or
// with a damaged directory, leaves nothing behind. Damage inside an entry shows only while it is
// unpacked: then the entries before it are there, whole, and that one and those after it are not.
// Safe to call from any thread; never throws.
extern "C" __attribute__((visibility("default"))) int Minizip(const char *archive,
                                                              const char *directory) noexcept;
