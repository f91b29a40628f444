#include "host/broker/named_items.h"

namespace velkhost::broker {

CMPIData item_by_name(const Tag &owner, const cim::NamedValues &items, const char *name,
                      CMPIStatus *status) {
    const cim::Value *value = name != nullptr ? items.find(name) : nullptr;
    if (value == nullptr) {
        set_status(status, CMPI_RC_ERR_NOT_FOUND);
        return not_found();
    }
    set_status(status, CMPI_RC_OK);
    return to_data({owner.core, Custody::kTracked, {"a getter", name}, nullptr}, *value);
}

CMPIData item_at(const Tag &owner, const cim::NamedValues &items, CMPICount index,
                 CMPIString **name, CMPIStatus *status) {
    if (index == items.size()) {
        owner.ledger.note(FindingKind::kUnsafeCall, owner.describe() + " was read at index " +
                                                        std::to_string(index) +
                                                        ", which is its count");
    }
    if (index >= items.size()) {
        set_status(status, CMPI_RC_ERR_NOT_FOUND);
        return not_found();
    }
    const cim::NamedValue &item = items[index];
    const Making making{owner.core, Custody::kTracked, {"a getter", item.name}, nullptr};
    if (name != nullptr) {
        *name = make_string(making, item.name);
    }
    set_status(status, CMPI_RC_OK);
    return to_data(making, item.value);
}

CMPIrc add_item(cim::NamedValues &items, const char *name, const CMPIValue *value, CMPIType type) {
    if (name == nullptr) {
        return CMPI_RC_ERR_INVALID_PARAMETER;
    }
    if (type == CMPI_chars && value == nullptr) {
        items.set(name, {CMPI_string, cim::NullText{}});
        return CMPI_RC_OK;
    }
    std::optional<cim::Value> stored = from_caller(value, type);
    if (!stored) {
        return CMPI_RC_ERR_INVALID_DATA_TYPE;
    }
    items.set(name, std::move(*stored));
    return CMPI_RC_OK;
}

}  // namespace velkhost::broker
