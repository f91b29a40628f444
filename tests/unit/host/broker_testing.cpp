#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

constexpr CMPIStatus kNotSupported{CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

template <class Interface>
ScriptedProvider &script(Interface *interface) {
    return *static_cast<ScriptedProvider *>(const_cast<void *>(interface->hdl));
}

template <class Function, class... Arguments>
CMPIStatus run(const Function &function, Arguments... arguments) {
    return function ? function(arguments...) : kNotSupported;
}

CMPIStatus run_cleanup(const ScriptedProvider &provider, const char *kind,
                       CMPIBoolean terminating) {
    return {provider.cleanup ? provider.cleanup(kind, terminating != 0) : CMPI_RC_OK, nullptr};
}

CMPIMethodMIFT method_table{
    .ftVersion = 200,
    .miVersion = 200,
    .miName = "method",
    .cleanup = [](CMPIMethodMI *mi, const CMPIContext *,
                  CMPIBoolean end) { return run_cleanup(script(mi), "method", end); },
    .invokeMethod =
        [](CMPIMethodMI *mi, const CMPIContext *context, const CMPIResult *result,
           const CMPIObjectPath *path, const char *method, const CMPIArgs *in, CMPIArgs *out) {
            return run(script(mi).invoke, context, result, path, method, in, out);
        },
};

CMPIInstanceMIFT instance_table{
    .ftVersion = 200,
    .miVersion = 200,
    .miName = "instance",
    .cleanup = [](CMPIInstanceMI *mi, const CMPIContext *,
                  CMPIBoolean end) { return run_cleanup(script(mi), "instance", end); },
    .enumerateInstanceNames =
        [](CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
           const CMPIObjectPath *path) {
            return run(script(mi).enumerate_names, context, result, path);
        },
    .enumerateInstances =
        [](CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
           const CMPIObjectPath *path,
           const char **) { return run(script(mi).enumerate, context, result, path); },
    .getInstance = [](CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
                      const CMPIObjectPath *path,
                      const char **) { return run(script(mi).get, context, result, path); },
    .createInstance =
        [](CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
           const CMPIObjectPath *path, const CMPIInstance *instance) {
            return run(script(mi).create, context, result, path, instance);
        },
    .modifyInstance =
        [](CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
           const CMPIObjectPath *path, const CMPIInstance *instance,
           const char **) { return run(script(mi).modify, context, result, path, instance); },
    .deleteInstance =
        [](CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
           const CMPIObjectPath *path) { return run(script(mi).remove, context, result, path); },
    .execQuery = [](CMPIInstanceMI *mi, const CMPIContext *context, const CMPIResult *result,
                    const CMPIObjectPath *path, const char *,
                    const char *) { return run(script(mi).query, context, result, path); },
};

CMPIAssociationMIFT association_table{
    .ftVersion = 200,
    .miVersion = 200,
    .miName = "association",
    .cleanup = [](CMPIAssociationMI *mi, const CMPIContext *,
                  CMPIBoolean end) { return run_cleanup(script(mi), "association", end); },
    .associators =
        [](CMPIAssociationMI *mi, const CMPIContext *, const CMPIResult *result,
           const CMPIObjectPath *path, const char *association, const char *result_class,
           const char *, const char *, const char **) {
            return run(script(mi).associators, result, path, association, result_class);
        },
    .associatorNames =
        [](CMPIAssociationMI *mi, const CMPIContext *, const CMPIResult *result,
           const CMPIObjectPath *path, const char *association, const char *result_class,
           const char *, const char *) {
            return run(script(mi).associators, result, path, association, result_class);
        },
    .references =
        [](CMPIAssociationMI *mi, const CMPIContext *, const CMPIResult *result,
           const CMPIObjectPath *path, const char *result_class, const char *role,
           const char **) { return run(script(mi).references, result, path, result_class, role); },
    .referenceNames =
        [](CMPIAssociationMI *mi, const CMPIContext *, const CMPIResult *result,
           const CMPIObjectPath *path, const char *result_class, const char *role) {
            return run(script(mi).references, result, path, result_class, role);
        },
};

}  // namespace

ManagementInterfaces ScriptedProvider::methods() {
    method_mi_.ft = &method_table;
    ManagementInterfaces interfaces;
    interfaces.method = &method_mi_;
    return interfaces;
}

ManagementInterfaces ScriptedProvider::instances() {
    instance_mi_.ft = &instance_table;
    ManagementInterfaces interfaces;
    interfaces.instance = &instance_mi_;
    return interfaces;
}

ManagementInterfaces ScriptedProvider::all() {
    association_mi_.ft = &association_table;
    return {.instance = instances().instance,
            .association = &association_mi_,
            .method = methods().method,
            .property = nullptr,
            .indication = nullptr};
}

}  // namespace velkhost::broker::testing
