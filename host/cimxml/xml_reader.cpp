#include "host/cimxml/xml.h"
#include "host/mof/utf8.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>
#include <utility>

namespace velkhost::cimxml {
namespace {

constexpr std::string_view kSpace = " \t\r\n";

bool is_space(char letter) {
    return kSpace.find(letter) != std::string_view::npos;
}

bool starts_name(char letter) {
    const auto byte = static_cast<unsigned char>(letter);
    return (letter >= 'a' && letter <= 'z') || (letter >= 'A' && letter <= 'Z') || letter == '_' ||
           letter == ':' || byte >= 0x80;
}

bool continues_name(char letter) {
    return starts_name(letter) || (letter >= '0' && letter <= '9') || letter == '-' ||
           letter == '.';
}

// XML 1.0, production 2.
bool is_xml_character(std::uint32_t code_point) {
    const bool control =
        code_point < 0x20 && code_point != '\t' && code_point != '\n' && code_point != '\r';
    const bool surrogate = code_point >= mof::kHighSurrogates && code_point < mof::kSurrogatesEnd;
    return !control && !surrogate && code_point != 0xFFFE && code_point != 0xFFFF &&
           code_point <= 0x10FFFF;
}

// Line ends become line feeds (XML 1.0, 2.11).
void append_with_line_feeds(std::string &out, std::string_view text) {
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '\r') {
            out += text[i];
        } else if (i + 1 == text.size() || text[i + 1] != '\n') {
            out += '\n';
        }
    }
}

class XmlReader {
  public:
    explicit XmlReader(std::string_view document) : in_(document) {}

    XmlElement read_document();

  private:
    [[noreturn]] void fail(const std::string &what) const;
    void check_characters() const;

    [[nodiscard]] bool at(std::string_view text) const { return in_.substr(at_).starts_with(text); }
    [[nodiscard]] char peek() const { return at_ < in_.size() ? in_[at_] : '\0'; }
    bool accept(std::string_view text);
    void expect(std::string_view text);
    bool skip_space();
    // Everything up to `end`, which is passed.
    std::string_view take_until(std::string_view end, const char *what);

    void read_declaration();
    void read_miscellany(bool doctype_allowed);
    void skip_comment();
    void skip_instruction();
    void skip_doctype();

    std::string read_name();
    std::string read_quoted();
    std::string read_reference();
    XmlElement read_element(int depth);
    void read_attributes(XmlElement &element);
    void read_content(XmlElement &element, int depth);
    void read_text(std::string &text);

    std::string_view in_;
    std::size_t at_ = 0;
};

void XmlReader::fail(const std::string &what) const {
    throw XmlError(what + " at byte " + std::to_string(at_));
}

void XmlReader::check_characters() const {
    if (mof::find_invalid_utf8(in_) != in_.size()) {
        throw XmlError("the document is not UTF-8");
    }
    for (const char letter : in_) {
        const auto byte = static_cast<unsigned char>(letter);
        if (byte < 0x20 && !is_xml_character(byte)) {
            throw XmlError("the document has a control character");
        }
    }
}

bool XmlReader::accept(std::string_view text) {
    const bool there = at(text);
    at_ += there ? text.size() : 0;
    return there;
}

void XmlReader::expect(std::string_view text) {
    if (!accept(text)) {
        fail("expected '" + std::string(text) + "'");
    }
}

bool XmlReader::skip_space() {
    const std::size_t start = at_;
    while (at_ < in_.size() && is_space(in_[at_])) {
        ++at_;
    }
    return at_ > start;
}

std::string_view XmlReader::take_until(std::string_view end, const char *what) {
    const std::size_t stop = in_.find(end, at_);
    if (stop == std::string_view::npos) {
        fail(std::string(what) + " without an end");
    }
    const std::string_view taken = in_.substr(at_, stop - at_);
    at_ = stop + end.size();
    return taken;
}

// -- Around the root element --

XmlElement XmlReader::read_document() {
    accept("\xEF\xBB\xBF");
    check_characters();
    read_declaration();
    read_miscellany(true);
    XmlElement root = read_element(1);
    read_miscellany(false);
    if (at_ != in_.size()) {
        fail("something stands behind the root element");
    }
    return root;
}

void XmlReader::read_declaration() {
    if (!at("<?xml") || !is_space(in_.substr(at_).size() > 5 ? in_[at_ + 5] : '\0')) {
        return;
    }
    std::string text(take_until("?>", "a declaration"));
    std::transform(text.begin(), text.end(), text.begin(),
                   [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; });
    const bool named = text.find("encoding") != std::string::npos;
    if (named && text.find("utf-8") == std::string::npos &&
        text.find("us-ascii") == std::string::npos) {
        fail("the document is declared to be of another encoding than UTF-8,");
    }
}

