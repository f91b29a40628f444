// The example packages: the script that makes them, and their descriptors.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <pugixml.hpp>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "tests/unit/host/examples_testing.h"

namespace {

namespace fs = std::filesystem;
using ::testing::IsEmpty;
using ::testing::StartsWith;
using velktest::examples::descriptors;
using velktest::examples::make_packages;
using velktest::examples::quoted;

std::string read(const fs::path &file) {
    std::ifstream in(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), {}};
}

std::map<std::string, std::string> contents(const fs::path &folder) {
    std::map<std::string, std::string> files;
    for (const fs::directory_entry &entry : fs::recursive_directory_iterator(folder)) {
        if (entry.is_regular_file()) {
            files[fs::relative(entry.path(), folder).string()] = read(entry.path());
        }
    }
    return files;
}

class ExamplePackages : public ::testing::Test {
  public:
    ~ExamplePackages() override { fs::remove_all(folder_); }

  protected:
    ExamplePackages() {
        std::string name = (fs::temp_directory_path() / "velk-packages-XXXXXX").string();
        folder_ = ::mkdtemp(name.data());
    }
    [[nodiscard]] std::string argument() const { return quoted(folder_.string()); }

    fs::path folder_;
};

TEST_F(ExamplePackages, SecondRunChangesNothing) {
    ASSERT_EQ(make_packages(argument()), 0);
    const auto first = contents(folder_);
    const fs::path payload = folder_ / "zeb_fw_fpga_f4e031-2.04_anyos.upd";
    const auto written = fs::last_write_time(payload);
    ASSERT_EQ(make_packages(argument()), 0);
    EXPECT_EQ(contents(folder_), first);
    EXPECT_EQ(fs::last_write_time(payload), written);
}

TEST_F(ExamplePackages, DamagedPayloadIsMadeAgain) {
    ASSERT_EQ(make_packages(argument()), 0);
    const fs::path payload = folder_ / "zeb_fw_fpga_f4e033-2.06_anyos.upd";
    const std::string good = read(payload);
    std::ofstream(payload, std::ios::binary) << "damaged";
    ASSERT_EQ(make_packages(argument()), 0);
    EXPECT_EQ(read(payload), good);
}

TEST_F(ExamplePackages, FolderWithBlanksIsMadeOnDemand) {
    EXPECT_EQ(make_packages(quoted((folder_ / "a b" / "c").string())), 0);
    EXPECT_TRUE(fs::exists(folder_ / "a b" / "c" / "zeb_fw_uefi_d7e148-1.60_anyos.upd"));
}

TEST_F(ExamplePackages, NamedOnesAloneAreMade) {
    EXPECT_EQ(make_packages(argument() + " brcd_fw_fc_1860-3.2.1.0_anyos"), 0);
    EXPECT_THAT(contents(folder_), ::testing::UnorderedElementsAre(
                                       ::testing::Key("brcd_fw_fc_1860-3.2.1.0_anyos.xml"),
                                       ::testing::Key("brcd_fw_fc_1860-3.2.1.0_anyos.zip")));
}

TEST_F(ExamplePackages, WrongUseAndUnusableFolderFail) {
    EXPECT_EQ(make_packages(""), 1);
    EXPECT_EQ(make_packages(argument() + " no_such_package"), 1);
    std::ofstream(folder_ / "file") << "x";
    EXPECT_NE(make_packages(quoted((folder_ / "file").string())), 0);
}

TEST_F(ExamplePackages, OneHasAPayloadButNoDescriptor) {
    ASSERT_EQ(make_packages(argument()), 0);
    EXPECT_TRUE(fs::exists(folder_ / "zeb_fw_rxc_r1ao60-3.20_anyos.upd"));
    EXPECT_FALSE(fs::exists(folder_ / "zeb_fw_rxc_r1ao60-3.20_anyos.xml"));
}

// ---- Descriptors ----

// A descriptor as a real XML parser sees it.
class Descriptor {
  public:
    explicit Descriptor(const fs::path &file) : path(file) {
        EXPECT_TRUE(document_.load_file(file.c_str())) << file << " is not well-formed";
    }

    [[nodiscard]] std::string value(const char *name) const {
        return instance().find_child_by_attribute("PROPERTY", "NAME", name).child_value("VALUE");
    }
    [[nodiscard]] std::vector<std::string> values(const char *name) const {
        std::vector<std::string> out;
        const auto array = instance().find_child_by_attribute("PROPERTY.ARRAY", "NAME", name);
        for (const pugi::xml_node &each : array.child("VALUE.ARRAY").children("VALUE")) {
            out.emplace_back(each.child_value());
        }
        return out;
    }
    [[nodiscard]] std::ptrdiff_t count() const {
        return std::distance(instance().children().begin(), instance().children().end());
    }

    fs::path path;

  private:
    [[nodiscard]] pugi::xml_node instance() const { return document_.child("INSTANCE"); }

    pugi::xml_document document_;
};

