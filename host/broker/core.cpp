#include "host/broker/core.h"

#include "host/broker/ledger.h"
#include "host/broker/tables.h"

#include <utility>

namespace velkhost::broker {

Core::Core(std::string broker_name, std::vector<std::filesystem::path> folders, bool strict_ledger)
    : name(std::move(broker_name)),
      provider_folders(std::move(folders)),
      library_folders(provider_folders),
      ledger(std::make_shared<Ledger>(strict_ledger)),
      up_calls(kBrokerTable),
      // The structs of 2.0 have pointers to non-const tables; nobody writes through them.
      face{this, &up_calls, const_cast<CMPIBrokerEncFT *>(&kFactoryTable),
           const_cast<CMPIBrokerExtFT *>(&kOsServicesTable), nullptr} {
    up_calls.brokerName = name.c_str();
}

Core::~Core() {
    ledger->drop_this_thread();
}

}  // namespace velkhost::broker
