// The broker's own table: requests that providers make of it.
//
// A real broker of this kind holds one lock for the whole process while an up-call to another
// process runs, all of invokeMethod included; here up-calls overlap. A provider that is right under
// that lock is right here too.
#include "host/broker/upcall.h"

#include "host/broker/context.h"

namespace velkhost::broker {
namespace {

std::string text_or_empty(const char *text) {
    return text != nullptr ? text : "";
}

// -- Threads --

CMPIContext *prepare_attach_thread(const CMPIBroker *, const CMPIContext *context) {
    return clone_context(context);
}

CMPIStatus attach_thread(const CMPIBroker *, const CMPIContext *) {
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus detach_thread(const CMPIBroker *, const CMPIContext *context) {
    return release(const_cast<CMPIContext *>(context));
}

CMPIStatus deliver_indication(const CMPIBroker *, const CMPIContext *, const char *,
                              const CMPIInstance *) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

// -- Instances --

CMPIEnumeration *enumerate_instance_names(const CMPIBroker *broker, const CMPIContext *context,
                                          const CMPIObjectPath *path, CMPIStatus *status) {
    UpCall call{broker, context, path, "enumerateInstanceNames"};
    return call.enumeration(status, [](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.enumerate(Form::kNames, target, {});
    });
}

CMPIEnumeration *enumerate_instances(const CMPIBroker *broker, const CMPIContext *context,
                                     const CMPIObjectPath *path, const char **properties,
                                     CMPIStatus *status) {
    UpCall call{broker, context, path, "enumerateInstances"};
    return call.enumeration(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.enumerate(Form::kInstances, target, name_list(properties));
    });
}

CMPIInstance *get_instance(const CMPIBroker *broker, const CMPIContext *context,
                           const CMPIObjectPath *path, const char **properties,
                           CMPIStatus *status) {
    UpCall call{broker, context, path, "getInstance"};
    const CMPIData found =
        call.first(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
            return dispatcher.get_instance(target, name_list(properties));
        });
    return found.type == CMPI_instance ? found.value.inst : nullptr;
}

CMPIObjectPath *create_instance(const CMPIBroker *broker, const CMPIContext *context,
                                const CMPIObjectPath *path, const CMPIInstance *instance,
                                CMPIStatus *status) {
    UpCall call{broker, context, path, "createInstance"};
    const CMPIData made =
        call.first(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
            return dispatcher.create_instance(target, instance_of(instance));
        });
    return made.type == CMPI_ref ? made.value.ref : nullptr;
}

CMPIStatus modify_instance(const CMPIBroker *broker, const CMPIContext *context,
                           const CMPIObjectPath *path, const CMPIInstance *instance,
                           const char **properties) {
    UpCall call{broker, context, path, "modifyInstance"};
    return call.status([&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.modify_instance(target, instance_of(instance), name_list(properties));
    });
}

CMPIStatus delete_instance(const CMPIBroker *broker, const CMPIContext *context,
                           const CMPIObjectPath *path) {
    UpCall call{broker, context, path, "deleteInstance"};
    return call.status([](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.delete_instance(target);
    });
}

CMPIEnumeration *exec_query(const CMPIBroker *broker, const CMPIContext *context,
                            const CMPIObjectPath *path, const char *query, const char *language,
                            CMPIStatus *status) {
    UpCall call{broker, context, path, "execQuery", text_or_empty(query)};
    return call.enumeration(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.exec_query(target, text_or_empty(query), text_or_empty(language));
    });
}

// -- Associations --

// NOLINTNEXTLINE(readability-function-size): the standard gives the slot nine parameters
CMPIEnumeration *associators(const CMPIBroker *broker, const CMPIContext *context,
                             const CMPIObjectPath *path, const char *assoc_class,
                             const char *result_class, const char *role, const char *result_role,
                             const char **properties, CMPIStatus *status) {
    UpCall call{broker, context, path, "associators", text_or_empty(assoc_class)};
    return call.enumeration(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.associators(
            Form::kInstances, target,
            {text_or_empty(assoc_class), text_or_empty(result_class), text_or_empty(role),
             text_or_empty(result_role), name_list(properties)});
    });
}

CMPIEnumeration *associator_names(const CMPIBroker *broker, const CMPIContext *context,
                                  const CMPIObjectPath *path, const char *assoc_class,
                                  const char *result_class, const char *role,
                                  const char *result_role, CMPIStatus *status) {
    UpCall call{broker, context, path, "associatorNames", text_or_empty(assoc_class)};
    return call.enumeration(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.associators(Form::kNames, target,
                                      {text_or_empty(assoc_class),
                                       text_or_empty(result_class),
                                       text_or_empty(role),
                                       text_or_empty(result_role),
                                       {}});
    });
}

CMPIEnumeration *references(const CMPIBroker *broker, const CMPIContext *context,
                            const CMPIObjectPath *path, const char *result_class, const char *role,
                            const char **properties, CMPIStatus *status) {
    UpCall call{broker, context, path, "references", text_or_empty(result_class)};
    return call.enumeration(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.references(
            Form::kInstances, target,
            {"", text_or_empty(result_class), text_or_empty(role), "", name_list(properties)});
    });
}

CMPIEnumeration *reference_names(const CMPIBroker *broker, const CMPIContext *context,
                                 const CMPIObjectPath *path, const char *result_class,
                                 const char *role, CMPIStatus *status) {
    UpCall call{broker, context, path, "referenceNames", text_or_empty(result_class)};
    return call.enumeration(status, [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
        return dispatcher.references(
            Form::kNames, target, {"", text_or_empty(result_class), text_or_empty(role), "", {}});
    });
}

// -- Methods and single properties --

CMPIData invoke_method(const CMPIBroker *broker, const CMPIContext *context,
                       const CMPIObjectPath *path, const char *method, const CMPIArgs *in,
                       CMPIArgs *out, CMPIStatus *status) {
    UpCall call{broker, context, path, "invokeMethod", text_or_empty(method)};
    return call.invoke(in, out, status);
}

CMPIStatus set_property(const CMPIBroker *, const CMPIContext *, const CMPIObjectPath *,
                        const char *, const CMPIValue *, CMPIType) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIData get_property(const CMPIBroker *, const CMPIContext *, const CMPIObjectPath *, const char *,
                      CMPIStatus *status) {
    set_status(status, CMPI_RC_ERR_NOT_SUPPORTED);
    CMPIData data{};
    data.state = CMPI_nullValue;
    return data;
}

constexpr unsigned kCapabilities = CMPI_MB_InstanceManipulation | CMPI_MB_AssociationTraversal |
                                   CMPI_MB_QueryExecution | CMPI_MB_QueryNormalization |
                                   CMPI_MB_OSEncapsulationSupport;

}  // namespace

const CMPIBrokerFT kBrokerTable{
    .brokerCapabilities = kCapabilities,
    .brokerVersion = 0,
    .brokerName = "",  // each broker's own
    .prepareAttachThread = prepare_attach_thread,
    .attachThread = attach_thread,
    .detachThread = detach_thread,
    .deliverIndication = deliver_indication,
    .enumerateInstanceNames = enumerate_instance_names,
    .getInstance = get_instance,
    .createInstance = create_instance,
    .modifyInstance = modify_instance,
    .deleteInstance = delete_instance,
    .execQuery = exec_query,
    .enumerateInstances = enumerate_instances,
    .associators = associators,
    .associatorNames = associator_names,
    .references = references,
    .referenceNames = reference_names,
    .invokeMethod = invoke_method,
    .setProperty = set_property,
    .getProperty = get_property,
};

}  // namespace velkhost::broker
