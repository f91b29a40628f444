// Descriptors for the tests of their parser.
#pragma once

#include "catalog/descriptor.h"
#include "tests/support/library_test.h"

namespace velktest {

inline std::string value_line(const std::string &value) {
    return "    <VALUE>" + value + "</VALUE>\n";
}

inline std::string property(const std::string &name, const std::string &value) {
    const std::string type = name == "type" ? "uint16" : "string";
    return R"(  <PROPERTY NAME=")" + name + R"(" TYPE=")" + type + "\">\n" + value_line(value) +
           "  </PROPERTY>\n";
}

inline std::string array(const std::string &name, const std::vector<std::string> &values) {
    std::string text =
        R"(  <PROPERTY.ARRAY NAME=")" + name + "\" TYPE=\"string\">\n    <VALUE.ARRAY>\n";
    for (const std::string &value : values) {
        text += value_line(value);
    }
    return text + "    </VALUE.ARRAY>\n  </PROPERTY.ARRAY>\n";
}

// Record 1 of three is the one that is read into.
class DescriptorTest : public LibraryTest {
  protected:
    DescriptorTest() {
        use_packages(3);
        set_field(package().TFTPXMLPkgURIs, "tftp://server/pkgs/x.xml");
        set_field(package().TFTPPayloadPkgURIs, "tftp://server/pkgs/");
        set_field(package().supersedes, "No supersedes");
        package().OrderFlag = 450;
    }

    static velk::PackageRecord &package() { return pkgInstance[1]; }

    // Has the parser read this text.
    void parse(const std::string &text) {
        set_field(package().LocalPkgURI, write_descriptor(text));
        getPkgAssociation(1);
    }
};

}  // namespace velktest
