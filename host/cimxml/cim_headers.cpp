#include "host/cimxml/cim_headers.h"

#include "host/cim/names.h"
#include "host/cimxml/errors.h"

#include <algorithm>
#include <charconv>

namespace velkhost::cimxml {
namespace {

constexpr std::string_view kExtension = "http://www.dmtf.org/cim/mapping/http/v1.0";
constexpr const char *kHeaderMismatch = "header-mismatch";

std::string_view without_quotes(std::string_view text) {
    const bool quoted = text.size() >= 2 && text.starts_with('"') && text.ends_with('"');
    return quoted ? text.substr(1, text.size() - 2) : text;
}

// "73-" of `http://www.dmtf.org/cim/mapping/http/v1.0;ns=73`, whose first part may be in quotes.
std::string prefix_of(const HttpRequest &request) {
    const std::string *const man = request.field("Man");
    const std::string_view text = man != nullptr ? *man : std::string_view();
    const std::size_t mark = text.find(';');
    const std::string_view name = without_quotes(without_blanks(text.substr(0, mark)));
    const std::string_view rest =
        mark == std::string_view::npos ? std::string_view() : without_blanks(text.substr(mark + 1));
    const bool digits = rest.size() == 5 && rest.starts_with("ns=") &&
                        rest.find_first_not_of("0123456789", 3) == std::string_view::npos;
    if (name != kExtension || !digits) {
        throw MessageError(510, "", "the extension that is demanded is not that of CIM operations");
    }
    return std::string(rest.substr(3)) + '-';
}

// Header values are escaped as in URIs (DSP0200, 6.3.2).
std::string unescaped(std::string_view text) {
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        unsigned byte = 0;
        const std::string_view digits = text.substr(std::min(i + 1, text.size()), 2);
        const auto *const end = digits.data() + digits.size();
        const auto read = std::from_chars(digits.data(), end, byte, 16);
        if (text[i] == '%' && digits.size() == 2 && read.ec == std::errc() && read.ptr == end) {
            result += static_cast<char>(byte);
            i += 2;
        } else {
            result += text[i];
        }
    }
    return result;
}

// "root/cimv2:Class" of "root/cimv2:Class.Key=1"; namespaces hold no dots that matter here, as
// only what stands behind the colon is cut.
std::string_view without_keys(std::string_view object) {
    const std::size_t colon = object.find(':');
    return colon == std::string_view::npos ? object : object.substr(0, object.find('.', colon));
}

bool is_xml(std::string_view content_type) {
    const std::string_view media = without_blanks(content_type.substr(0, content_type.find(';')));
    return cim::same_name(media, "application/xml") || cim::same_name(media, "text/xml");
}

bool is_utf8(std::string_view content_type) {
    constexpr std::string_view kParameter = "charset=";
    const std::size_t mark = content_type.find(';');
    const std::string_view parameter =
        mark == std::string_view::npos ? "" : without_blanks(content_type.substr(mark + 1));
    if (!cim::same_name(parameter.substr(0, kParameter.size()), kParameter)) {
        return true;
    }
    const std::string_view charset = without_quotes(parameter.substr(kParameter.size()));
    return cim::same_name(charset, "utf-8") || cim::same_name(charset, "us-ascii");
}

}  // namespace

CimHeaders::CimHeaders(const HttpRequest &request)
    : request_(request), prefix_(request.method == "M-POST" ? prefix_of(request) : "") {}

const std::string *CimHeaders::find(const std::string &name) const {
    return request_.field(prefix_ + name);
}

void CimHeaders::check_call() const {
    check_content_type();
    const std::string *const operation = find("CIMOperation");
    if (operation == nullptr || !cim::same_name(*operation, "MethodCall")) {
        throw MessageError(400, "unsupported-operation", "the request is no method call of CIM");
    }
    const std::string *const version = find("CIMProtocolVersion");
    if (version != nullptr && !version->starts_with("1.")) {
        throw MessageError(501, "unsupported-protocol-version",
                           "protocol version " + *version + " is not spoken here");
    }
    if (find("CIMBatch") != nullptr) {
        throw MessageError(501, "multiple-requests-unsupported",
                           "several operations in one message are not supported");
    }
}

void CimHeaders::check_content_type() const {
    const std::string *const type = request_.field("Content-Type");
    if (type != nullptr && (!is_xml(*type) || !is_utf8(*type))) {
        throw MessageError(415, "", "the content is no XML in UTF-8");
    }
    const std::string *const encoding = request_.field("Content-Encoding");
    if (encoding != nullptr && !cim::same_name(*encoding, "identity")) {
        throw MessageError(415, "", "the content is encoded");
    }
}

void CimHeaders::check_match(const Request &message) const {
    const std::string *const method = find("CIMMethod");
    if (method == nullptr || !cim::same_name(unescaped(*method), message.method)) {
        throw MessageError(400, kHeaderMismatch,
                           "the header CIMMethod does not name the message's method");
    }
    const std::string *const object = find("CIMObject");
    const std::string named = object != nullptr ? unescaped(*object) : std::string();
    if (object == nullptr || !cim::same_name(without_keys(named), message.object)) {
        throw MessageError(400, kHeaderMismatch,
                           "the header CIMObject does not name the message's object");
    }
}

void CimHeaders::add(HttpResponse &response, const std::string &name,
                     const std::string &value) const {
    if (!prefix_.empty() && find_field(response.fields, "Man") == nullptr) {
        const std::string number = prefix_.substr(0, prefix_.size() - 1);
        response.fields.push_back({"Ext", ""});
        response.fields.push_back({"Man", std::string(kExtension) + ";ns=" + number});
    }
    response.fields.push_back({prefix_ + name, value});
}

void CimHeaders::add_operation(HttpResponse &response) const {
    add(response, "CIMOperation", "MethodResponse");
}

void CimHeaders::add_error(HttpResponse &response, const std::string &cim_error) const {
    if (!cim_error.empty()) {
        add(response, "CIMError", cim_error);
    }
}

HttpResponse capabilities() {
    HttpResponse response;
    response.fields = {
        {"Opt", std::string(kExtension) + ";ns=77"},
        {"77-CIMProtocolVersion", "1.0"},
        {"77-CIMSupportedFunctionalGroups", "basic-read, association-traversal"},
        {"Allow", "POST, M-POST, OPTIONS"},
    };
    return response;
}

}  // namespace velkhost::cimxml
