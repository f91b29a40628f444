// XML documents as CIM-XML has them (DSP0201): elements, attributes and text, without DTDs.
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::cimxml {

struct XmlAttribute {
    std::string name;
    std::string value;
};

struct XmlElement {
    std::string name;
    std::vector<XmlAttribute> attributes;
    std::vector<XmlElement> children;
    std::string text;  // all of its own character data, without its children's

    // The attribute's value, or nullptr.
    [[nodiscard]] const std::string *attribute(std::string_view wanted) const;
};

// A document that is not well-formed; what() says where and why.
class XmlError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

// How deep elements may lie in each other.
inline constexpr int kDeepestElement = 64;

// The document's root element. The document must be well-formed UTF-8 (XML 1.0); a document type
// declaration is passed over, one with an internal subset is refused. Throws XmlError.
XmlElement read_xml(std::string_view document);

}  // namespace velkhost::cimxml
