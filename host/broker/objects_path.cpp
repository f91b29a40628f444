// CMPIObjectPath: the name of a class or an instance.
#include "host/broker/named_items.h"

namespace velkhost::broker {
namespace {

using Part = std::string cim::ObjectPath::*;

// -- Host, namespace, class --

template <Part part>
CMPIStatus set_part(CMPIObjectPath *path, const char *text) {
    CMPIStatus status{};
    if (auto *object = open(path, "a setter", &status)) {
        (*object->payload).*part = text != nullptr ? text : "";
    }
    return status;
}

// A part that is not set is a string object whose text is null.
template <Part part>
CMPIString *get_part(const CMPIObjectPath *path, CMPIStatus *status) {
    const auto *object = open(path, "a getter", status);
    if (object == nullptr) {
        return nullptr;
    }
    const std::string &text = (*object->payload).*part;
    return make_string({object->tag.core, Custody::kTracked, {"a getter", text}, nullptr},
                       text.empty() ? StringPayload() : text);
}

template <Part... parts>
CMPIStatus copy_parts(CMPIObjectPath *path, const CMPIObjectPath *source) {
    CMPIStatus status{};
    const auto *from = open(source, "a copy of its namespace", &status);
    auto *to = from != nullptr ? open(path, "a copy of a namespace", &status) : nullptr;
    if (to != nullptr) {
        (((*to->payload).*parts = (*from->payload).*parts), ...);
    }
    return status;
}

// -- Keys --

CMPIStatus add_key(CMPIObjectPath *path, const char *name, const CMPIValue *value, CMPIType type) {
    CMPIStatus status{};
    if (auto *object = open(path, "addKey", &status)) {
        status.rc = add_item(object->payload->keys, name, value, type);
    }
    return status;
}

CMPIData get_key(const CMPIObjectPath *path, const char *name, CMPIStatus *status) {
    const auto *object = open(path, "getKey", status);
    return object != nullptr ? item_by_name(object->tag, object->payload->keys, name, status)
                             : not_found();
}

CMPIData get_key_at(const CMPIObjectPath *path, CMPICount index, CMPIString **name,
                    CMPIStatus *status) {
    const auto *object = open(path, "getKeyAt", status);
    return object != nullptr ? item_at(object->tag, object->payload->keys, index, name, status)
                             : not_found();
}

CMPICount get_key_count(const CMPIObjectPath *path, CMPIStatus *status) {
    const auto *object = open(path, "getKeyCount", status);
    return object != nullptr ? static_cast<CMPICount>(object->payload->keys.size()) : 0;
}

// -- Schema and text --

CMPIData get_property_qualifier(const CMPIObjectPath *path, const char *property,
                                const char *qualifier, CMPIStatus *status) {
    const auto *object = open(path, "getPropertyQualifier", status);
    if (object == nullptr || property == nullptr || qualifier == nullptr) {
        return not_found();
    }
    const std::optional<cim::Value> value =
        object->tag.core.repository.property_qualifier(*object->payload, property, qualifier);
    if (!value) {
        set_status(status, CMPI_RC_ERR_NOT_FOUND);
        return not_found();
    }
    return to_data(
        {object->tag.core, Custody::kTracked, {"getPropertyQualifier", qualifier}, nullptr},
        *value);
}

CMPIString *path_to_string(const CMPIObjectPath *path, CMPIStatus *status) {
    const auto *object = open(path, "toString", status);
    if (object == nullptr) {
        return nullptr;
    }
    return make_string(
        {object->tag.core, Custody::kTracked, {"toString", object->payload->class_name}, nullptr},
        cim::to_text(*object->payload));
}

}  // namespace

// clang-format off
const CMPIObjectPathFT kObjectPathTable{
    .ftVersion = 1,
    .release = release<CMPIObjectPath>,
    .clone = clone<CMPIObjectPath>,
    .setNameSpace = set_part<&cim::ObjectPath::name_space>,
    .getNameSpace = get_part<&cim::ObjectPath::name_space>,
    .setHostname = set_part<&cim::ObjectPath::host>,
    .getHostname = get_part<&cim::ObjectPath::host>,
    .setClassName = set_part<&cim::ObjectPath::class_name>,
    .getClassName = get_part<&cim::ObjectPath::class_name>,
    .addKey = add_key,
    .getKey = get_key,
    .getKeyAt = get_key_at,
    .getKeyCount = get_key_count,
    .setNameSpaceFromObjectPath = copy_parts<&cim::ObjectPath::name_space>,
    .setHostAndNameSpaceFromObjectPath = copy_parts<&cim::ObjectPath::name_space, &cim::ObjectPath::host>,
    .getClassQualifier = nullptr,
    .getPropertyQualifier = get_property_qualifier,
    .getMethodQualifier = nullptr,
    .getParameterQualifier = nullptr,
    .toString = path_to_string,
};
// clang-format on

}  // namespace velkhost::broker
