// What unpacking an archive will write, decided before anything is written.
#pragma once

#include <cstdint>
#include <vector>

#include "host/unzip/archive.h"
#include "host/unzip/entry_name.h"

namespace velkhost::unzip {

struct PlannedEntry {
    std::uint64_t index = 0;
    EntryName name;
};

// Every entry of the archive, in its order. Throws Failure when any one of them must not be
// written, or all together are more than `limits.h` allows.
std::vector<PlannedEntry> make_plan(const Archive &archive);

}  // namespace velkhost::unzip
