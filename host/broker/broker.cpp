// The broker as a whole: what it is made of, and its providers' coming and going.
#include "host/broker/broker.h"

#include "host/broker/core.h"
#include "host/broker/unload.h"

#include <utility>

namespace velkhost::broker {

Broker::Broker(BrokerOptions options)
    : core_(std::make_unique<Core>(std::move(options.name), std::move(options.provider_folders),
                                   options.strict_ledger)) {}

Broker::~Broker() = default;

const CMPIBroker *Broker::cmpi() const {
    return &core_->face;
}

Repository &Broker::repository() {
    return core_->repository;
}

Ledger &Broker::ledger() {
    return *core_->ledger;
}

Trace &Broker::trace() {
    return core_->trace;
}

void Broker::set_fault_hook(FaultHook hook) {
    core_->faults.set(std::move(hook));
}

std::string Broker::register_providers(const std::filesystem::path &file) {
    const RegistrationFile registrations = read_registration(file);
    for (const Registration &registration : registrations.entries) {
        core_->providers.add(registration);
    }
    return registrations.error;
}

void Broker::register_provider(const std::string &name_space, const std::string &class_name,
                               const ManagementInterfaces &interfaces, const std::string &name) {
    auto provider = std::make_shared<Provider>(name, interfaces);
    const ProviderKinds kinds = provider->registration().kinds;
    core_->providers.add({name_space, class_name, kinds, std::move(provider)});
}

Status Broker::load_providers() {
    for (const ProviderPointer &provider : core_->providers.all()) {
        if (Status status = provider->load(*core_).status; !status.ok()) {
            return status;
        }
    }
    return {};
}

std::vector<UnloadAnswer> Broker::idle() {
    std::vector<UnloadAnswer> answers;
    for (const ProviderPointer &provider : core_->providers.all()) {
        if (const auto decision = ask_to_unload(*core_, *provider)) {
            answers.push_back({provider->registration().provider, *decision});
        }
    }
    return answers;
}

void Broker::shutdown() {
    if (shut_down_.exchange(true)) {
        return;
    }
    for (const ProviderPointer &provider : core_->providers.all()) {
        tell_shutdown(*core_, *provider);
    }
    core_->ledger->report_leaks();
}

}  // namespace velkhost::broker
