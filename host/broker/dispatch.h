// Finds the providers that a request is for and calls them; neutral values in and out.
#pragma once

#include "host/broker/provider_call.h"
#include "host/broker/replies.h"

#include <functional>
#include <string>
#include <vector>

namespace velkhost::broker {

// Instances or paths as values, in the order in which the providers returned them.
struct ObjectsReply {
    Status status;
    cim::Value::Array objects;
};

// What an association request asks for. Empty texts stand for any.
struct AssociationQuery {
    std::string association_class;  // of associators; unused by references
    std::string result_class;
    std::string role;
    std::string result_role;  // of associators
    NameList properties;
};

enum class Form { kNames, kInstances };

class Dispatcher {
  public:
    Dispatcher(Core &core, Caller caller);

    ObjectsReply enumerate(Form form, const cim::ObjectPath &path, const NameList &properties);
    ObjectsReply get_instance(const cim::ObjectPath &path, const NameList &properties);
    ObjectsReply create_instance(const cim::ObjectPath &path, const cim::Instance &instance);
    ObjectsReply modify_instance(const cim::ObjectPath &path, const cim::Instance &instance,
                                 const NameList &properties);
    ObjectsReply delete_instance(const cim::ObjectPath &path);
    ObjectsReply exec_query(const cim::ObjectPath &path, const std::string &query,
                            const std::string &language);
    ObjectsReply associators(Form form, const cim::ObjectPath &path, const AssociationQuery &query);
    ObjectsReply references(Form form, const cim::ObjectPath &path, const AssociationQuery &query);
    MethodReply invoke(const cim::ObjectPath &path, const std::string &method,
                       const cim::NamedValues &in);

  private:
    // A provider and the path that it is asked with.
    struct Target {
        ProviderPointer provider;
        cim::ObjectPath path;
    };
    using Work = std::function<CMPIStatus(ProviderCall &, const ManagementInterfaces &)>;
    using TargetWork = std::function<CMPIStatus(ProviderCall &, const ManagementInterfaces &,
                                                const cim::ObjectPath &)>;

    // 3 for an unknown namespace, 5 for an unknown class.
    [[nodiscard]] Status check(const cim::ObjectPath &path) const;
    // The class of the path and its ancestors, nearest first.
    [[nodiscard]] std::vector<std::string> lineage(const cim::ObjectPath &path) const;
    [[nodiscard]] std::vector<Target> instance_targets(const cim::ObjectPath &path) const;
    [[nodiscard]] std::vector<Target> association_targets(const cim::ObjectPath &path,
                                                          const std::string &class_name) const;
    [[nodiscard]] ProviderPointer method_provider(const cim::ObjectPath &path) const;

    ObjectsReply ask(Provider &provider, ResultSink &sink, const Work &work);
    ObjectsReply ask_all(const std::vector<Target> &targets, const TargetWork &work);
    // The one provider of the class; `absent` is the answer where there is none.
    ObjectsReply ask_owner(const cim::ObjectPath &path, const Status &absent, const Work &work);

    Core &core_;
    Caller caller_;
};

}  // namespace velkhost::broker
