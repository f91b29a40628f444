// CMPIDateTime: a point in time or an interval.
#include "host/broker/convert.h"
#include "host/broker/datetime.h"

namespace velkhost::broker {
namespace {

CMPIUint64 get_binary_format(const CMPIDateTime *time, CMPIStatus *status) {
    const auto *object = open(time, "getBinaryFormat", status);
    return object != nullptr ? datetime::to_microseconds(*object->payload) : 0;
}

CMPIString *get_string_format(const CMPIDateTime *time, CMPIStatus *status) {
    const auto *object = open(time, "getStringFormat", status);
    if (object == nullptr) {
        return nullptr;
    }
    return make_string(
        {object->tag.core, Custody::kTracked, {"getStringFormat", *object->payload}, nullptr},
        *object->payload);
}

CMPIBoolean get_is_interval(const CMPIDateTime *time, CMPIStatus *status) {
    const auto *object = open(time, "isInterval", status);
    return object != nullptr && datetime::is_interval(*object->payload) ? 1 : 0;
}

}  // namespace

const CMPIDateTimeFT kDateTimeTable{
    .ftVersion = 1,
    .release = release<CMPIDateTime>,
    .clone = clone<CMPIDateTime>,
    .getBinaryFormat = get_binary_format,
    .getStringFormat = get_string_format,
    .isInterval = get_is_interval,
};

}  // namespace velkhost::broker
