#include "tests/conformance/package_files.h"

#include "tests/support/files.h"

namespace velktest {
namespace {

std::string value(const std::string &text) {
    return "    <VALUE>" + text + "</VALUE>\n";
}

std::string property(const std::string &name, const std::string &type, const std::string &text) {
    return "  <PROPERTY NAME=\"" + name + "\" TYPE=\"" + type + "\">\n" + value(text) +
           "  </PROPERTY>\n";
}

std::string array(const std::string &name, const std::vector<std::string> &texts) {
    std::string values;
    for (const std::string &text : texts) {
        values += value(text);
    }
    return "  <PROPERTY.ARRAY NAME=\"" + name + "\" TYPE=\"string\">\n    <VALUE.ARRAY>\n" +
           values + "    </VALUE.ARRAY>\n  </PROPERTY.ARRAY>\n";
}

}  // namespace

std::string write_package(const std::filesystem::path &folder, const Package &package) {
    std::string text = "<INSTANCE CLASSNAME=\"PAKRO_UpdatePackage\">\n" +
                       property("Name", "string", package.name) +
                       property("type", "uint16", package.type) +
                       property("category", "string", package.category) +
                       property("identificationCode", "string", package.file) +
                       property("payload", "string", package.file + ".bin");
    if (!package.prerequisites.empty()) {
        text += array("preReq", package.prerequisites);
    }
    if (!package.supersedes.empty()) {
        text += property("supersedes", "string", package.supersedes);
    }
    const std::filesystem::path file = folder / (package.file + ".xml");
    write_file(file, text + "</INSTANCE>\n");
    return "file://" + file.string();
}

std::string payload_location(const std::filesystem::path &folder, const Package &package) {
    return "file://" + (folder / (package.file + ".bin")).string();
}

}  // namespace velktest
