// The thread that runs one accepted request.

#include "provider/install_thread.h"

#include <thread>

#include "provider/package_list.h"
#include "tests/support/broker_test.h"
#include "velk/request_state.h"

namespace {

using velktest::entry;

class InstallThread : public velktest::BrokerTest {
  protected:
    // Runs the thread's body on a thread of its own and waits for its end.
    void run() {
        in_request([this](const CMPIContext *context) {
            velk::AsyncInstallArg argument = {7, context};
            std::thread thread([&] { result_ = asyncInstallAllPkgs(&argument); });
            thread.join();
        });
    }

    [[nodiscard]] const void *result() const { return result_; }

  private:
    const void *result_ = this;
};

}  // namespace

TEST_F(InstallThread, RequestIsRunBetweenTheThreadsEntries) {
    run();
    EXPECT_TRUE(log().starts_with(
        velktest::entries({"Enter asyncInstallAllPkgs.\n", "Enter syncInstallAllPkgs.\n"})));
    EXPECT_TRUE(log().find(entry("Complete InstallAllPkgs.\n")) != std::string::npos);
    EXPECT_TRUE(log().ends_with(entry("asyncInstallAllPkgs finish.\n")));
    EXPECT_EQ(result(), nullptr);
}

TEST_F(InstallThread, CounterIsRaisedWhileItRuns) {
    initPkgInstall("file:///nowhere/a.xml");
    int seen = 0;
    broker().trace().subscribe([&](const auto &call) {
        if (call.method == "DeleteTransferredFile") {
            seen = velk::load(Velkchild_thread_num);
        }
    });
    run();
    broker().trace().subscribe({});
    EXPECT_EQ(seen, 1);
    EXPECT_EQ(Velkchild_thread_num, 0);
}

TEST_F(InstallThread, ItsContextIsACloneThatIsReleased) {
    run();
    EXPECT_EQ(broker().ledger().live_clones(), 0U);
}
