#include "tests/integration/kernel/guest/actions.h"

#include "ipmi/ipmi.h"
#include "ipmi/kcs_channel.h"
#include "ipmi/transaction.h"
#include "ipmi/update_session.h"
#include "tests/integration/kernel/guest/device.h"
#include "tests/integration/kernel/guest/install.h"
#include "tests/integration/kernel/guest/machine_setup.h"
#include "tests/integration/kernel/guest/pauses.h"
#include "tests/integration/kernel/guest/text.h"
#include "tests/integration/kernel/guest/threads.h"
#include "velk/debug_log.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <functional>
#include <map>
#include <string>
#include <vector>

namespace velkguest {
namespace {

using Arguments = std::vector<std::string>;  // the first is the action's name

int handle = -1;

int argument(const Arguments &arguments, std::size_t index, int otherwise, int base = 10) {
    return index < arguments.size() ? number(arguments[index], base) : otherwise;
}

unsigned char byte_argument(const Arguments &arguments, std::size_t index) {
    return static_cast<unsigned char>(argument(arguments, index, 0, 16));
}

std::string timed(const std::function<std::string()> &work) {
    const Stopwatch watch;
    const std::string result = work();
    return result + " after " + std::to_string(watch.ms()) + " ms";
}

std::string session_state() {
    return "handle=" + std::to_string(handle) + (kcs_fd < 0 ? " closed" : " open") +
           " paused=" + std::to_string(take_paused_seconds());
}

std::string open_channel() {
    const int result = connect_kcs(velk::kIpmiDevice);
    return std::to_string(result) + (result == 0 ? "" : std::string(" ") + strerrorname_np(errno));
}

std::string ask(const Arguments &arguments) {
    return timed([&] {
        std::array<unsigned char, 128> response = {};
        unsigned short length = response.size();
        const int result = send_IPMI_command(byte_argument(arguments, 2), nullptr, 0,
                                             response.data(), &length, byte_argument(arguments, 1));
        return std::to_string(result) +
               (result == 0 ? " data=" + hex(std::span(response.data(), length)) : "");
    });
}

std::string ask_type() {
    return timed([] {
        int type = -1;
        const int result = get_bmc_type(&type);
        return std::to_string(result) + " type=" + std::to_string(type);
    });
}

std::string send_raw(const Arguments &arguments) {
    Send request;
    request.id = argument(arguments, 1, 0);
    request.netfn = byte_argument(arguments, 2);
    request.cmd = byte_argument(arguments, 3);
    return send(kcs_fd, request);
}

std::string fetch_raw(const Arguments &arguments, bool truncating) {
    return fetch(kcs_fd, static_cast<unsigned short>(argument(arguments, 1, 272)), truncating);
}

std::string refusals() {
    Send request{.netfn = 0x06, .cmd = 0x01};
    Send odd = request;
    odd.netfn = 0x07;
    Send channel = request;
    channel.channel = 0x20;
    Send address = request;
    address.address_length = 4;
    return "odd function " + send(kcs_fd, odd) + ", bad channel " + send(kcs_fd, channel) +
           ", short address " + send(kcs_fd, address);
}

void print_log() {
    std::ifstream log(velk::kDebugLog);
    for (std::string line; std::getline(log, line);) {
        say("log " + line);
    }
}

std::string start() {
    const int result = start_update_option_firmware(&handle);
    return std::to_string(result) + " " + session_state();
}

std::string status() {
    const int result = get_flash_status(handle);
    return std::to_string(result) + " " + session_state();
}

std::string end() {
    smm_disconnect(&handle);
    return session_state();
}

std::string run(const Arguments &arguments) {
    using Action = std::function<std::string(const Arguments &)>;
    static const std::map<std::string, Action, std::less<>> actions = {
        {"open", [](const auto &) { return open_channel(); }},
        {"close", [](const auto &) { return disconnect_kcs(), std::string("done"); }},
        {"start", [](const auto &) { return timed(start); }},
        {"status", [](const auto &) { return timed(status); }},
        {"end", [](const auto &) { return end(); }},
        {"type", [](const auto &) { return ask_type(); }},
        {"request", ask},
        {"install",
         [](const auto &words) { return install(static_cast<unsigned>(argument(words, 1, 1))); }},
        {"hurry", [](const auto &words) { return install_in_a_hurry(argument(words, 1, 10)); }},
        {"channels", [](const auto &) { return std::to_string(open_channels()); }},
        {"send", send_raw},
        {"wait", [](const auto &words) { return wait(kcs_fd, argument(words, 1, 5000)); }},
        {"fetch", [](const auto &words) { return fetch_raw(words, true); }},
        {"keep", [](const auto &words) { return fetch_raw(words, false); }},
        {"codes", [](const auto &) { return codes(); }},
        {"refusals", [](const auto &) { return refusals(); }},
        {"swap", [](const auto &) { return ask_at_once(true); }},
        {"apart", [](const auto &) { return ask_at_once(false); }},
        {"closed", [](const auto &) { return close_under_a_waiter(); }},
        {"unbind", [](const auto &) { return unbind_driver(), std::string("done"); }},
    };
    const auto found = actions.find(arguments.front());
    return found == actions.end() ? "is unknown" : found->second(arguments);
}

}  // namespace

void act(std::string_view action) {
    if (action == "log") {
        print_log();
        return;
    }
    const std::string result = run(split(action, ':'));
    say(std::string(action) + " " + result);
}

}  // namespace velkguest
