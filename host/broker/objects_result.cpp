// CMPIResult: where a provider puts what a request asks for.
#include "host/broker/convert.h"

namespace velkhost::broker {
namespace {

CMPIResult *refuse_clone(const CMPIResult *result, CMPIStatus *status) {
    if (open(result, "clone", status) != nullptr) {
        set_status(status, CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return nullptr;
}

void unsafe(const Tag &tag, const char *what) {
    tag.ledger.note(FindingKind::kUnsafeCall, std::string(what) + "; " + tag.describe());
}

// A real broker's process ends on references, and sends the bare pointer of anything else that is
// neither a scalar nor a text nor a time.
bool can_travel(const Tag &tag, CMPIType type) {
    if (type == CMPI_ref) {
        unsafe(tag, "a reference was given to returnData, which ends a real broker's process");
        return false;
    }
    if ((type & CMPI_ARRAY) != 0 || type == CMPI_instance) {
        unsafe(tag, "an array or instance was returned by a method and arrives as garbage");
        return false;
    }
    return true;
}

CMPIStatus return_data(const CMPIResult *result, const CMPIValue *value, CMPIType type) {
    CMPIStatus status{};
    const auto *object = open(result, "returnData", &status);
    if (object == nullptr) {
        return status;
    }
    if (!can_travel(object->tag, type)) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    }
    std::optional<cim::Value> given = from_caller(value, type, true);
    if (!given) {
        return {CMPI_RC_ERR_INVALID_DATA_TYPE, nullptr};
    }
    (*object->payload)->values.push_back(std::move(*given));
    return status;
}

// Instances and paths are results of every request but a method call.
CMPIStatus return_object(const Object<CMPIResult> &object, std::optional<cim::Value> given) {
    ResultSink &sink = **object.payload;
    if (!given || given->is_null()) {
        return {CMPI_RC_ERR_INVALID_PARAMETER, nullptr};
    }
    if (sink.for_method && !can_travel(object.tag, given->type())) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    }
    sink.values.push_back(std::move(*given));
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus return_instance(const CMPIResult *result, const CMPIInstance *instance) {
    CMPIStatus status{};
    const auto *object = open(result, "returnInstance", &status);
    CMPIValue value{};
    value.inst = const_cast<CMPIInstance *>(instance);
    return object != nullptr ? return_object(*object, from_caller(&value, CMPI_instance)) : status;
}

CMPIStatus return_object_path(const CMPIResult *result, const CMPIObjectPath *path) {
    CMPIStatus status{};
    const auto *object = open(result, "returnObjectPath", &status);
    CMPIValue value{};
    value.ref = const_cast<CMPIObjectPath *>(path);
    return object != nullptr ? return_object(*object, from_caller(&value, CMPI_ref)) : status;
}

CMPIStatus return_done(const CMPIResult *result) {
    CMPIStatus status{};
    if (const auto *object = open(result, "returnDone", &status)) {
        (*object->payload)->done = true;
    }
    return status;
}

}  // namespace

const CMPIResultFT kResultTable{
    .ftVersion = 1,
    .release = release<CMPIResult>,
    .clone = refuse_clone,
    .returnData = return_data,
    .returnInstance = return_instance,
    .returnObjectPath = return_object_path,
    .returnDone = return_done,
    .returnError = nullptr,
};

}  // namespace velkhost::broker
