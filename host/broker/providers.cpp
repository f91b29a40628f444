#include "host/broker/providers.h"

#include "host/cim/names.h"

#include <algorithm>
#include <utility>

namespace velkhost::broker {
namespace {

Registration in_process_registration(std::string name, const ManagementInterfaces &interfaces) {
    Registration registration;
    registration.provider = std::move(name);
    const bool present[] = {interfaces.instance != nullptr, interfaces.association != nullptr,
                            interfaces.method != nullptr, interfaces.property != nullptr,
                            interfaces.indication != nullptr};
    for (std::size_t kind = 0; kind < kKindNames.size(); ++kind) {
        if (present[kind]) {
            registration.kinds.add(static_cast<ProviderKind>(kind));
        }
    }
    return registration;
}

}  // namespace

Provider::Provider(Registration registration)
    : registration_(std::move(registration)), in_process_(false) {}

Provider::Provider(std::string name, const ManagementInterfaces &interfaces)
    : registration_(in_process_registration(std::move(name), interfaces)),
      in_process_(true),
      state_(State::kLoaded),
      loaded_{{}, interfaces} {}

Provider::Loaded Provider::load(Core &core) {
    const std::lock_guard lock(lock_);
    if (state_ == State::kLoading) {
        return {{CMPI_RC_ERR_FAILED, registration_.provider + " is still being loaded"}, {}};
    }
    if (state_ == State::kUnloaded) {
        state_ = State::kLoading;
        loaded_ = load_from_library(core, registration_);
        state_ = loaded_.status.ok() ? State::kLoaded : State::kBroken;
    }
    return loaded_;
}

ManagementInterfaces Provider::loaded() const {
    const std::lock_guard lock(lock_);
    return state_ == State::kLoaded ? loaded_.interfaces : ManagementInterfaces{};
}

void Provider::forget() {
    const std::lock_guard lock(lock_);
    if (!in_process_) {
        state_ = State::kUnloaded;
        loaded_ = {};
    }
}

void ProviderTable::add(const Registration &registration) {
    const std::unique_lock lock(lock_);
    // Sections of several classes may name one provider; it is loaded once.
    const auto twin = std::find_if(rows_.begin(), rows_.end(), [&registration](const Row &row) {
        return row.provider->registration().provider == registration.provider &&
               row.provider->registration().location == registration.location;
    });
    const ProviderPointer provider =
        twin != rows_.end() ? twin->provider : std::make_shared<Provider>(registration);
    provider->add_kinds(registration.kinds);
    for (const std::string &name_space : registration.namespaces) {
        rows_.push_back({name_space, registration.class_name, registration.kinds, provider});
    }
}

void ProviderTable::add(Row row) {
    const std::unique_lock lock(lock_);
    rows_.push_back(std::move(row));
}

ProviderPointer ProviderTable::find(ProviderKind kind, std::string_view name_space,
                                    const std::vector<std::string> &class_names) const {
    const std::shared_lock lock(lock_);
    for (const std::string &class_name : class_names) {
        const auto place = std::find_if(rows_.begin(), rows_.end(), [&](const Row &row) {
            return row.kinds.has(kind) && cim::same_name(row.class_name, class_name) &&
                   (name_space.empty() || cim::same_name(row.name_space, name_space));
        });
        if (place != rows_.end()) {
            return place->provider;
        }
    }
    return nullptr;
}

std::vector<ProviderTable::Row> ProviderTable::rows(ProviderKind kind,
                                                    std::string_view name_space) const {
    const std::shared_lock lock(lock_);
    std::vector<Row> found;
    std::copy_if(rows_.begin(), rows_.end(), std::back_inserter(found), [&](const Row &row) {
        return row.kinds.has(kind) && cim::same_name(row.name_space, name_space);
    });
    return found;
}

std::vector<ProviderPointer> ProviderTable::all() const {
    const std::shared_lock lock(lock_);
    std::vector<ProviderPointer> found;
    for (const Row &row : rows_) {
        if (std::find(found.begin(), found.end(), row.provider) == found.end()) {
            found.push_back(row.provider);
        }
    }
    return found;
}

}  // namespace velkhost::broker
