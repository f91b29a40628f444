// CMPIInstance: the properties of one object.
#include "host/broker/named_items.h"

#include <algorithm>

namespace velkhost::broker {
namespace {

// -- Reading --

CMPIData get_property(const CMPIInstance *instance, const char *name, CMPIStatus *status) {
    const auto *object = open(instance, "getProperty", status);
    return object != nullptr
               ? item_by_name(object->tag, object->payload->instance.properties, name, status)
               : not_found();
}

CMPIData get_property_at(const CMPIInstance *instance, CMPICount index, CMPIString **name,
                         CMPIStatus *status) {
    const auto *object = open(instance, "getPropertyAt", status);
    return object != nullptr
               ? item_at(object->tag, object->payload->instance.properties, index, name, status)
               : not_found();
}

CMPICount get_property_count(const CMPIInstance *instance, CMPIStatus *status) {
    const auto *object = open(instance, "getPropertyCount", status);
    return object != nullptr ? static_cast<CMPICount>(object->payload->instance.properties.size())
                             : 0;
}

// -- Writing --

// What was set as a text, a time, a reference or an array keeps its type.
bool keeps_type(const cim::Value *value) {
    constexpr auto kFixed = static_cast<CMPIType>(CMPI_ENC | CMPI_ARRAY);
    return value != nullptr && !value->is_null() && (value->type() & kFixed) != 0;
}

CMPIStatus set_property(const CMPIInstance *instance, const char *name, const CMPIValue *value,
                        CMPIType type) {
    CMPIStatus status{};
    auto *object = open(instance, "setProperty", &status);
    if (object == nullptr) {
        return status;
    }
    std::optional<cim::Value> given = from_caller(value, type);
    if (name == nullptr || !given) {
        return {given ? CMPI_RC_ERR_INVALID_PARAMETER : CMPI_RC_ERR_INVALID_DATA_TYPE, nullptr};
    }
    InstancePayload &payload = *object->payload;
    if (payload.filter && !payload.filter->contains(std::string_view(name))) {
        return status;
    }
    const cim::Value *held = payload.instance.properties.find(name);
    if (keeps_type(held) && held->type() != given->type()) {
        return {CMPI_RC_ERR_TYPE_MISMATCH, nullptr};
    }
    payload.instance.properties.set(name, std::move(*given));
    return status;
}

CMPIStatus set_property_filter(CMPIInstance *instance, const char **properties, const char **keys) {
    CMPIStatus status{};
    auto *object = open(instance, "setPropertyFilter", &status);
    if (object == nullptr || properties == nullptr) {
        return status;
    }
    auto &filter = object->payload->filter.emplace();
    for (const char **list : {properties, keys}) {
        for (const char **name = list; name != nullptr && *name != nullptr; ++name) {
            filter.emplace(*name);
        }
    }
    object->payload->instance.properties.erase_if(
        [&filter](const cim::NamedValue &item) { return !filter.contains(item.name); });
    return status;
}

// -- The path --

CMPIObjectPath *get_object_path(const CMPIInstance *instance, CMPIStatus *status) {
    const auto *object = open(instance, "getObjectPath", status);
    if (object == nullptr) {
        return nullptr;
    }
    const cim::Instance &content = object->payload->instance;
    std::optional<cim::ObjectPath> path = object->tag.core.repository.path_of(content);
    if (!path) {
        set_status(status, CMPI_RC_ERR_INVALID_CLASS);
        return nullptr;
    }
    return make_path(
        {object->tag.core, Custody::kTracked, {"getObjectPath", content.path.class_name}, nullptr},
        std::move(*path));
}

CMPIStatus set_object_path(CMPIInstance *instance, const CMPIObjectPath *path) {
    CMPIStatus status{};
    const auto *source = open(path, "setObjectPath", &status);
    auto *object = source != nullptr ? open(instance, "setObjectPath", &status) : nullptr;
    if (object != nullptr) {
        cim::Instance &content = object->payload->instance;
        content.path = *source->payload;
        for (const cim::NamedValue &key : content.path.keys) {
            content.properties.set(key.name, key.value);
        }
    }
    return status;
}

}  // namespace

const CMPIInstanceFT kInstanceTable{
    .ftVersion = 1,
    .release = release<CMPIInstance>,
    .clone = clone<CMPIInstance>,
    .getProperty = get_property,
    .getPropertyAt = get_property_at,
    .getPropertyCount = get_property_count,
    .setProperty = set_property,
    .getObjectPath = get_object_path,
    .setPropertyFilter = set_property_filter,
    .setObjectPath = set_object_path,
    .setPropertyWithOrigin = nullptr,
};

}  // namespace velkhost::broker
