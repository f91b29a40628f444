// A process's own scenario file, at its fixed path under another root, and what providers make of
// it in a broker that knows nothing of scenarios.
#include "host/broker/broker.h"
#include "host/scenario/scenario.h"
#include "host/shim/velkshim.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

namespace velkhost::providers::testing {
namespace {

namespace fs = std::filesystem;
using scenario::Scenario;

class ScenarioAtItsPath : public ::testing::Test {
  public:
    ~ScenarioAtItsPath() override {
        broker_.shutdown();
        Scenario::set_current(nullptr);
        velkshim_set_root(nullptr);
        fs::remove_all(root_);
    }

  protected:
    ScenarioAtItsPath() {
        std::string name = (fs::temp_directory_path() / "velk-root-XXXXXX").string();
        root_ = ::mkdtemp(name.data());
        fs::create_directories(root_ / "etc/velkhost");
        EXPECT_EQ(velkshim_set_root(root_.c_str()), 0);
        EXPECT_EQ(broker_.register_providers(VELK_REGISTRATION), "");
    }
    void write(const std::string &text) {
        std::ofstream(root_ / "etc/velkhost/scenario.toml") << text;
    }

    broker::MethodReply fetch() {
        return broker_.invoke_method({"", "zeb/cimv2", "ZEB_FileTransferService", {}},
                                     "TransferViaURL", {{"SourceURI", cim::Value::string("x")}});
    }

    fs::path root_;
    broker::Broker broker_{{"test", {VELK_PROVIDER_DIR}}};
};

TEST_F(ScenarioAtItsPath, AbsentFileIsTheBuiltInDefault) {
    EXPECT_EQ(Scenario::current()->source, "built-in default");
    EXPECT_EQ(Scenario::current(), Scenario::current());
}

TEST_F(ScenarioAtItsPath, IsReadAtTheFirstUseAndKept) {
    write("[host]\nnode = 'first'");
    EXPECT_EQ(Scenario::current()->host.node, "first");
    EXPECT_EQ(Scenario::current()->source, "/etc/velkhost/scenario.toml");
    write("[host]\nnode = 'second'");
    EXPECT_EQ(Scenario::current()->host.node, "first");
}

TEST_F(ScenarioAtItsPath, WhatTheCommandLineSetsComesFirst) {
    write("[host]\nnode = 'file'");
    Scenario::set_current(std::make_shared<Scenario>());
    EXPECT_EQ(Scenario::current()->source, "built-in default");
}

TEST_F(ScenarioAtItsPath, ProvidersFollowIt) {
    write("[[fault]]\nstep = 'filetransfer.url'\ncode = 1\nmessage = 'from the file'");
    EXPECT_EQ(fetch().status.message, "from the file");
}

TEST_F(ScenarioAtItsPath, UnusableFileKeepsProvidersFromLoadingAndSaysWhy) {
    write("[host]\nname = 'n'");
    const auto reply = fetch();
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(reply.status.message,
                ::testing::HasSubstr("/etc/velkhost/scenario.toml:2: [host] unknown key \"name\""));
}

TEST_F(ScenarioAtItsPath, UnusableFileCanBePutRight) {
    write("nonsense");
    EXPECT_THROW(Scenario::current(), scenario::ScenarioError);
    write("");
    EXPECT_EQ(Scenario::current()->source, "/etc/velkhost/scenario.toml");
}

}  // namespace
}  // namespace velkhost::providers::testing
