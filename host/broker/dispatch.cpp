#include "host/broker/dispatch.h"

#include "host/cim/names.h"

#include <algorithm>
#include <utility>

namespace velkhost::broker {
namespace {

Status no_provider() {
    return {CMPI_RC_ERR_FAILED, "Provider not found or not loadable"};
}
Status not_found_here() {
    return {CMPI_RC_ERR_NOT_FOUND, "The requested object could not be found"};
}
Status not_supported() {
    return {CMPI_RC_ERR_NOT_SUPPORTED, "The requested operation is not supported"};
}

// Association requests give "any" as a null pointer.
const char *or_any(const std::string &text) {
    return text.empty() ? nullptr : text.c_str();
}

ObjectsReply at_most_one(ObjectsReply reply) {
    if (reply.status.ok() && reply.objects.empty()) {
        reply.status = not_found_here();
    }
    return reply;
}

}  // namespace

Dispatcher::Dispatcher(Core &core, Caller caller) : core_(core), caller_(std::move(caller)) {}

// -- Who is asked --

Status Dispatcher::check(const cim::ObjectPath &path) const {
    if (!core_.repository.has_namespace(path.name_space)) {
        return {CMPI_RC_ERR_INVALID_NAMESPACE, "Invalid namespace"};
    }
    if (core_.repository.find_class(path) == nullptr) {
        return {CMPI_RC_ERR_INVALID_CLASS, "Class not found"};
    }
    return {};
}

std::vector<std::string> Dispatcher::lineage(const cim::ObjectPath &path) const {
    std::vector<std::string> names{path.class_name};
    if (const ClassPointer declared = core_.repository.find_class(path)) {
        names.insert(names.end(), declared->ancestors.begin(), declared->ancestors.end());
    }
    return names;
}

// The class's own provider, or that of its nearest ancestor; then those of its subclasses, each
// asked with the class that it is registered for.
std::vector<Dispatcher::Target> Dispatcher::instance_targets(const cim::ObjectPath &path) const {
    std::vector<Target> targets;
    if (auto own = core_.providers.find(ProviderKind::kInstance, path.name_space, lineage(path))) {
        targets.push_back({own, path});
    }
    for (const ClassPointer &declared :
         core_.repository.classes(path.name_space, path.class_name)) {
        const std::string &name = declared->declaration.name;
        if (cim::same_name(name, path.class_name)) {
            continue;
        }
        if (auto other = core_.providers.find(ProviderKind::kInstance, path.name_space, {name})) {
            cim::ObjectPath subclass = path;
            subclass.class_name = name;
            targets.push_back({other, subclass});
        }
    }
    return targets;
}

// Each provider once: those of the association class and its subclasses, or of all associations.
std::vector<Dispatcher::Target> Dispatcher::association_targets(
    const cim::ObjectPath &path, const std::string &class_name) const {
    std::vector<Target> targets;
    for (const auto &row : core_.providers.rows(ProviderKind::kAssociation, path.name_space)) {
        const bool wanted = class_name.empty() ||
                            core_.repository.is_a(path.name_space, row.class_name, class_name);
        const bool known = std::any_of(targets.begin(), targets.end(), [&row](const Target &t) {
            return t.provider == row.provider;
        });
        if (wanted && !known) {
            targets.push_back({row.provider, path});
        }
    }
    return targets;
}

// A client's method call reaches the provider of that class whatever its namespace is.
ProviderPointer Dispatcher::method_provider(const cim::ObjectPath &path) const {
    auto provider = core_.providers.find(ProviderKind::kMethod, path.name_space, lineage(path));
    if (provider == nullptr && caller_.is_client) {
        provider = core_.providers.find(ProviderKind::kMethod, {}, lineage(path));
    }
    return provider;
}

// -- How they are asked --

ObjectsReply Dispatcher::ask(Provider &provider, ResultSink &sink, const Work &work) {
    const Provider::Loaded loaded = provider.load(core_);
    if (!loaded.status.ok()) {
        return {loaded.status, {}};
    }
    ProviderCall call(core_, caller_, provider.registration().parameters, sink);
    const Status status = from_cmpi(work(call, loaded.interfaces));
    return {status, status.ok() ? std::move(sink.values) : cim::Value::Array{}};
}

ObjectsReply Dispatcher::ask_all(const std::vector<Target> &targets, const TargetWork &work) {
    ObjectsReply all;
    for (const Target &target : targets) {
        ResultSink sink;
        ObjectsReply reply = ask(*target.provider, sink,
                                 [&](ProviderCall &call, const ManagementInterfaces &interfaces) {
                                     return work(call, interfaces, target.path);
                                 });
        if (!reply.status.ok()) {
            return reply;
        }
        std::move(reply.objects.begin(), reply.objects.end(), std::back_inserter(all.objects));
    }
    return all;
}

ObjectsReply Dispatcher::ask_owner(const cim::ObjectPath &path, const Status &absent,
                                   const Work &work) {
    if (const Status status = check(path); !status.ok()) {
        return {status, {}};
    }
    const auto provider =
        core_.providers.find(ProviderKind::kInstance, path.name_space, lineage(path));
    if (provider == nullptr) {
        return {absent, {}};
    }
    ResultSink sink;
    return ask(*provider, sink, work);
}

// -- Requests --

ObjectsReply Dispatcher::enumerate(Form form, const cim::ObjectPath &path,
                                   const NameList &properties) {
    if (const Status status = check(path); !status.ok()) {
        return {status, {}};
    }
    return ask_all(instance_targets(path), [&](ProviderCall &call, const auto &interfaces,
                                               const cim::ObjectPath &target) {
        CMPIInstanceMI *mi = interfaces.instance;
        return form == Form::kNames
                   ? mi->ft->enumerateInstanceNames(mi, call.context(), call.result(),
                                                    call.path(target))
                   : mi->ft->enumerateInstances(mi, call.context(), call.result(),
                                                call.path(target), call.names(properties));
    });
}

ObjectsReply Dispatcher::get_instance(const cim::ObjectPath &path, const NameList &properties) {
    return at_most_one(
        ask_owner(path, not_found_here(), [&](ProviderCall &call, const auto &interfaces) {
            CMPIInstanceMI *mi = interfaces.instance;
            return mi->ft->getInstance(mi, call.context(), call.result(), call.path(path),
                                       call.names(properties));
        }));
}

ObjectsReply Dispatcher::create_instance(const cim::ObjectPath &path,
                                         const cim::Instance &instance) {
    return ask_owner(path, not_supported(), [&](ProviderCall &call, const auto &interfaces) {
        CMPIInstanceMI *mi = interfaces.instance;
        return mi->ft->createInstance(mi, call.context(), call.result(), call.path(path),
                                      call.instance(instance));
    });
}

ObjectsReply Dispatcher::modify_instance(const cim::ObjectPath &path, const cim::Instance &instance,
                                         const NameList &properties) {
    return ask_owner(path, not_supported(), [&](ProviderCall &call, const auto &interfaces) {
        CMPIInstanceMI *mi = interfaces.instance;
        return mi->ft->modifyInstance(mi, call.context(), call.result(), call.path(path),
                                      call.instance(instance), call.names(properties));
    });
}

ObjectsReply Dispatcher::delete_instance(const cim::ObjectPath &path) {
    return ask_owner(path, not_supported(), [&](ProviderCall &call, const auto &interfaces) {
        CMPIInstanceMI *mi = interfaces.instance;
        return mi->ft->deleteInstance(mi, call.context(), call.result(), call.path(path));
    });
}

ObjectsReply Dispatcher::exec_query(const cim::ObjectPath &path, const std::string &query,
                                    const std::string &language) {
    return ask_owner(path, not_supported(), [&](ProviderCall &call, const auto &interfaces) {
        CMPIInstanceMI *mi = interfaces.instance;
        return mi->ft->execQuery(mi, call.context(), call.result(), call.path(path), query.c_str(),
                                 language.c_str());
    });
}

ObjectsReply Dispatcher::associators(Form form, const cim::ObjectPath &path,
                                     const AssociationQuery &query) {
    if (const Status status = check(path); !status.ok()) {
        return {status, {}};
    }
    const auto targets = association_targets(path, query.association_class);
    if (targets.empty()) {
        return {{CMPI_RC_ERR_NOT_FOUND, no_provider().message}, {}};
    }
    return ask_all(targets, [&](ProviderCall &call, const auto &interfaces, const auto &target) {
        CMPIAssociationMI *mi = interfaces.association;
        const char *association = or_any(query.association_class);
        const char *result = or_any(query.result_class);
        const char *role = or_any(query.role);
        const char *result_role = or_any(query.result_role);
        return form == Form::kNames
                   ? mi->ft->associatorNames(mi, call.context(), call.result(), call.path(target),
                                             association, result, role, result_role)
                   : mi->ft->associators(mi, call.context(), call.result(), call.path(target),
                                         association, result, role, result_role,
                                         call.names(query.properties));
    });
}

ObjectsReply Dispatcher::references(Form form, const cim::ObjectPath &path,
                                    const AssociationQuery &query) {
    if (const Status status = check(path); !status.ok()) {
        return {status, {}};
    }
    const auto targets = association_targets(path, query.result_class);
    if (targets.empty()) {
        return {{CMPI_RC_ERR_NOT_FOUND, no_provider().message}, {}};
    }
    return ask_all(targets, [&](ProviderCall &call, const auto &interfaces, const auto &target) {
        CMPIAssociationMI *mi = interfaces.association;
        const char *result = or_any(query.result_class);
        const char *role = or_any(query.role);
        return form == Form::kNames
                   ? mi->ft->referenceNames(mi, call.context(), call.result(), call.path(target),
                                            result, role)
                   : mi->ft->references(mi, call.context(), call.result(), call.path(target),
                                        result, role, call.names(query.properties));
    });
}

MethodReply Dispatcher::invoke(const cim::ObjectPath &path, const std::string &method,
                               const cim::NamedValues &in) {
    MethodReply reply;
    const ProviderPointer provider = method_provider(path);
    if (provider == nullptr || !caller_.is_client) {
        const bool known = core_.repository.find_class(path) != nullptr;
        reply.status = known ? no_provider() : Status{CMPI_RC_ERR_INVALID_CLASS, "Class not found"};
        if (provider == nullptr || !known) {
            return reply;
        }
    }
    ResultSink sink;
    sink.for_method = true;
    const ObjectsReply answer =
        ask(*provider, sink, [&](ProviderCall &call, const ManagementInterfaces &interfaces) {
            CMPIMethodMI *mi = interfaces.method;
            CMPIArgs *out = call.args({});
            const CMPIStatus status =
                mi->ft->invokeMethod(mi, call.context(), call.result(), call.path(path),
                                     method.c_str(), call.args(in), out);
            reply.out = ProviderCall::contents(out);
            return status;
        });
    reply.status = answer.status;
    reply.return_done = sink.done;
    if (!reply.status.ok()) {
        reply.out = {};
    } else if (!answer.objects.empty()) {
        reply.return_value = answer.objects.front();
    }
    return reply;
}

}  // namespace velkhost::broker
