#include "host/cimxml/authentication.h"

#include "host/cim/names.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdint>
#include <cstring>
#include <fstream>

namespace velkhost::cimxml {
namespace {

bool same_secret(std::string_view left, std::string_view right) {
    unsigned difference = left.size() == right.size() ? 0U : 1U;
    for (std::size_t i = 0; i < left.size(); ++i) {
        const char other = right.empty() ? '\0' : right[i % right.size()];
        difference |= static_cast<unsigned>(static_cast<unsigned char>(left[i]) ^
                                            static_cast<unsigned char>(other));
    }
    return difference == 0;
}

}  // namespace

std::string read_password(const std::filesystem::path &file) {
    struct stat info {};
    if (stat(file.c_str(), &info) != 0) {
        throw PasswordError("cannot read the password file " + file.string() + ": " +
                            std::strerror(errno));
    }
    if ((info.st_mode & (S_IRWXG | S_IRWXO)) != 0) {
        throw PasswordError("the password file " + file.string() +
                            " is open to others than its owner; chmod 600 closes it");
    }
    std::ifstream in(file);
    std::string password;
    std::getline(in, password);
    if (password.ends_with('\r')) {
        password.pop_back();
    }
    if (password.empty()) {
        throw PasswordError("the password file " + file.string() + " has no password in it");
    }
    return password;
}

bool is_authorized(const Credentials &wanted, const std::string *authorization) {
    if (authorization == nullptr) {
        return false;
    }
    const std::string_view text = *authorization;
    const std::size_t blank = text.find(' ');
    if (blank == std::string_view::npos || !cim::same_name(text.substr(0, blank), "Basic")) {
        return false;
    }
    std::string_view code = text.substr(blank + 1);
    while (code.starts_with(' ')) {
        code.remove_prefix(1);
    }
    const auto given = from_base64(code);
    return given && same_secret(*given, wanted.user + ':' + wanted.password);
}

std::optional<std::string> from_base64(std::string_view text) {
    constexpr std::string_view kAlphabet =
        "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
    const std::size_t end = std::min(text.find('='), text.size());
    if (text.size() % 4 != 0 || text.size() - end > 2 ||
        text.substr(end).find_first_not_of('=') != std::string_view::npos) {
        return std::nullopt;
    }
    std::string bytes;
    std::uint32_t bits = 0;
    unsigned count = 0;
    for (const char letter : text.substr(0, end)) {
        const std::size_t digit = kAlphabet.find(letter);
        if (digit == std::string_view::npos) {
            return std::nullopt;
        }
        bits = (bits << 6U) | static_cast<std::uint32_t>(digit);
        count += 6;
        if (count >= 8) {
            count -= 8;
            bytes += static_cast<char>((bits >> count) & 0xFFU);
        }
    }
    return bytes;
}

}  // namespace velkhost::cimxml