void XmlReader::read_miscellany(bool doctype_allowed) {
    while (true) {
        skip_space();
        if (at("<!--")) {
            skip_comment();
        } else if (at("<?")) {
            skip_instruction();
        } else if (doctype_allowed && at("<!DOCTYPE")) {
            skip_doctype();
            doctype_allowed = false;
        } else {
            return;
        }
    }
}

void XmlReader::skip_comment() {
    expect("<!--");
    take_until("--", "a comment");
    expect(">");
}

void XmlReader::skip_instruction() {
    expect("<?");
    if (read_name() == "xml") {
        fail("a declaration in the middle of the document");
    }
    take_until("?>", "a processing instruction");
}

void XmlReader::skip_doctype() {
    if (take_until(">", "a document type").find('[') != std::string_view::npos) {
        fail("a document type with declarations of its own");
    }
}

// -- Elements --

std::string XmlReader::read_name() {
    if (!starts_name(peek())) {
        fail("expected a name");
    }
    const std::size_t start = at_;
    while (continues_name(peek())) {
        ++at_;
    }
    return std::string(in_.substr(start, at_ - start));
}

XmlElement XmlReader::read_element(int depth) {
    if (depth > kDeepestElement) {
        fail("elements lie too deep in each other");
    }
    XmlElement element;
    expect("<");
    element.name = read_name();
    read_attributes(element);
    if (accept("/>")) {
        return element;
    }
    expect(">");
    read_content(element, depth);
    if (read_name() != element.name) {
        fail("another element than " + element.name + " is ended");
    }
    skip_space();
    expect(">");
    return element;
}

void XmlReader::read_attributes(XmlElement &element) {
    while (skip_space() && starts_name(peek())) {
        std::string name = read_name();
        if (element.attribute(name) != nullptr) {
            fail("a second attribute " + name);
        }
        skip_space();
        expect("=");
        skip_space();
        element.attributes.push_back({std::move(name), read_quoted()});
    }
}

std::string XmlReader::read_quoted() {
    const char quote = peek();
    if (quote != '"' && quote != '\'') {
        fail("expected a quotation mark");
    }
    ++at_;
    std::string value;
    while (peek() != quote) {
        if (at_ >= in_.size() || peek() == '<') {
            fail("an attribute without an end");
        }
        if (peek() == '&') {
            value += read_reference();
        } else {
            value += is_space(peek()) ? ' ' : peek();
            ++at_;
        }
    }
    ++at_;
    return value;
}

// Stops behind the "</" of the element's end.
void XmlReader::read_content(XmlElement &element, int depth) {
    while (!accept("</")) {
        if (at_ >= in_.size()) {
            fail("element " + element.name + " has no end");
        }
        if (at("<!--")) {
            skip_comment();
        } else if (accept("<![CDATA[")) {
            append_with_line_feeds(element.text, take_until("]]>", "a CDATA section"));
        } else if (at("<?")) {
            skip_instruction();
        } else if (at("<")) {
            element.children.push_back(read_element(depth + 1));
        } else {
            read_text(element.text);
        }
    }
}

void XmlReader::read_text(std::string &text) {
    if (peek() == '&') {
        text += read_reference();
        return;
    }
    const std::size_t end = std::min(in_.find_first_of("<&", at_), in_.size());
    const std::string_view run = in_.substr(at_, end - at_);
    if (run.find("]]>") != std::string_view::npos) {
        fail("\"]]>\" stands in a text");
    }
    append_with_line_feeds(text, run);
    at_ = end;
}

std::string XmlReader::read_reference() {
    using Entity = std::pair<std::string_view, char>;
    constexpr std::array<Entity, 5> kEntities = {
        {{"amp", '&'}, {"lt", '<'}, {"gt", '>'}, {"quot", '"'}, {"apos", '\''}}};
    expect("&");
    std::string_view name = take_until(";", "a reference");
    if (!name.starts_with('#')) {
        const auto *const entity =
            std::find_if(kEntities.begin(), kEntities.end(),
                         [name](const Entity &each) { return each.first == name; });
        return entity != kEntities.end() ? std::string(1, entity->second)
                                         : (fail("an unknown entity"), std::string());
    }
    const bool hexadecimal = name.starts_with("#x");
    name.remove_prefix(hexadecimal ? 2 : 1);
    std::uint32_t code_point = 0;
    const char *const end = name.data() + name.size();
    const auto read = std::from_chars(name.data(), end, code_point, hexadecimal ? 16 : 10);
    if (read.ec != std::errc() || read.ptr != end || !is_xml_character(code_point)) {
        fail("a reference to no character");
    }
    std::string text;
    mof::append_utf8(text, code_point);
    return text;
}

}  // namespace

const std::string *XmlElement::attribute(std::string_view wanted) const {
    const auto place =
        std::find_if(attributes.begin(), attributes.end(),
                     [wanted](const XmlAttribute &each) { return each.name == wanted; });
    return place == attributes.end() ? nullptr : &place->value;
}

XmlElement read_xml(std::string_view document) {
    return XmlReader(document).read_document();
}

}  // namespace velkhost::cimxml
