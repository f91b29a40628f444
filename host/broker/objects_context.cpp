// CMPIContext: the circumstances of a request, and the ways to take them into another thread.
#include "host/broker/context.h"

#include "host/broker/convert.h"

#include <algorithm>

namespace velkhost::broker {
namespace {

// Names of context entries, and of them alone, are compared with regard to case.
template <class Entries>
auto locate(Entries &entries, std::string_view name) {
    return std::find_if(entries.begin(), entries.end(),
                        [name](const cim::NamedValue &entry) { return entry.name == name; });
}

// Absent here is another status than elsewhere, and the value is whatever the stack held.
CMPIData absent_entry(CMPIStatus *status) {
    set_status(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    CMPIData data{};
    data.state = CMPI_nullValue;
    data.value.uint64 = 0xA5A5A5A5A5A5A5A5;
    return data;
}

CMPIData entry_data(const Tag &owner, const cim::NamedValue &entry) {
    return to_data({owner.core, Custody::kTracked, {"getEntry", entry.name}, nullptr}, entry.value);
}

CMPIContext *refuse_clone(const CMPIContext *context, CMPIStatus *status) {
    if (open(context, "clone", status) != nullptr) {
        set_status(status, CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return nullptr;
}

CMPIData get_entry(const CMPIContext *context, const char *name, CMPIStatus *status) {
    const auto *object = open(context, "getEntry", status);
    if (object == nullptr || name == nullptr) {
        return absent_entry(status);
    }
    const auto place = locate(*object->payload, name);
    return place == object->payload->end() ? absent_entry(status) : entry_data(object->tag, *place);
}

CMPIData get_entry_at(const CMPIContext *context, CMPICount index, CMPIString **name,
                      CMPIStatus *status) {
    const auto *object = open(context, "getEntryAt", status);
    if (object == nullptr || index >= object->payload->size()) {
        return absent_entry(status);
    }
    const cim::NamedValue &entry = (*object->payload)[index];
    if (name != nullptr) {
        *name = make_string(
            {object->tag.core, Custody::kTracked, {"getEntryAt", entry.name}, nullptr}, entry.name);
    }
    return entry_data(object->tag, entry);
}

CMPICount get_entry_count(const CMPIContext *context, CMPIStatus *status) {
    const auto *object = open(context, "getEntryCount", status);
    return object != nullptr ? static_cast<CMPICount>(object->payload->size()) : 0;
}

CMPIStatus add_entry(const CMPIContext *context, const char *name, const CMPIValue *value,
                     CMPIType type) {
    CMPIStatus status{};
    auto *object = open(context, "addEntry", &status);
    if (object == nullptr) {
        return status;
    }
    std::optional<cim::Value> stored = from_caller(value, type);
    if (name == nullptr || !stored) {
        return {CMPI_RC_ERR_INVALID_PARAMETER, nullptr};
    }
    if (value == nullptr && type != CMPI_chars && type != CMPI_null) {
        object->tag.ledger.note(FindingKind::kUnsafeCall,
                                std::string("addEntry was called without a value for ") + name);
    }
    set_entry(*object->payload, name, std::move(*stored));
    return status;
}

}  // namespace

void set_entry(ContextPayload &entries, std::string_view name, cim::Value value) {
    const auto place = locate(entries, name);
    if (place == entries.end()) {
        entries.push_back({std::string(name), std::move(value)});
    } else {
        place->value = std::move(value);
    }
}

const cim::Value *find_entry(const ContextPayload &entries, std::string_view name) {
    const auto place = locate(entries, name);
    return place == entries.end() ? nullptr : &place->value;
}

CMPIContext *clone_context(const CMPIContext *context) {
    const auto *object = open(context, "native_clone_CMPIContext");
    if (object == nullptr || object->tag.core.faults.ask("broker.cloneContext", "")) {
        return nullptr;
    }
    return make<CMPIContext>(object->tag.core, Custody::kClone, {"native_clone_CMPIContext", ""},
                             *object->payload);
}

const CMPIContextFT kContextTable{
    .ftVersion = 1,
    .release = release<CMPIContext>,
    .clone = refuse_clone,
    .getEntry = get_entry,
    .getEntryAt = get_entry_at,
    .getEntryCount = get_entry_count,
    .addEntry = add_entry,
};

}  // namespace velkhost::broker

extern "C" CMPIContext *native_clone_CMPIContext(const CMPIContext *context) {
    return velkhost::broker::clone_context(context);
}
