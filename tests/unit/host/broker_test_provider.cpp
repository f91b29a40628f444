// Providers in libraries, good and bad; which one this is, is chosen when it is compiled.
#include <cmpi/cmpift.h>

#define EXPORT extern "C" __attribute__((visibility("default")))

#ifdef VELK_TEST_UNRESOLVED
extern "C" int velk_test_nobody_defines_this();
#endif

namespace {

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

[[maybe_unused]] CMPIStatus return_number(const CMPIResult *result, CMPIUint32 number) {
    CMPIValue value{};
    value.uint32 = number;
    result->ft->returnData(result, &value, CMPI_uint32);
    return result->ft->returnDone(result);
}

CMPIUint32 made = 0;  // factory calls so far

CMPIMethodMIFT method_table{
    .ftVersion = 200,
    .miVersion = 200,
    .miName = "method",
    .cleanup = [](CMPIMethodMI *, const CMPIContext *, CMPIBoolean) { return ok(); },
#ifdef VELK_TEST_EMPTY_SLOT
    .invokeMethod = nullptr,
#else
    .invokeMethod = [](CMPIMethodMI *, const CMPIContext *, const CMPIResult *result,
                       const CMPIObjectPath *, const char *, const CMPIArgs *,
                       CMPIArgs *) { return return_number(result, made); },
#endif
};
[[maybe_unused]] CMPIMethodMI method_mi{nullptr, &method_table};

CMPIInstanceMIFT instance_table{
    .ftVersion = 200,
    .miVersion = 200,
    .miName = "instance",
    .cleanup = [](CMPIInstanceMI *, const CMPIContext *, CMPIBoolean) { return ok(); },
    .enumerateInstanceNames = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                                 const CMPIObjectPath *) { return ok(); },
    .enumerateInstances = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                             const CMPIObjectPath *, const char **) { return ok(); },
    .getInstance = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                      const CMPIObjectPath *, const char **) { return ok(); },
    .createInstance = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                         const CMPIObjectPath *, const CMPIInstance *) { return ok(); },
    .modifyInstance = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                         const CMPIObjectPath *, const CMPIInstance *,
                         const char **) { return ok(); },
    .deleteInstance = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                         const CMPIObjectPath *) { return ok(); },
    .execQuery = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                    const CMPIObjectPath *, const char *, const char *) { return ok(); },
};
CMPIInstanceMI instance_mi{nullptr, &instance_table};

[[maybe_unused]] CMPIStatus refusal(const CMPIBroker *broker) {
    return {CMPI_RC_ERR_ACCESS_DENIED, broker->eft->newString(broker, "not today", nullptr)};
}

}  // namespace

EXPORT CMPIInstanceMI *Test_Provider_Create_InstanceMI(const CMPIBroker *, const CMPIContext *,
                                                       CMPIStatus *) {
    ++made;
    return &instance_mi;
}

#ifdef VELK_TEST_GENERIC
EXPORT CMPIMethodMI *_Generic_Create_MethodMI(const CMPIBroker *, const CMPIContext *, const char *,
                                              CMPIStatus *) {
    made += 100;
    return &method_mi;
}
#endif

#ifndef VELK_TEST_NO_METHOD
EXPORT CMPIMethodMI *Test_Provider_Create_MethodMI(const CMPIBroker *broker, const CMPIContext *,
                                                   CMPIStatus *status) {
    ++made;
#ifdef VELK_TEST_REFUSES
    *status = refusal(broker);
#endif
#ifdef VELK_TEST_UNRESOLVED
    made += static_cast<CMPIUint32>(velk_test_nobody_defines_this());
#endif
    static_cast<void>(broker);
    static_cast<void>(status);
    return &method_mi;
}
#endif
