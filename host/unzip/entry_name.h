// The name of an entry as a place under the directory that is unpacked into.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace velkhost::unzip {

struct EntryName {
    std::vector<std::string> parts;  // from the directory down; empty for the directory itself
    bool folder = false;             // the name ended in '/'
};

// Reads the name of an entry; "." and empty parts count for nothing. Throws Failure: unsafe-name
// for one that is absolute, goes up, has a drive letter, a backslash or a control character, is
// empty or too long, or lies too deep (`limits.h`).
EntryName read_entry_name(std::string_view name);

}  // namespace velkhost::unzip
