// What the tests of the MOF compiler share.
#pragma once

#include "host/mof/compiler.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::mof::testing {

// Errors as they are printed; the file is called t.mof.
inline std::vector<std::string> errors_of(std::string_view text) {
    std::vector<std::string> lines;
    for (const Diagnostic &error : compile_text(text, "t.mof").errors) {
        lines.push_back(error.to_string());
    }
    return lines;
}

// The one class of a text that must compile.
inline cim::ClassDecl class_of(std::string_view text) {
    const CompileResult result = compile_text(text, "t.mof");
    EXPECT_TRUE(result.ok()) << result.error_text();
    if (result.units.size() != 1 || result.units.front().classes.size() != 1) {
        ADD_FAILURE() << "not one class in one namespace";
        return {};
    }
    return result.units.front().classes.front();
}

// The one property of a class with that member.
inline cim::PropertyDecl property_of(std::string_view member) {
    const cim::ClassDecl declared = class_of("class T { " + std::string{member} + " };");
    if (declared.properties.size() != 1) {
        ADD_FAILURE() << "not one property: " << member;
        return {};
    }
    return declared.properties.front();
}

inline const cim::ClassDecl &find_class(const NamespaceUnit &unit, std::string_view name) {
    for (const cim::ClassDecl &each : unit.classes) {
        if (each.name == name) {
            return each;
        }
    }
    static const cim::ClassDecl none;
    ADD_FAILURE() << "no class " << name;
    return none;
}

// A folder of sources that goes away with the test.
class SourceFolder : public ::testing::Test {
  public:
    SourceFolder() {
        std::string pattern = (std::filesystem::temp_directory_path() / "velkmof-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr) {
            throw std::runtime_error{"no temporary folder " + pattern};
        }
        root_ = pattern;
    }
    ~SourceFolder() override {
        std::error_code ignored;
        std::filesystem::remove_all(root_, ignored);
    }

    [[nodiscard]] std::filesystem::path path(const std::string &name) const { return root_ / name; }

    std::filesystem::path write(const std::string &name, std::string_view text) const {
        std::filesystem::create_directories(path(name).parent_path());
        std::ofstream{path(name), std::ios::binary} << text;
        return path(name);
    }

    // A file's path as messages show it.
    [[nodiscard]] std::string quoted(const std::string &name) const {
        return "'" + path(name).string() + "'";
    }

    // An expected message about a file of the folder.
    [[nodiscard]] std::string at(const std::string &name, const std::string &rest) const {
        return path(name).string() + ":" + rest + "\n";
    }

  private:
    std::filesystem::path root_;
};

}  // namespace velkhost::mof::testing
