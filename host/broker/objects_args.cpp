// CMPIArgs: the parameters of a method call.
#include "host/broker/named_items.h"

namespace velkhost::broker {
namespace {

CMPIStatus add_arg(const CMPIArgs *args, const char *name, const CMPIValue *value, CMPIType type) {
    CMPIStatus status{};
    if (auto *object = open(args, "addArg", &status)) {
        status.rc = add_item(*object->payload, name, value, type);
    }
    return status;
}

CMPIData get_arg(const CMPIArgs *args, const char *name, CMPIStatus *status) {
    const auto *object = open(args, "getArg", status);
    return object != nullptr ? item_by_name(object->tag, *object->payload, name, status)
                             : not_found();
}

CMPIData get_arg_at(const CMPIArgs *args, CMPICount index, CMPIString **name, CMPIStatus *status) {
    const auto *object = open(args, "getArgAt", status);
    return object != nullptr ? item_at(object->tag, *object->payload, index, name, status)
                             : not_found();
}

CMPICount get_arg_count(const CMPIArgs *args, CMPIStatus *status) {
    const auto *object = open(args, "getArgCount", status);
    return object != nullptr ? static_cast<CMPICount>(object->payload->size()) : 0;
}

}  // namespace

const CMPIArgsFT kArgsTable{
    .ftVersion = 1,
    .release = release<CMPIArgs>,
    .clone = clone<CMPIArgs>,
    .addArg = add_arg,
    .getArg = get_arg,
    .getArgAt = get_arg_at,
    .getArgCount = get_arg_count,
};

}  // namespace velkhost::broker
