// What one broker consists of, for the code behind its tables.
#pragma once

#include "host/broker/faults.h"
#include "host/broker/os_services.h"
#include "host/broker/providers.h"
#include "host/broker/repository.h"
#include "host/broker/trace.h"

#include <cmpi/cmpift.h>

#include <atomic>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

namespace velkhost::broker {

class Ledger;

struct Core {
    Core(std::string broker_name, std::vector<std::filesystem::path> folders, bool strict_ledger);
    ~Core();
    Core(const Core &) = delete;
    Core &operator=(const Core &) = delete;

    // The broker behind the object that providers hold.
    static Core &of(const CMPIBroker *broker) { return *static_cast<Core *>(broker->hdl); }

    const std::string name;
    const std::vector<std::filesystem::path> provider_folders;
    const LibraryFolders library_folders;
    const std::shared_ptr<Ledger> ledger;  // threads that outlive the broker keep it
    Repository repository;
    ProviderTable providers;
    Trace trace;
    Faults faults;
    std::atomic<CMPIUint32> last_session{0};
    CMPIBrokerFT up_calls;  // a copy of the table, for the name in it
    CMPIBroker face;
};

}  // namespace velkhost::broker
