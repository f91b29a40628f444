// The providers of a broker: which class they serve where, and how they come into the process.
#pragma once

#include "host/broker/registration.h"
#include "host/broker/status.h"

#include <cmpi/cmpift.h>

#include <atomic>
#include <filesystem>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::broker {

struct Core;

// A provider's objects, one per kind that it serves; null for the others. The provider owns them.
struct ManagementInterfaces {
    CMPIInstanceMI *instance = nullptr;
    CMPIAssociationMI *association = nullptr;
    CMPIMethodMI *method = nullptr;
    CMPIPropertyMI *property = nullptr;
    CMPIIndicationMI *indication = nullptr;
};

class Provider {
  public:
    // One that a library brings.
    explicit Provider(Registration registration);
    // One that is in the process already.
    Provider(std::string name, const ManagementInterfaces &interfaces);

    struct Loaded {
        Status status;  // rc 1 with the cause when it is not loadable
        ManagementInterfaces interfaces;
    };
    // Its interfaces; at the first use its library is opened and all its factories are called. What
    // failed once fails again without another attempt.
    Loaded load(Core &core);

    // Its interfaces if it is loaded, else none.
    [[nodiscard]] ManagementInterfaces loaded() const;

    // It is to be loaded again at its next use.
    void forget();

    [[nodiscard]] const Registration &registration() const { return registration_; }
    void add_kinds(ProviderKinds kinds) { registration_.kinds.add(kinds); }

    // It has said that it is never to be asked to go again.
    [[nodiscard]] bool stays_for_ever() const { return stays_for_ever_.load(); }
    void stay_for_ever() { stays_for_ever_.store(true); }

  private:
    enum class State { kUnloaded, kLoading, kLoaded, kBroken };

    Loaded load_library(Core &core);

    Registration registration_;
    const bool in_process_;
    mutable std::recursive_mutex lock_;  // factories may call the broker
    State state_ = State::kUnloaded;
    Loaded loaded_;
    std::atomic<bool> stays_for_ever_ = false;
};
using ProviderPointer = std::shared_ptr<Provider>;

// Opens lib<location>.so from the first folder that has it and calls the factories of all
// registered kinds: `_Generic_Create_<Kind>MI` where there is one, else
// `<provider>_Create_<Kind>MI`.
Provider::Loaded load_from_library(Core &core, const Registration &registration);

class ProviderTable {
  public:
    struct Row {
        std::string name_space;
        std::string class_name;
        ProviderKinds kinds;
        ProviderPointer provider;
    };

    void add(const Registration &registration);
    void add(Row row);

    // The provider of the first of these classes that has one of that kind; null if none has.
    // An empty namespace stands for any.
    [[nodiscard]] ProviderPointer find(ProviderKind kind, std::string_view name_space,
                                       const std::vector<std::string> &class_names) const;

    [[nodiscard]] std::vector<Row> rows(ProviderKind kind, std::string_view name_space) const;
    [[nodiscard]] std::vector<ProviderPointer> all() const;

  private:
    mutable std::shared_mutex lock_;
    std::vector<Row> rows_;
};

}  // namespace velkhost::broker
