// Messages of HTTP/1.1 (RFC 9110, RFC 9112) as plain data.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace velkhost::cimxml {

struct HttpField {
    std::string name;
    std::string value;
};
using HttpFields = std::vector<HttpField>;

// The value of the first field of that name, without regard to case, or nullptr.
const std::string *find_field(const HttpFields &fields, std::string_view name);

struct HttpRequest {
    std::string method;
    std::string target;
    int minor_version = 1;  // of HTTP/1.x
    HttpFields fields;
    std::string body;

    [[nodiscard]] const std::string *field(std::string_view name) const {
        return find_field(fields, name);
    }
    // Whether the client means to send another request on the connection.
    [[nodiscard]] bool keeps_connection() const;
};

struct HttpResponse {
    int status = 200;
    HttpFields fields;
    std::string body;
    bool close = false;  // the connection ends with it

    // The message as it is sent.
    [[nodiscard]] std::string bytes() const;
};

// A response of that status without a body.
HttpResponse bare_response(int status);

// Whether `list`, a field's value with commas in it, has the word, without regard to case.
bool lists_word(std::string_view list, std::string_view word);

// Without blanks and tabs at its ends.
std::string_view without_blanks(std::string_view text);

}  // namespace velkhost::cimxml
