#include "tests/support/service_doubles.h"

#include <cmpi/cmpimacs.h>
#include <gtest/gtest.h>

#include <memory>

#include "host/providers/kit/cim_error.h"

namespace velktest {
namespace {

kit::MethodResult result_of(const MethodEnd &end) {
    if (end.code != CMPI_RC_OK) {
        throw kit::CimError(end.code, end.message);
    }
    return {end.value, end.outputs};
}

CMPIStatus run_frame(CMPIMethodMI *mi, const CMPIContext *context, const CMPIResult *result,
                     const CMPIObjectPath *, const char *, const CMPIArgs *, CMPIArgs *) {
    static_cast<const RequestFrame *>(mi->hdl)->work(context);
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus clean_up_frame(CMPIMethodMI *, const CMPIContext *, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

}  // namespace

velkhost::broker::ManagementInterfaces DoubleBase::interfaces(const CMPIBroker *broker) {
    // The double belongs to the test.
    const std::shared_ptr<kit::Provider> itself(std::shared_ptr<void>(), this);
    instance_binding_ = {broker, itself};
    method_binding_ = {broker, itself};
    velkhost::broker::ManagementInterfaces interfaces;
    interfaces.instance = &instance_mi_;
    interfaces.method = &method_mi_;
    return interfaces;
}

kit::MethodResult ManagementController::invoke(const kit::Path &target, const std::string &method,
                                               const kit::Args &in) {
    EXPECT_EQ(method, "InstallFromURI");
    Order order{{}, in.text("URI"), in.uint8("Update_Operation"), in.uint8("reboot_option")};
    for (const char *key : {"SystemCreationClassName", "SystemName", "CreationClassName", "Name"}) {
        order.keys.emplace_back(key, target.key(key).value_or("(none)"));
    }
    EXPECT_EQ(target.key_count(), order.keys.size());
    orders.push_back(std::move(order));
    return result_of(end);
}

kit::Instance UpdateJob::read(const kit::Path &) {
    if (looks_.empty()) {
        ADD_FAILURE() << "the job was looked at once more";
        fail_not_found();
    }
    const auto look = std::move(looks_.front());
    looks_.pop_front();
    if (!look) {
        fail_not_found();
    }
    return {{}, *look};
}

kit::MethodResult FileTransfer::invoke(const kit::Path &, const std::string &method,
                                       const kit::Args &in) {
    if (on_transfer && (method == "TransferViaTFTP" || method == "TransferViaURL")) {
        EXPECT_EQ(in.uint16s("TransferOptions").size(), 1U);
        return result_of(on_transfer(in.text("SourceURI")));
    }
    EXPECT_EQ(method, "DeleteTransferredFile");
    deleted.push_back(in.text("FileURI"));
    return result_of(end);
}

RequestFrame::RequestFrame() {
    table_.ftVersion = 200;
    table_.miVersion = 200;
    table_.miName = "methodFrame";
    table_.cleanup = &clean_up_frame;
    table_.invokeMethod = &run_frame;
}

velkhost::broker::ManagementInterfaces RequestFrame::interfaces() {
    velkhost::broker::ManagementInterfaces interfaces;
    interfaces.method = &mi_;
    return interfaces;
}

}  // namespace velktest
