// Basic authentication (RFC 7617) with one user.
#pragma once

#include <filesystem>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>

namespace velkhost::cimxml {

struct Credentials {
    std::string user;
    std::string password;
};

// The password file cannot be used; what() says why.
class PasswordError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

// The first line of a file that nobody else may read. Throws PasswordError.
std::string read_password(const std::filesystem::path &file);

// Whether the value of an Authorization field names exactly these. Takes the same time whatever
// the password's difference is.
bool is_authorized(const Credentials &wanted, const std::string *authorization);

// The bytes behind a base64 text (RFC 4648, 4); no value for a text that is none.
std::optional<std::string> from_base64(std::string_view text);

}  // namespace velkhost::cimxml
