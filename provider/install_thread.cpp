#include "provider/install_thread.h"

#include <atomic>

#include "provider/install_driver.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/request_state.h"

// Exported by brokers of the sfcb kind, whose contexts cannot be cloned through their table.
extern "C" __attribute__((weak)) CMPIContext *native_clone_CMPIContext(const CMPIContext *context);

namespace velk {
namespace {

// The install thread's own context. Where the broker has no clone export, its thread services do
// the same job.
class ThreadContext {
  public:
    explicit ThreadContext(const CMPIContext *invoking) {
        if (native_clone_CMPIContext != nullptr) {
            context_ = native_clone_CMPIContext(invoking);
            return;
        }
        const CMPIBroker *broker = ZEB_VMWarePackageInstallationBroker;
        context_ = CBPrepareAttachThread(broker, invoking);
        if (context_ != nullptr) {
            CBAttachThread(broker, context_);
            attached_ = true;
        }
    }

    ~ThreadContext() {
        if (attached_) {
            CBDetachThread(ZEB_VMWarePackageInstallationBroker, context_);
        } else if (context_ != nullptr) {
            CMRelease(context_);
        }
    }

    ThreadContext(const ThreadContext &) = delete;
    ThreadContext &operator=(const ThreadContext &) = delete;

    [[nodiscard]] const CMPIContext *get() const { return context_; }

  private:
    CMPIContext *context_ = nullptr;
    bool attached_ = false;
};

void run_request(const CMPIContext *invoking) {
    const ThreadContext context(invoking);
    // No broker service can be asked without a context.
    if (context.get() != nullptr) {
        syncInstallAllPkgs(context.get());
    }
}

}  // namespace
}  // namespace velk

void *asyncInstallAllPkgs(void *arg) {
    velk::log_entry("Enter asyncInstallAllPkgs.\n");
    std::atomic_ref running(Velkchild_thread_num);
    ++running;
    velk::run_request(static_cast<const velk::AsyncInstallArg *>(arg)->context);
    velk::log_entry("asyncInstallAllPkgs finish.\n");
    --running;
    return nullptr;
}
