// A broker with the project's classes and the stand-in host's providers, loaded from their shared
// objects, and the requests that the provider tests make.
#pragma once

#include "host/broker/broker.h"
#include "host/mof/compiler.h"
#include "host/scenario/reader.h"
#include "host/scenario/scenario.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>

namespace velkhost::providers::testing {

class ProviderTest : public ::testing::Test {
  public:
    ~ProviderTest() override {
        broker_.shutdown();
        EXPECT_EQ(broker_.ledger().report(), "");
        scenario::Scenario::set_current(nullptr);
        std::filesystem::remove_all(folder_);
    }

  protected:
    ProviderTest() {
        std::string name = (std::filesystem::temp_directory_path() / "velk-XXXXXX").string();
        folder_ = ::mkdtemp(name.data());
        for (const auto &file : std::filesystem::directory_iterator(VELK_MOF_DIR)) {
            if (file.path().extension() == ".mof" &&
                !file.path().filename().string().starts_with("cim_")) {
                add_classes(file.path());
            }
        }
        EXPECT_EQ(broker_.register_providers(VELK_REGISTRATION), "");
    }

    void add_classes(const std::filesystem::path &file) {
        const mof::CompileResult compiled = mof::compile_file(file);
        EXPECT_TRUE(compiled.ok()) << compiled.error_text();
        for (const mof::NamespaceUnit &unit : compiled.units) {
            for (const cim::ClassDecl &declared : unit.classes) {
                EXPECT_EQ(broker_.repository().add_class(unit.name_space, declared), "");
            }
        }
    }

    // The scenario of the test, as the text of its file.
    void play(const std::string &text) {
        scenario_ =
            std::make_shared<scenario::Scenario>(scenario::parse_description(text, "test.toml"));
        scenario::Scenario::set_current(scenario_);
    }

    // A file of the test's folder; its URI.
    std::string make_file(const std::string &name, const std::string &content = "image") {
        std::ofstream(folder_ / name) << content;
        return "file://" + (folder_ / name).string();
    }

    static cim::ObjectPath path_of(const std::string &class_name) {
        return {"", "zeb/cimv2", class_name, {}};
    }

    static std::string text(const cim::NamedValues &values, const char *name) {
        const cim::Value *value = values.find(name);
        return value != nullptr && value->as_text() ? std::string(*value->as_text()) : "(none)";
    }

    static std::uint64_t number(const cim::NamedValues &values, const char *name) {
        const cim::Value *value = values.find(name);
        return value == nullptr ? 999999 : value->as_unsigned().value_or(999999);
    }

    std::filesystem::path folder_;
    std::shared_ptr<scenario::Scenario> scenario_;
    broker::Broker broker_{{"test", {VELK_PROVIDER_DIR}}};
};

}  // namespace velkhost::providers::testing
