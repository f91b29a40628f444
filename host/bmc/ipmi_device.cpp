#include "host/bmc/ipmi_device.h"

#include "host/shim/velkshim.h"

#include <algorithm>
#include <iterator>

namespace velkhost::bmc {
namespace {

void fill(velkshim_ipmi_answer &answer, const Reply &reply) {
    const Response &response = *reply.response;
    answer.delay_us = reply.delay.count();
    answer.netfn = response.netfn;
    answer.cmd = response.cmd;
    answer.length = response.data.size();
    std::copy_n(response.data.begin(), std::min(response.data.size(), std::size(answer.data)),
                std::begin(answer.data));
}

velkshim_ipmi_outcome answer_request(void *controller, const velkshim_ipmi_request *request,
                                     std::int64_t now_us, velkshim_ipmi_answer *answer) {
    const Request message{request->netfn, request->cmd,
                          Bytes(request->data, request->data + request->length)};
    const Reply reply = static_cast<Controller *>(controller)->handle(message, now_us);
    if (reply.device_gone) {
        return VELKSHIM_IPMI_GONE;
    }
    if (!reply.response) {
        return VELKSHIM_IPMI_SILENT;
    }
    fill(*answer, reply);
    return VELKSHIM_IPMI_ANSWERED;
}

}  // namespace

IpmiDevice::IpmiDevice(Controller &controller) {
    velkshim_set_device(answer_request, &controller);
}

IpmiDevice::~IpmiDevice() {
    velkshim_set_device(nullptr, nullptr);
}

}  // namespace velkhost::bmc
