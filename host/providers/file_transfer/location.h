// Where a file lies that is to be fetched.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace velkhost::providers {

// The parts of scheme://[user[:password]@]host[:port]/folders/name.
struct Location {
    std::string url;     // without user and password
    std::string scheme;  // in small letters
    std::optional<std::string> user;
    std::optional<std::string> password;
    std::string file_name;  // the last part of the path, as it is written
};

// No value for a text that is no such location: without a host or a name, with a query, a fragment,
// blanks or control characters, or with a name that no file of the store can have.
std::optional<Location> parse_location(std::string_view uri);

}  // namespace velkhost::providers
