#include "host/cimxml/xml_writer.h"

#include "host/mof/utf8.h"

#include <algorithm>

namespace velkhost::cimxml {
namespace {

constexpr std::string_view kReplacement = "\xEF\xBF\xBD";

// Empty: the letter stands for itself.
std::string_view escape_of(char letter, XmlPlace place) {
    const bool quoted = place == XmlPlace::kAttribute;
    switch (letter) {
        case '&':
            return "&amp;";
        case '<':
            return "&lt;";
        case '>':
            return "&gt;";
        case '"':
            return quoted ? "&quot;" : "";
        case '\r':
            return "&#13;";
        case '\n':
            return quoted ? "&#10;" : "";
        case '\t':
            return quoted ? "&#9;" : "";
        default:
            return static_cast<unsigned char>(letter) < 0x20 ? kReplacement : std::string_view();
    }
}

void append_escaped_utf8(std::string &out, std::string_view text, XmlPlace place) {
    for (std::size_t i = 0; i < text.size(); ++i) {
        const std::string_view escape = escape_of(text[i], place);
        const std::string_view rest = text.substr(i, 3);
        if (rest == "\xEF\xBF\xBE" || rest == "\xEF\xBF\xBF") {  // U+FFFE and U+FFFF
            out += kReplacement;
            i += 2;
        } else if (escape.empty()) {
            out += text[i];
        } else {
            out += escape;
        }
    }
}

}  // namespace

void append_escaped(std::string &out, std::string_view text, XmlPlace place) {
    while (true) {
        const std::size_t good = mof::find_invalid_utf8(text);
        append_escaped_utf8(out, text.substr(0, good), place);
        if (good == text.size()) {
            return;
        }
        out += kReplacement;
        text.remove_prefix(good + 1);
    }
}

void XmlWriter::start(std::string_view name, Attributes attributes, std::string_view close) {
    out_ += '<';
    out_ += name;
    for (const Attribute &attribute : attributes) {
        if (attribute.name.empty()) {
            continue;
        }
        out_ += ' ';
        out_ += attribute.name;
        out_ += "=\"";
        append_escaped(out_, attribute.value, XmlPlace::kAttribute);
        out_ += '"';
    }
    out_ += close;
}

void XmlWriter::end(std::string_view name) {
    out_ += "</";
    out_ += name;
    out_ += ">\n";
}

void XmlWriter::leaf(std::string_view name, std::string_view text, Attributes attributes) {
    start(name, attributes, ">");
    append_escaped(out_, text, XmlPlace::kText);
    end(name);
}

}  // namespace velkhost::cimxml
