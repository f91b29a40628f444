#include "tests/integration/kernel/guest/threads.h"

#include "ipmi/ipmi.h"
#include "tests/integration/kernel/guest/device.h"

#include <semaphore>
#include <thread>

#include <unistd.h>

namespace velkguest {
namespace {

constexpr useconds_t kBothAnsweredUs = 300'000;
constexpr unsigned short kCapacity = 272;
constexpr int kPatienceMs = 10'000;

std::string command_of(const std::string &answer) {
    const std::size_t at = answer.find("cmd=");
    return at == std::string::npos ? answer : answer.substr(at + 4, 2);
}

}  // namespace

std::string ask_at_once(bool on_one_descriptor) {
    const int first = connect_ipmi("/dev/ipmi0");
    const int second = on_one_descriptor ? first : connect_ipmi("/dev/ipmi0");
    std::binary_semaphore first_has_sent(0);
    std::binary_semaphore second_has_fetched(0);
    std::string device_id;
    std::string type;
    std::thread other([&] {
        first_has_sent.acquire();
        send(second, {.id = 2, .netfn = 0x3A, .cmd = 0xC1});
        usleep(kBothAnsweredUs);
        type = command_of(fetch(second, kCapacity, true));
        second_has_fetched.release();
    });
    send(first, {.id = 1, .netfn = 0x06, .cmd = 0x01});
    first_has_sent.release();
    second_has_fetched.acquire();
    device_id = command_of(fetch(first, kCapacity, true));
    other.join();
    disconnect_ipmi(first);
    if (!on_one_descriptor) {
        disconnect_ipmi(second);
    }
    return "device id got " + device_id + ", type got " + type;
}

std::string close_under_a_waiter() {
    const int fd = connect_ipmi("/dev/ipmi0");
    send(fd, {.id = 1, .netfn = 0x3A, .cmd = 0xC1});
    std::thread other([fd] {
        usleep(kBothAnsweredUs);
        disconnect_ipmi(fd);
    });
    const std::string waited = wait(fd, kPatienceMs);
    other.join();
    return waited.substr(0, waited.find(' ')) + " " + fetch(fd, kCapacity, true);
}

}  // namespace velkguest
