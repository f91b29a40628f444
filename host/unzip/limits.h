// How much an archive may ask for. Adapter packages are far below; what is above is an accident or
// an attack on the memory or the file system of the host.
#pragma once

#include <cstddef>
#include <cstdint>

namespace velkhost::unzip {

inline constexpr std::uint64_t kMebibyte = std::uint64_t{1024} * 1024;

// Entries. A package has some hundred files at most: payloads, tools, notices.
inline constexpr std::uint64_t kMaxEntries = 4096;

// Bytes of the archive's directory, which is held in memory: a kibibyte for every entry's name and
// three for what stands beside it.
inline constexpr std::uint64_t kMaxDirectorySize = kMaxEntries * 4096;

// Bytes of all entries together, unpacked, and so of the archive too. A host's scratch partition
// has 4 GiB and is used by others as well; the largest firmware bundles have some hundred MiB.
inline constexpr std::uint64_t kMaxTotalSize = 1024 * kMebibyte;

// Unpacked bytes for one byte of archive. Firmware rarely gains more than 10. Deflate itself ends
// at 1032, entries that share their data have no limit.
inline constexpr std::uint64_t kMaxRatio = 200;

// Up to so many bytes any ratio will do: an erased flash image is all 0xFF.
inline constexpr std::uint64_t kSizeBelowRatio = 16 * kMebibyte;

// Bytes of a name: the longest payload name that a package's configuration file can state.
inline constexpr std::size_t kMaxNameLength = 1022;

// Bytes of one part of a name: what file systems take (NAME_MAX).
inline constexpr std::size_t kMaxPartLength = 255;

// Folders inside each other.
inline constexpr std::size_t kMaxDepth = 16;

}  // namespace velkhost::unzip
