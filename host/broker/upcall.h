// One request that a provider makes of the broker: checks, fault, trace, dispatch, answer.
#pragma once

#include "host/broker/dispatch.h"

#include <functional>
#include <string>

namespace velkhost::broker {

// What an instance object holds; nothing for a null pointer.
cim::Instance instance_of(const CMPIInstance *instance);

class UpCall {
  public:
    using Work = std::function<ObjectsReply(Dispatcher &, const cim::ObjectPath &)>;

    // `detail` is the method, the association class or the query, where there is one.
    UpCall(const CMPIBroker *broker, const CMPIContext *context, const CMPIObjectPath *path,
           const char *operation, std::string detail = "");

    // Does the work and answers with all objects found, with the first, or with the status alone.
    CMPIEnumeration *enumeration(CMPIStatus *status, const Work &work);
    CMPIData first(CMPIStatus *status, const Work &work);
    CMPIStatus status(const Work &work);

    // The method named by `detail`; `out` receives its output arguments.
    CMPIData invoke(const CMPIArgs *in, CMPIArgs *out, CMPIStatus *status);

  private:
    // What keeps the request from being made at all.
    [[nodiscard]] Status refusal() const;
    [[nodiscard]] Caller caller() const;
    [[nodiscard]] Making making() const;
    [[nodiscard]] std::string subject() const;
    ObjectsReply objects(const Work &work);

    template <class Reply, class Answer>
    Reply traced(const std::string &arguments, Answer answer);

    Core &core_;
    const CMPIContext *context_;
    const char *operation_;
    std::string detail_;
    std::optional<cim::ObjectPath> path_;
};

}  // namespace velkhost::broker
