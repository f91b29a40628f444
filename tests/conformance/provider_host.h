// A host in a folder of the test's own with the shipped library on it: the fixed paths lie under a
// root, the clock stands but for pauses, an embedded broker loads the library from the registration
// that goes with it, and doubles stand in for the other services. One per process, since the
// library keeps its globals.
#pragma once

#include <dlfcn.h>

#include <atomic>
#include <filesystem>
#include <functional>
#include <map>
#include <mutex>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "host/broker/broker.h"
#include "tests/support/files.h"
#include "tests/support/pause_log.h"
#include "tests/support/service_doubles.h"

namespace velktest {

namespace cim = velkhost::cim;

// Seconds since the host was set up, on its clock.
using Seconds = double;

struct Pause {
    Seconds at;
    Seconds length;
    bool operator==(const Pause &) const = default;
};

// One rewrite of a file under /tmp/sfcb.
struct FileWrite {
    Seconds at;
    std::string path;  // the fixed path
    std::string text;
};

// The host's file transfer service. A method that has no answer set succeeds with 0.
class FileTransferService : public DoubleBase {
  public:
    [[nodiscard]] const char *class_name() const override { return "ZEB_FileTransferService"; }
    kit::MethodResult invoke(const kit::Path &target, const std::string &method,
                             const kit::Args &in) override;

    std::map<std::string, MethodEnd> answers;
};

// What the job library does when it is asked for a job; its result is that of the function.
using CreateJob = std::function<int(char *instance_id, int size, const char *record)>;

class ProviderHost {
  public:
    ProviderHost();
    ~ProviderHost();
    ProviderHost(const ProviderHost &) = delete;
    ProviderHost &operator=(const ProviderHost &) = delete;

    // -- Requests --

    static cim::ObjectPath service_path(const std::string &class_name = kClass) {
        return {"", kNamespace, class_name, {}};
    }
    velkhost::broker::MethodReply call(const std::string &method, const cim::NamedValues &in = {},
                                       const std::string &class_name = kClass);

    // Whether no install thread is at work after at most `limit` of the host's time.
    bool wait_until_idle(Seconds limit = 3600);

    // -- The library, as a tool sees it --

    // Each throws when the library has no such symbol.
    template <class Type>
    Type &data(const char *name) const {
        return *static_cast<Type *>(symbol(name));
    }
    template <class Function>
    Function *function(const char *name) const {
        return reinterpret_cast<Function *>(symbol(name));
    }
    // One of the plain integers.
    [[nodiscard]] int value(const char *name) const {
        return std::atomic_ref(data<int>(name)).load();
    }

    // -- The host --

    [[nodiscard]] std::filesystem::path at(std::string_view fixed_path) const;
    // A folder outside of the fixed paths.
    [[nodiscard]] const std::filesystem::path &folder() const { return folder_.path(); }
    [[nodiscard]] std::string log() const;
    void clear_log() const;
    [[nodiscard]] Seconds now() const;
    void pause(Seconds length) const;

    // Pauses of the thread that made this host, and those of all others.
    [[nodiscard]] std::vector<Pause> own_pauses() const;
    [[nodiscard]] std::vector<Pause> other_pauses() const;
    [[nodiscard]] std::vector<FileWrite> status_writes() const;
    // Passes of a step of the shim, such as "dlopen:/usr/lib/cim/libconcretejob.so".
    [[nodiscard]] int passes(const std::string &step) const;

    // From now on the step fails with this errno value.
    void fail_step(const std::string &step, int error);
    // From now on the broker's service refuses; `step` as in host/broker/faults.h.
    void fail_service(const std::string &step, const std::string &subject, int code,
                      const std::string &message = "");
    // How often a provider used a broker's service ("broker.cloneContext") since `fail_service`.
    [[nodiscard]] int uses(const std::string &step) const;

    // Puts a library in the place of the job library. By default it is the double that runs
    // `create_job`, which names jobs VELK-1, VELK-2 and so on.
    void install_job_library(const std::filesystem::path &library);
    void remove_job_library();
    static CreateJob &create_job();

    // What the library asked of other providers, in order, such as
    // `invokeMethod zeb/cimv2:ZEB_FileTransferService.DeleteTransferredFile(FileURI="file:///a")`.
    [[nodiscard]] std::vector<std::string> up_calls();

    velkhost::broker::Broker &broker() { return broker_; }
    ManagementController &controller() { return controller_; }
    UpdateJob &job() { return job_; }
    FileTransferService &transfer() { return transfer_; }

    static constexpr const char *kNamespace = "velk/cimv2";
    static constexpr const char *kClass = "PAKRO_VMpkgInstallationService";

  private:
    static void note_pause(void *host, std::int64_t now_us, std::int64_t length_us);
    static void note_file(void *host, const char *path, std::int64_t now_us);
    static int strike(void *host, const char *step);

    void furnish() const;
    void watch();
    void add_service(DoubleBase &service);
    void *symbol(const char *name) const;
    [[nodiscard]] Seconds since_start(std::int64_t time_us) const;
    [[nodiscard]] std::vector<Pause> pauses_of(const PauseLog &log) const;

    const std::thread::id owner_ = std::this_thread::get_id();
    TempFolder folder_;
    mutable std::mutex lock_;  // of what the observers write
    PauseLog own_pauses_;
    PauseLog other_pauses_;
    std::vector<FileWrite> writes_;
    std::map<std::string, int> passes_;
    std::map<std::string, int> failing_steps_;
    std::map<std::string, int> uses_;
    velkhost::broker::Broker broker_;
    ManagementController controller_;
    UpdateJob job_;
    FileTransferService transfer_;
    void *library_ = nullptr;
};

}  // namespace velktest
