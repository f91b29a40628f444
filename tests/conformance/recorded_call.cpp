#include "tests/conformance/recorded_call.h"

#include <cmpi/cmpimacs.h>

#include <utility>

namespace velktest {
namespace {

constexpr const char *kRelay = "TEST_Relay";

using MethodFactory = CMPIMethodMI *(const CMPIBroker *, const CMPIContext *, CMPIStatus *);

}  // namespace

RecordedCalls::RecordedCalls(ProviderHost &host) : host_(host) {
    const CMPIBroker *broker = host.broker().cmpi();
    library_ = host.function<MethodFactory>(
        "ZEB_VMWarePackageInstallationProvider_Create_MethodMI")(broker, nullptr, nullptr);
    table_.ftVersion = library_->ft->ftVersion;
    table_.miVersion = library_->ft->miVersion;
    table_.miName = "methodRelay";
    table_.cleanup = [](CMPIMethodMI *, const CMPIContext *, CMPIBoolean) {
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    table_.invokeMethod = &RecordedCalls::relay;
    cim::ClassDecl declaration;
    declaration.name = kRelay;
    host.broker().repository().add_class(ProviderHost::kNamespace, declaration);
    velkhost::broker::ManagementInterfaces interfaces;
    interfaces.method = &mi_;
    host.broker().register_provider(ProviderHost::kNamespace, kRelay, interfaces);
    host.clear_log();
}

// The broker tells its providers that it ends: this one must be there for it.
RecordedCalls::~RecordedCalls() {
    host_.broker().shutdown();
}

RecordedReply RecordedCalls::call(const std::string &method, const cim::NamedValues &in) {
    with_arguments_ = true;
    sent_.clear();
    auto reply = host_.call(method, in, kRelay);
    return {std::move(reply), sent_};
}

RecordedReply RecordedCalls::call_without_arguments(const std::string &method) {
    with_arguments_ = false;
    sent_.clear();
    auto reply = host_.call(method, {}, kRelay);
    return {std::move(reply), sent_};
}

CMPIStatus RecordedCalls::relay(CMPIMethodMI *mi, const CMPIContext *context,
                                const CMPIResult *result, const CMPIObjectPath *,
                                const char *method, const CMPIArgs *in, CMPIArgs *out) {
    auto &self = *static_cast<RecordedCalls *>(mi->hdl);
    Recording recording{result, {}};
    CMPIResultFT table{};
    table.ftVersion = result->ft->ftVersion;
    table.returnData = &RecordedCalls::return_data;
    table.returnDone = &RecordedCalls::return_done;
    const CMPIResult recorder{&recording, &table};
    CMPIObjectPath *path = CMNewObjectPath(self.host_.broker().cmpi(), ProviderHost::kNamespace,
                                           ProviderHost::kClass, nullptr);
    const CMPIStatus status = self.library_->ft->invokeMethod(
        self.library_, context, &recorder, path, method, self.with_arguments_ ? in : nullptr, out);
    self.sent_ = std::move(recording.sent);
    return status;
}

CMPIStatus RecordedCalls::return_data(const CMPIResult *result, const CMPIValue *value,
                                      CMPIType type) {
    auto &recording = *static_cast<Recording *>(result->hdl);
    const bool is_number = type == CMPI_uint32;
    recording.sent.push_back("returnData " + cim::type_name(type) +
                             (is_number ? " " + std::to_string(value->uint32) : ""));
    return CMReturnData(recording.real, value, type);
}

CMPIStatus RecordedCalls::return_done(const CMPIResult *result) {
    auto &recording = *static_cast<Recording *>(result->hdl);
    recording.sent.push_back("returnDone");
    return CMReturnDone(recording.real);
}

}  // namespace velktest
