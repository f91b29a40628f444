// A first look at an archive's directory, before anything is allocated for what it claims, and for
// what libzip does not tell: it shows a NUL in a name as a blank.
#pragma once

#include <cstdint>

namespace velkhost::unzip {

// The number of entries of the archive in the open file `descriptor` of `size` bytes. Throws
// Failure: damaged where there is no whole directory up to the archive's end, too-much, or
// unsafe-name for a name with a NUL.
std::uint64_t scan_directory(int descriptor, std::uint64_t size);

}  // namespace velkhost::unzip
