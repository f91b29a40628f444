#include "host/broker/upcall.h"

#include "host/broker/context.h"
#include "host/broker/reply_text.h"

#include <utility>

namespace velkhost::broker {
namespace {

std::optional<cim::ObjectPath> path_of(const CMPIObjectPath *path) {
    const auto *object = open(path, "an up-call");
    return object != nullptr ? std::optional(*object->payload) : std::nullopt;
}

// What invokeMethod returns when it has no value to return.
CMPIData no_value(bool failed) {
    CMPIData data{};
    data.state = failed ? CMPI_nullValue : CMPI_goodValue;
    return data;
}

}  // namespace

cim::Instance instance_of(const CMPIInstance *instance) {
    const auto *object = open(instance, "an up-call");
    return object != nullptr ? object->payload->instance : cim::Instance{};
}

UpCall::UpCall(const CMPIBroker *broker, const CMPIContext *context, const CMPIObjectPath *path,
               const char *operation, std::string detail)
    : core_(Core::of(broker)),
      context_(context),
      operation_(operation),
      detail_(std::move(detail)),
      path_(path_of(path)) {}

Making UpCall::making() const {
    return {core_, Custody::kTracked, {operation_, subject()}, nullptr};
}

std::string UpCall::subject() const {
    const bool method = std::string_view(operation_) == "invokeMethod";
    const std::string class_name = path_ ? path_->class_name : "";
    return method ? class_name + '.' + detail_ : class_name;
}

// A real broker reads the context without a look, and its principal without a check.
Status UpCall::refusal() const {
    const auto *context = open(context_, operation_);
    if (context == nullptr) {
        core_.ledger->note(FindingKind::kUnsafeCall,
                           std::string(operation_) + " was called without a usable context");
        return {CMPI_RC_ERR_FAILED, "no context"};
    }
    if (find_entry(*context->payload, "CMPIPrincipal") == nullptr) {
        core_.ledger->note(FindingKind::kUnsafeCall, std::string(operation_) +
                                                         " was called with a context that has no "
                                                         "CMPIPrincipal");
    }
    if (!path_) {
        return {CMPI_RC_ERR_FAILED, "no object path"};
    }
    if (const auto fault = core_.faults.ask(std::string("broker.") + operation_, subject())) {
        return {static_cast<CMPIrc>(fault->code), fault->message};
    }
    return {};
}

Caller UpCall::caller() const {
    Caller caller;
    const auto *context = open(context_, operation_);
    if (const auto *principal = find_entry(*context->payload, "CMPIPrincipal")) {
        caller.principal = principal->as_text().value_or("");
    }
    if (const auto *session = find_entry(*context->payload, "CMPISessionId")) {
        caller.session = static_cast<CMPIUint32>(session->as_unsigned().value_or(0));
    }
    return caller;
}

template <class Reply, class Answer>
Reply UpCall::traced(const std::string &arguments, Answer answer) {
    const cim::ObjectPath target = path_.value_or(cim::ObjectPath{});
    const std::uint64_t number = core_.trace.begin({.side = TraceEntry::Side::kUpCall,
                                                    .operation = operation_,
                                                    .name_space = target.name_space,
                                                    .class_name = target.class_name,
                                                    .method = detail_,
                                                    .arguments = arguments,
                                                    .status = {},
                                                    .result = {}});
    Reply reply;
    reply.status = refusal();
    if (reply.status.ok()) {
        Dispatcher dispatcher(core_, caller());
        reply = answer(dispatcher, target);
    }
    core_.trace.finish(number, reply.status, result_text(reply));
    return reply;
}

ObjectsReply UpCall::objects(const Work &work) {
    return traced<ObjectsReply>(path_ ? to_text(path_->keys) : "", work);
}

CMPIEnumeration *UpCall::enumeration(CMPIStatus *status, const Work &work) {
    const ObjectsReply reply = objects(work);
    to_cmpi(core_, reply.status, status);
    if (!reply.status.ok()) {
        return nullptr;
    }
    const CMPIType type = reply.objects.empty() ? CMPI_instance : reply.objects.front().type();
    return make_enumeration(making(), cim::Value::array(type, reply.objects));
}

CMPIData UpCall::first(CMPIStatus *status, const Work &work) {
    const ObjectsReply reply = objects(work);
    to_cmpi(core_, reply.status, status);
    return reply.status.ok() && !reply.objects.empty() ? to_data(making(), reply.objects.front())
                                                       : no_value(true);
}

CMPIStatus UpCall::status(const Work &work) {
    return to_cmpi(core_, objects(work).status);
}

CMPIData UpCall::invoke(const CMPIArgs *in, CMPIArgs *out, CMPIStatus *status) {
    const cim::NamedValues arguments = ProviderCall::contents(in);
    const auto reply = traced<MethodReply>(
        to_text(arguments), [&](Dispatcher &dispatcher, const cim::ObjectPath &target) {
            return dispatcher.invoke(target, detail_, arguments);
        });
    to_cmpi(core_, reply.status, status);
    if (auto *receiver = open(out, operation_)) {
        for (const cim::NamedValue &item : reply.out) {
            receiver->payload->set(item.name, item.value);
        }
    }
    if (!reply.return_value) {
        return no_value(!reply.status.ok());
    }
    // Texts come back as chars, and what they point to is gone.
    const cim::Value &value = *reply.return_value;
    const bool text = value.type() == CMPI_string;
    return to_data(making(), text ? cim::Value{CMPI_chars, value.content()} : value);
}

}  // namespace velkhost::broker
