// An embedded CMPI broker that behaves towards providers as one of the sfcb kind does.
//
// A program fills its repository and provider table, then makes requests; providers see the CMPI
// tables and nothing else. All functions may be called by several threads at once; no lock is held
// while a provider runs.
#pragma once

#include "host/broker/api.h"
#include "host/broker/faults.h"
#include "host/broker/ledger.h"
#include "host/broker/providers.h"
#include "host/broker/replies.h"
#include "host/broker/repository.h"
#include "host/broker/trace.h"

#include <cmpi/cmpift.h>

#include <atomic>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::broker {

struct BrokerOptions {
    std::string name = "velkhost";
    // Where lib<location>.so is looked for, in this order.
    std::vector<std::filesystem::path> provider_folders;
    // Keep objects that are gone in memory, so that a later use is a finding and no crash.
    bool strict_ledger = true;
};

// Where a request runs. A real broker gives each a thread of its own.
enum class RequestThread { kCaller, kFresh };

struct RequestOptions {
    std::string principal = "root";
    CMPIFlags flags = 0;  // CMPI_FLAG_...; method calls always carry 0
    RequestThread thread = RequestThread::kCaller;
};

// Property names; no value stands for all.
using PropertyList = std::optional<std::vector<std::string>>;

// What an association request is narrowed to; empty texts stand for any.
struct AssociationFilter {
    std::string association_class;  // of associators
    std::string result_class;
    std::string role;
    std::string result_role;  // of associators
    PropertyList properties;
};

// What a provider answered when it was asked to go.
struct UnloadAnswer {
    enum class Decision { kUnloads, kStays, kStaysForEver };
    std::string provider;
    Decision decision = Decision::kStays;
};

class VELKBROKER_API Broker {
  public:
    explicit Broker(BrokerOptions options = {});
    // Does not ask the providers; see shutdown. Their threads must have ended.
    ~Broker();
    Broker(const Broker &) = delete;
    Broker &operator=(const Broker &) = delete;

    // What providers hold; valid as long as this object.
    [[nodiscard]] const CMPIBroker *cmpi() const;

    [[nodiscard]] Repository &repository();
    [[nodiscard]] Ledger &ledger();
    [[nodiscard]] Trace &trace();
    void set_fault_hook(FaultHook hook);

    // -- Providers --

    // Adds what the file registers; libraries are loaded at the first request for them. Returns
    // what is wrong with the file ("file:line: ..."), or an empty text.
    [[nodiscard]] std::string register_providers(const std::filesystem::path &file);

    // Adds a provider that is in the process already. The caller keeps the objects.
    void register_provider(const std::string &name_space, const std::string &class_name,
                           const ManagementInterfaces &interfaces,
                           const std::string &name = "in-process provider");

    // Loads every registered provider now. Returns the first failure.
    [[nodiscard]] Status load_providers();

    // What a real broker does after a minute without requests: asks the instance clean-up of every
    // loaded provider, and the others only if that agreed. 51 means that it stays and is not asked
    // again, any other refusal that it is asked next time. A provider that agrees is created anew
    // at its next use; its library stays in the process, so its globals keep their values.
    std::vector<UnloadAnswer> idle();

    // Tells every loaded provider that the broker ends, then closes the ledger: clones that are
    // alive become findings. The second call does nothing.
    void shutdown();

    // -- Requests of clients --

    PathsReply enumerate_instance_names(const cim::ObjectPath &class_path,
                                        const RequestOptions &options = {});
    InstancesReply enumerate_instances(const cim::ObjectPath &class_path,
                                       const PropertyList &properties = {},
                                       const RequestOptions &options = {});
    InstanceReply get_instance(const cim::ObjectPath &path, const PropertyList &properties = {},
                               const RequestOptions &options = {});
    PathReply create_instance(const cim::Instance &instance, const RequestOptions &options = {});
    Status modify_instance(const cim::Instance &instance, const PropertyList &properties = {},
                           const RequestOptions &options = {});
    Status delete_instance(const cim::ObjectPath &path, const RequestOptions &options = {});
    InstancesReply exec_query(const cim::ObjectPath &class_path, const std::string &query,
                              const std::string &language = "WQL",
                              const RequestOptions &options = {});

    InstancesReply associators(const cim::ObjectPath &path, const AssociationFilter &filter = {},
                               const RequestOptions &options = {});
    PathsReply associator_names(const cim::ObjectPath &path, const AssociationFilter &filter = {},
                                const RequestOptions &options = {});
    InstancesReply references(const cim::ObjectPath &path, const AssociationFilter &filter = {},
                              const RequestOptions &options = {});
    PathsReply reference_names(const cim::ObjectPath &path, const AssociationFilter &filter = {},
                               const RequestOptions &options = {});

    MethodReply invoke_method(const cim::ObjectPath &path, const std::string &method,
                              const cim::NamedValues &in = {}, const RequestOptions &options = {});

  private:
    std::unique_ptr<Core> core_;
    std::atomic<bool> shut_down_{false};
};

}  // namespace velkhost::broker
