#include "host/cimxml/http_message.h"

#include "host/cim/names.h"

#include <algorithm>
#include <array>
#include <utility>

namespace velkhost::cimxml {
namespace {

struct Reason {
    int status;
    std::string_view text;
};

constexpr std::array kReasons = {
    Reason{200, "OK"},
    Reason{400, "Bad Request"},
    Reason{401, "Unauthorized"},
    Reason{404, "Not Found"},
    Reason{405, "Method Not Allowed"},
    Reason{408, "Request Timeout"},
    Reason{411, "Length Required"},
    Reason{413, "Content Too Large"},
    Reason{414, "URI Too Long"},
    Reason{415, "Unsupported Media Type"},
    Reason{417, "Expectation Failed"},
    Reason{431, "Request Header Fields Too Large"},
    Reason{500, "Internal Server Error"},
    Reason{501, "Not Implemented"},
    Reason{503, "Service Unavailable"},
    Reason{505, "HTTP Version Not Supported"},
    Reason{510, "Not Extended"},
};

std::string_view reason_of(int status) {
    const auto *const place =
        std::find_if(kReasons.begin(), kReasons.end(),
                     [status](const Reason &each) { return each.status == status; });
    return place == kReasons.end() ? "Unknown" : place->text;
}

}  // namespace

const std::string *find_field(const HttpFields &fields, std::string_view name) {
    const auto place = std::find_if(fields.begin(), fields.end(), [name](const HttpField &each) {
        return cim::same_name(each.name, name);
    });
    return place == fields.end() ? nullptr : &place->value;
}

bool HttpRequest::keeps_connection() const {
    const std::string *const connection = field("Connection");
    if (connection != nullptr && lists_word(*connection, "close")) {
        return false;
    }
    return minor_version >= 1 || (connection != nullptr && lists_word(*connection, "keep-alive"));
}

std::string HttpResponse::bytes() const {
    std::string text = "HTTP/1.1 " + std::to_string(status) + ' ';
    text += reason_of(status);
    text += "\r\n";
    for (const HttpField &field : fields) {
        text += field.name + ": " + field.value + "\r\n";
    }
    text += "Content-Length: " + std::to_string(body.size()) + "\r\n";
    text += close ? "Connection: close\r\n\r\n" : "\r\n";
    return text + body;
}

HttpResponse bare_response(int status) {
    HttpResponse response;
    response.status = status;
    return response;
}

bool lists_word(std::string_view list, std::string_view word) {
    while (true) {
        const std::size_t end = list.find(',');
        if (cim::same_name(without_blanks(list.substr(0, end)), word)) {
            return true;
        }
        if (end == std::string_view::npos) {
            return false;
        }
        list.remove_prefix(end + 1);
    }
}

std::string_view without_blanks(std::string_view text) {
    const std::size_t start = text.find_first_not_of(" \t");
    if (start == std::string_view::npos) {
        return {};
    }
    return text.substr(start, text.find_last_not_of(" \t") - start + 1);
}

}  // namespace velkhost::cimxml
