// Writes CIM-XML: every element begins on a line of its own, and only values hold text.
#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>

namespace velkhost::cimxml {

class XmlWriter {
  public:
    // Attributes without a name are left out.
    struct Attribute {
        std::string_view name;
        std::string_view value;
    };
    using Attributes = std::initializer_list<Attribute>;

    // An element that ends with the scope.
    class Scope {
      public:
        Scope(XmlWriter &writer, std::string_view name, Attributes attributes = {})
            : writer_(writer), name_(name) {
            writer_.start(name, attributes, ">\n");
        }
        ~Scope() { writer_.end(name_); }
        Scope(const Scope &) = delete;
        Scope &operator=(const Scope &) = delete;

      private:
        XmlWriter &writer_;
        std::string_view name_;  // of static storage
    };

    // An element with text, or without anything in it.
    void leaf(std::string_view name, std::string_view text, Attributes attributes = {});
    void empty(std::string_view name, Attributes attributes = {}) {
        start(name, attributes, "/>\n");
    }

    // Markup that is complete in itself.
    void raw(std::string_view markup) { out_ += markup; }

    [[nodiscard]] const std::string &text() const { return out_; }
    [[nodiscard]] std::string take() { return std::move(out_); }

  private:
    void start(std::string_view name, Attributes attributes, std::string_view close);
    void end(std::string_view name);

    std::string out_;
};

enum class XmlPlace { kText, kAttribute };

// With references in place of what means something to XML there, white space that a reader would
// change included. What no document may hold (control characters, bytes that are no UTF-8) becomes
// U+FFFD.
void append_escaped(std::string &out, std::string_view text, XmlPlace place);

}  // namespace velkhost::cimxml
