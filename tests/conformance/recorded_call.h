// Calls of the library's method entry whose result handle is watched: a broker's reply hides the
// return value of a refused call, and brokers always pass input arguments.
#pragma once

#include <cmpi/cmpift.h>

#include <string>
#include <vector>

#include "tests/conformance/provider_host.h"

namespace velktest {

struct RecordedReply {
    velkhost::broker::MethodReply reply;
    // "returnData uint32 4096", "returnDone", in the order in which they came.
    std::vector<std::string> sent;
};

// Stands between a client and the library as a provider of its own, so that arguments, context and
// output go through the broker as ever. One at a time.
class RecordedCalls {
  public:
    explicit RecordedCalls(ProviderHost &host);
    ~RecordedCalls();
    RecordedCalls(const RecordedCalls &) = delete;
    RecordedCalls &operator=(const RecordedCalls &) = delete;

    // The library is asked for `method` on the service.
    RecordedReply call(const std::string &method, const cim::NamedValues &in);

    // The same without input arguments.
    RecordedReply call_without_arguments(const std::string &method);

  private:
    static CMPIStatus relay(CMPIMethodMI *mi, const CMPIContext *context, const CMPIResult *result,
                            const CMPIObjectPath *path, const char *method, const CMPIArgs *in,
                            CMPIArgs *out);
    static CMPIStatus return_data(const CMPIResult *result, const CMPIValue *value, CMPIType type);
    static CMPIStatus return_done(const CMPIResult *result);

    // What a recording result handle stands for.
    struct Recording {
        const CMPIResult *real;
        std::vector<std::string> sent;
    };

    ProviderHost &host_;
    CMPIMethodMIFT table_{};
    CMPIMethodMI mi_{this, &table_};
    CMPIMethodMI *library_;
    bool with_arguments_ = true;
    std::vector<std::string> sent_;
};

}  // namespace velktest
