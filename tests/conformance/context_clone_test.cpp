// The install thread's context where the broker has no export to clone one: its own thread services
// do the same job.

#include <dlfcn.h>
#include <gtest/gtest.h>

#include "tests/conformance/unexported_broker.h"

namespace {

using velktest::RequestReport;

class BrokerWithoutCloneExport : public testing::Test {
  protected:
    static RequestReport run(bool refuse) {
        RequestReport report;
        void *module = dlopen(VELK_UNEXPORTED_BROKER, RTLD_NOW | RTLD_LOCAL);
        if (module == nullptr) {
            ADD_FAILURE() << dlerror();
            return report;
        }
        void *symbol = dlsym(module, velktest::kRunRequest);
        EXPECT_NE(symbol, nullptr);
        EXPECT_EQ(dlsym(RTLD_DEFAULT, "native_clone_CMPIContext"), nullptr)
            << "the program has the export after all";
        reinterpret_cast<velktest::RunRequest *>(symbol)(refuse, report);
        return report;
    }
};

}  // namespace

TEST_F(BrokerWithoutCloneExport, InstallsOnAContextOfTheBrokersThreadServices) {
    const RequestReport report = run(false);
    EXPECT_EQ(report.return_value, 4096U);
    EXPECT_EQ(report.result, "uefi: 50: Package installation successfully.");
    EXPECT_EQ(report.contexts, 1);
}

TEST_F(BrokerWithoutCloneExport, GetsItsContextBackExactlyOnce) {
    const RequestReport report = run(false);
    EXPECT_EQ(report.clones, 0U);
    EXPECT_EQ(report.findings, "");
}

TEST_F(BrokerWithoutCloneExport, InstallsNothingWithoutAContext) {
    const RequestReport report = run(true);
    EXPECT_EQ(report.return_value, 4096U) << "the request was accepted before";
    EXPECT_EQ(report.result, "uefi: 0: Package Initialization finished");
    EXPECT_EQ(report.contexts, 1);
    EXPECT_EQ(report.findings, "");
}
