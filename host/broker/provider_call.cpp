#include "host/broker/provider_call.h"

#include "host/broker/context.h"

#include <utility>

namespace velkhost::broker {
namespace {

ContextPayload entries_for(const Caller &caller, const std::string &parameters) {
    ContextPayload entries;
    set_entry(entries, "CMPIInvocationFlags", cim::Value::uint32(caller.flags));
    set_entry(entries, "CMPIPrincipal", cim::Value::string(caller.principal));
    set_entry(entries, "CMPISessionId", cim::Value::uint32(caller.session));
    if (!parameters.empty()) {
        set_entry(entries, "sfcbProviderParameters", cim::Value::string(parameters));
    }
    return entries;
}

}  // namespace

template <class Face>
Face *ProviderCall::argument(std::string subject, typename Traits<Face>::Payload payload) {
    auto *object = make<Face>(core_, Custody::kCallArgument,
                              {"a provider call", std::move(subject)}, std::move(payload));
    arguments_.add(object->tag);
    return object;
}

ProviderCall::ProviderCall(Core &core, const Caller &caller, const std::string &parameters,
                           ResultSink &sink)
    : core_(core),
      frame_(*core.ledger),
      context_(argument<CMPIContext>("context", entries_for(caller, parameters))),
      result_(argument<CMPIResult>("result", &sink)) {}

const CMPIObjectPath *ProviderCall::path(const cim::ObjectPath &path) {
    return argument<CMPIObjectPath>(path.class_name, path);
}

const CMPIInstance *ProviderCall::instance(const cim::Instance &instance) {
    return argument<CMPIInstance>(instance.path.class_name, {instance, std::nullopt});
}

CMPIArgs *ProviderCall::args(const cim::NamedValues &values) {
    return argument<CMPIArgs>("arguments", values);
}

const char **ProviderCall::names(const NameList &list) {
    if (!list) {
        return nullptr;
    }
    name_texts_ = list;
    for (const std::string &name : *name_texts_) {
        names_.push_back(name.c_str());
    }
    names_.push_back(nullptr);
    return names_.data();
}

cim::NamedValues ProviderCall::contents(const CMPIArgs *args) {
    const auto *object = open(args, "the broker");
    return object != nullptr ? *object->payload : cim::NamedValues{};
}

}  // namespace velkhost::broker
