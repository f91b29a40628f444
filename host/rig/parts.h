// Where the parts of a stand-in host lie: shared objects, classes, registrations. A build tree and
// an installation have the same shape around the program:
//
//     bin/velkhost
//     lib/velkhost/parts/ or lib/    shared objects
//     share/velkhost/mof/            classes
//     share/velkhost/registration/   registrations
#pragma once

#include <filesystem>
#include <vector>

namespace velkhost::rig {

struct Parts {
    std::filesystem::path libraries;                   // folder of the shared objects
    std::vector<std::filesystem::path> mof_files;      // compiled in this order
    std::vector<std::filesystem::path> registrations;  // loaded in this order

    // Around a program in `bin`. Throws RigError when something is not there.
    static Parts around(const std::filesystem::path &bin);

    // Around the running program.
    static Parts around_this_program();
};

}  // namespace velkhost::rig
