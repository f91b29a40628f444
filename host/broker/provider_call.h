// One call of a provider's function: a frame in the ledger, and the objects that go in as
// arguments, which end with the call.
#pragma once

#include "host/broker/convert.h"

#include <string>
#include <vector>

namespace velkhost::broker {

// In whose name a request runs.
struct Caller {
    std::string principal;
    CMPIFlags flags = 0;
    CMPIUint32 session = 0;
    bool is_client = false;  // else an up-call
};

class ProviderCall {
  public:
    // `sink` receives the results; `parameters` are those of the provider's registration.
    ProviderCall(Core &core, const Caller &caller, const std::string &parameters, ResultSink &sink);

    [[nodiscard]] const CMPIContext *context() const { return context_; }
    [[nodiscard]] const CMPIResult *result() const { return result_; }

    // Arguments made from neutral values. They and their contents end with the call.
    const CMPIObjectPath *path(const cim::ObjectPath &path);
    const CMPIInstance *instance(const cim::Instance &instance);
    CMPIArgs *args(const cim::NamedValues &values);
    const char **names(const NameList &list);

    // What an argument of args() holds now.
    static cim::NamedValues contents(const CMPIArgs *args);

  private:
    template <class Face>
    Face *argument(std::string subject, typename Traits<Face>::Payload payload);

    Core &core_;
    FrameScope frame_;
    Parts arguments_;
    CMPIContext *context_;
    CMPIResult *result_;
    NameList name_texts_;
    std::vector<const char *> names_;
};

}  // namespace velkhost::broker
