// Scalars as text, and the small helpers of all readers.
#include "host/cimxml/errors.h"
#include "host/cimxml/value_reader.h"
#include "host/mof/utf8.h"

#include <algorithm>
#include <optional>

namespace velkhost::cimxml {
namespace {

std::string_view trimmed(std::string_view text) {
    constexpr std::string_view kSpace = " \t\n";
    const std::size_t start = text.find_first_not_of(kSpace);
    if (start == std::string_view::npos) {
        return {};
    }
    return text.substr(start, text.find_last_not_of(kSpace) - start + 1);
}

// DSP0004, 5.2.4: 14 digits, ".", 6 digits, then "+" or "-" with 3 digits, or ":000". Digits may
// be asterisks.
bool is_datetime(std::string_view text) {
    constexpr std::string_view kForm = "dddddddddddddd.dddddd*ddd";
    return std::equal(text.begin(), text.end(), kForm.begin(), kForm.end(), [](char c, char form) {
        if (form == 'd') {
            return (c >= '0' && c <= '9') || c == '*';
        }
        return form == '.' ? c == '.' : c == '+' || c == '-' || c == ':';
    });
}

// A char16 is the character itself.
std::optional<cim::Value> char16_from(std::string_view text) {
    if (mof::count_characters(text) != 1 || text.size() > 3) {
        return std::nullopt;
    }
    const auto byte = [text](std::size_t i) {
        return std::uint64_t{static_cast<unsigned char>(text[i])};
    };
    std::uint64_t unit = byte(0);
    if (text.size() == 2) {
        unit = (byte(0) & 0x1FU) << 6U | (byte(1) & 0x3FU);
    } else if (text.size() == 3) {
        unit = (byte(0) & 0x0FU) << 12U | (byte(1) & 0x3FU) << 6U | (byte(2) & 0x3FU);
    }
    return cim::Value{CMPI_char16, unit};
}

std::optional<cim::Value> scalar_from(CMPIType type, std::string_view text) {
    if (type == CMPI_char16) {
        return char16_from(text);
    }
    if (type == CMPI_string || type == CMPI_chars) {
        return cim::Value::string(std::string(text));
    }
    const std::string_view bare = trimmed(text);
    if (type == CMPI_dateTime && !is_datetime(bare)) {
        return std::nullopt;
    }
    return cim::value_from_text(type, bare);
}

}  // namespace

void fail_not_valid(const std::string &why) {
    throw MessageError(400, "request-not-valid", why);
}

const std::string &required_attribute(const XmlElement &element, std::string_view name) {
    const std::string *const value = element.attribute(name);
    if (value == nullptr) {
        fail_not_valid(element.name + " has no attribute " + std::string(name));
    }
    return *value;
}

const XmlElement &only_child(const XmlElement &element) {
    if (element.children.size() != 1) {
        fail_not_valid(element.name + " has " + std::to_string(element.children.size()) +
                       " elements in it instead of one");
    }
    return element.children.front();
}

std::string read_namespace(const XmlElement &element) {
    std::string result;
    for (const XmlElement &child : element.children) {
        if (child.name != "NAMESPACE") {
            fail_not_valid(child.name + " stands in " + element.name);
        }
        result += (result.empty() ? "" : "/") + required_attribute(child, "NAME");
    }
    if (element.name != "LOCALNAMESPACEPATH" || result.empty()) {
        fail_not_valid("a namespace was expected, not " + element.name);
    }
    return result;
}

cim::Value read_scalar(CMPIType type, std::string_view text, std::string_view what) {
    if (auto value = scalar_from(type, text)) {
        return *value;
    }
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, std::string(what) + ": \"" + std::string(text) +
                                                      "\" is no " + cim::type_name(type));
}

}  // namespace velkhost::cimxml
