// The requests that clients make of a broker.
#include "host/broker/broker.h"
#include "host/broker/dispatch.h"
#include "host/broker/reply_text.h"
#include "host/broker/threads.h"

#include <utility>

namespace velkhost::broker {
namespace {

// What a request is, for the trace.
struct Request {
    const char *operation;
    const cim::ObjectPath &path;
    std::string method;
    std::string arguments;
};

// Runs one request from its entry in the trace to its end.
template <class Work>
auto run(Core &core, const RequestOptions &options, const Request &request, Work work) {
    const std::uint64_t number = core.trace.begin({.side = TraceEntry::Side::kClient,
                                                   .operation = request.operation,
                                                   .name_space = request.path.name_space,
                                                   .class_name = request.path.class_name,
                                                   .method = request.method,
                                                   .arguments = request.arguments,
                                                   .status = {},
                                                   .result = {}});
    Dispatcher dispatcher(core, {options.principal, options.flags, ++core.last_session, true});
    decltype(work(dispatcher)) reply;
    if (options.thread == RequestThread::kFresh) {
        run_on_fresh_thread([&] { reply = work(dispatcher); });
    } else {
        reply = work(dispatcher);
    }
    core.trace.finish(number, reply.status, result_text(reply));
    return reply;
}

PathsReply paths_of(const ObjectsReply &reply) {
    PathsReply paths{reply.status, {}};
    for (const cim::Value &object : reply.objects) {
        if (const cim::ObjectPath *path = object.as_path()) {
            paths.paths.push_back(*path);
        }
    }
    return paths;
}

InstancesReply instances_of(const ObjectsReply &reply) {
    InstancesReply instances{reply.status, {}};
    for (const cim::Value &object : reply.objects) {
        if (const cim::Instance *instance = object.as_instance()) {
            instances.instances.push_back(*instance);
        }
    }
    return instances;
}

template <class Object>
std::optional<Object> first_of(const std::vector<Object> &objects) {
    return objects.empty() ? std::nullopt : std::optional(objects.front());
}

std::string keys_text(const cim::ObjectPath &path) {
    return to_text(path.keys);
}

AssociationQuery query_of(const AssociationFilter &filter) {
    return {filter.association_class, filter.result_class, filter.role, filter.result_role,
            filter.properties};
}

}  // namespace

PathsReply Broker::enumerate_instance_names(const cim::ObjectPath &class_path,
                                            const RequestOptions &options) {
    return paths_of(run(*core_, options, {"enumerateInstanceNames", class_path, "", ""},
                        [&](Dispatcher &dispatcher) {
                            return dispatcher.enumerate(Form::kNames, class_path, {});
                        }));
}

InstancesReply Broker::enumerate_instances(const cim::ObjectPath &class_path,
                                           const PropertyList &properties,
                                           const RequestOptions &options) {
    return instances_of(run(
        *core_, options, {"enumerateInstances", class_path, "", ""}, [&](Dispatcher &dispatcher) {
            return dispatcher.enumerate(Form::kInstances, class_path, properties);
        }));
}

InstanceReply Broker::get_instance(const cim::ObjectPath &path, const PropertyList &properties,
                                   const RequestOptions &options) {
    const InstancesReply reply = instances_of(
        run(*core_, options, {"getInstance", path, "", keys_text(path)},
            [&](Dispatcher &dispatcher) { return dispatcher.get_instance(path, properties); }));
    return {reply.status, first_of(reply.instances)};
}

PathReply Broker::create_instance(const cim::Instance &instance, const RequestOptions &options) {
    const PathsReply reply = paths_of(
        run(*core_, options, {"createInstance", instance.path, "", to_text(instance.properties)},
            [&](Dispatcher &dispatcher) {
                return dispatcher.create_instance(instance.path, instance);
            }));
    return {reply.status, first_of(reply.paths)};
}

Status Broker::modify_instance(const cim::Instance &instance, const PropertyList &properties,
                               const RequestOptions &options) {
    return run(*core_, options, {"modifyInstance", instance.path, "", to_text(instance.properties)},
               [&](Dispatcher &dispatcher) {
                   return dispatcher.modify_instance(instance.path, instance, properties);
               })
        .status;
}

Status Broker::delete_instance(const cim::ObjectPath &path, const RequestOptions &options) {
    return run(*core_, options, {"deleteInstance", path, "", keys_text(path)},
               [&](Dispatcher &dispatcher) { return dispatcher.delete_instance(path); })
        .status;
}

InstancesReply Broker::exec_query(const cim::ObjectPath &class_path, const std::string &query,
                                  const std::string &language, const RequestOptions &options) {
    return instances_of(run(*core_, options, {"execQuery", class_path, query, language},
                            [&](Dispatcher &dispatcher) {
                                return dispatcher.exec_query(class_path, query, language);
                            }));
}

InstancesReply Broker::associators(const cim::ObjectPath &path, const AssociationFilter &filter,
                                   const RequestOptions &options) {
    return instances_of(
        run(*core_, options, {"associators", path, filter.association_class, keys_text(path)},
            [&](Dispatcher &dispatcher) {
                return dispatcher.associators(Form::kInstances, path, query_of(filter));
            }));
}

PathsReply Broker::associator_names(const cim::ObjectPath &path, const AssociationFilter &filter,
                                    const RequestOptions &options) {
    return paths_of(run(*core_, options,
                        {"associatorNames", path, filter.association_class, keys_text(path)},
                        [&](Dispatcher &dispatcher) {
                            return dispatcher.associators(Form::kNames, path, query_of(filter));
                        }));
}

InstancesReply Broker::references(const cim::ObjectPath &path, const AssociationFilter &filter,
                                  const RequestOptions &options) {
    return instances_of(
        run(*core_, options, {"references", path, filter.result_class, keys_text(path)},
            [&](Dispatcher &dispatcher) {
                return dispatcher.references(Form::kInstances, path, query_of(filter));
            }));
}

PathsReply Broker::reference_names(const cim::ObjectPath &path, const AssociationFilter &filter,
                                   const RequestOptions &options) {
    return paths_of(run(*core_, options,
                        {"referenceNames", path, filter.result_class, keys_text(path)},
                        [&](Dispatcher &dispatcher) {
                            return dispatcher.references(Form::kNames, path, query_of(filter));
                        }));
}

MethodReply Broker::invoke_method(const cim::ObjectPath &path, const std::string &method,
                                  const cim::NamedValues &in, const RequestOptions &options) {
    RequestOptions without_flags = options;
    without_flags.flags = 0;
    return run(*core_, without_flags, {"invokeMethod", path, method, to_text(in)},
               [&](Dispatcher &dispatcher) { return dispatcher.invoke(path, method, in); });
}

}  // namespace velkhost::broker