// What stands behind a header line that is alone on its line and indented, as the package library
// reads it: the next line without its tags.
std::string line_value(const std::string &text, const std::string &header) {
    const std::size_t found = text.find("  " + header + "\n");
    if (found == std::string::npos) {
        return "no such line";
    }
    const std::size_t begin = text.find("<VALUE>", found) + 7;
    return text.substr(begin, text.find("</VALUE>\n", begin) - begin);
}

class ExampleDescriptors : public ::testing::TestWithParam<fs::path> {
  protected:
    Descriptor descriptor_{GetParam()};
};

TEST_P(ExampleDescriptors, HaveTensOfProperties) {
    EXPECT_GE(descriptor_.count(), 25);
}

TEST_P(ExampleDescriptors, SayTheSameToALineReaderAndToAnXmlParser) {
    const std::string text = read(GetParam());
    for (const char *name : {"Name", "category", "payload", "identificationCode"}) {
        const std::string header =
            std::string(R"(<PROPERTY NAME=")") + name + R"(" TYPE="string">)";
        EXPECT_EQ(line_value(text, header), descriptor_.value(name)) << name;
        EXPECT_FALSE(descriptor_.value(name).empty()) << name;
    }
    EXPECT_EQ(line_value(text, R"(<PROPERTY NAME="type" TYPE="uint16">)"),
              descriptor_.value("type"));
}

TEST_P(ExampleDescriptors, PropertyLinesAreIndentedAndShort) {
    std::ifstream in(GetParam());
    for (std::string line; std::getline(in, line);) {
        EXPECT_LE(line.size(), 1023U);
        if (line.find("PROPERTY") != std::string::npos || line.find("VALUE") != std::string::npos) {
            EXPECT_THAT(line, StartsWith("  "));
        }
    }
}

TEST_P(ExampleDescriptors, CodeBeginsWithTheMaker) {
    EXPECT_THAT(descriptor_.value("identificationCode"),
                StartsWith(descriptor_.value("vendor") + "_"));
}

TEST_P(ExampleDescriptors, FilesBearOneName) {
    const fs::path source = fs::path(GetParam()).replace_extension();
    const std::string adapters = fs::exists(source) ? ".zip" : ".upd";
    EXPECT_EQ(descriptor_.value("payload"),
              GetParam().stem().string() + (fs::exists(source / "vibs") ? "/" : adapters));
}

TEST_P(ExampleDescriptors, ArraysHoldAtMostFiveRelations) {
    EXPECT_LE(descriptor_.values("preReq").size() + descriptor_.values("coReq").size(), 5U);
}

INSTANTIATE_TEST_SUITE_P(Shipped, ExampleDescriptors, ::testing::ValuesIn(descriptors()),
                         [](const auto &about) {
                             return velktest::examples::test_name(about.param.stem().string());
                         });

TEST_F(ExamplePackages, PayloadsHaveTheStatedSizeAndHeader) {
    ASSERT_EQ(make_packages(argument()), 0);
    for (const fs::path &file : descriptors()) {
        const Descriptor descriptor(file);
        const std::string name = descriptor.value("payload");
        const bool is_bundle = name.ends_with("/");
        const std::string payload = read(folder_ / (name + (is_bundle ? "metadata.zip" : "")));
        EXPECT_EQ(std::to_string(payload.size()), descriptor.value("payloadSize")) << file;
        if (is_bundle || name.ends_with(".zip")) {
            continue;  // looked into by other tests
        }
        EXPECT_GE(payload.size(), 16384U);
        EXPECT_LE(payload.size(), 262144U);
        EXPECT_THAT(payload, StartsWith("ZEBFWIMG" + descriptor.value("identificationCode") + " "));
        const std::set<char> distinct(payload.begin(), payload.end());
        EXPECT_EQ(distinct.size(), 256U) << file << ": content is too regular";
    }
}

TEST(ExampleRelations, AreThereAsDocumented) {
    std::map<std::string, std::string> category_of;
    std::map<std::string, std::vector<std::string>> needs;
    std::map<std::string, std::string> replaces;
    for (const fs::path &file : descriptors()) {
        const Descriptor descriptor(file);
        const std::string code = descriptor.value("identificationCode");
        EXPECT_FALSE(category_of.contains(code)) << code << " is used twice";
        category_of[code] = descriptor.value("category");
        needs[code] = descriptor.values("preReq");
        std::ranges::copy(descriptor.values("coReq"), std::back_inserter(needs[code]));
        replaces[code] = descriptor.value("supersedes");
    }
    std::vector<std::string> absent;
    for (const auto &[code, needed] : needs) {
        std::ranges::copy_if(needed, std::back_inserter(absent),
                             [&](const std::string &each) { return !category_of.contains(each); });
    }
    EXPECT_THAT(absent, ::testing::ElementsAre("ZEB_rxc_r1ao99"));
    EXPECT_EQ(category_of[needs["ZEB_fpga_f4e031"].at(0)], "RXC");
    EXPECT_EQ(category_of[needs["ZEB_uefi_d7e148"].at(0)], "Diagnostics");
    EXPECT_EQ(category_of[replaces["ZEB_uefi_d7e148"]], "UEFI");
}

}  // namespace
