// Files of the host as the providers' callers name them.
#pragma once

#include <optional>
#include <string>

namespace velkhost::providers {

// The absolute path that a file URI of this host names, runs of '/' made one. Taken as it is
// written, without percent decoding, as the package library takes it. No value for any other text.
std::optional<std::string> path_of_file_uri(const std::string &uri);

// Whether the path names a regular file that this process can read.
bool is_readable_file(const std::string &path);

}  // namespace velkhost::providers
