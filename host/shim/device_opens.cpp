#include "host/shim/device_opens.h"

#include <fcntl.h>
#include <sys/eventfd.h>

#include <atomic>
#include <cerrno>
#include <mutex>
#include <string_view>

#include "host/shim/on_path.h"
#include "host/shim/root.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {
namespace {

constexpr std::string_view kDevicePath = "/dev/ipmi0";

struct Device {
    IpmiDriver driver;
    std::map<int, std::shared_ptr<IpmiClient>> clients;
};

constinit FutexMutex device_lock;
constinit std::atomic<std::size_t> open_count{0};

// Never destroyed: descriptors are closed until the very end of the process.
Device &device() {
    static Device &instance = *new Device;
    return instance;
}

void assign(int descriptor, std::shared_ptr<IpmiClient> client) {
    auto &clients = device().clients;
    if (client == nullptr) {
        clients.erase(descriptor);
    } else {
        clients[descriptor] = std::move(client);
    }
    open_count.store(clients.size());
}

}  // namespace

bool device_is_open() {
    return open_count.load(std::memory_order_relaxed) != 0 && callback_depth == 0;
}

DeviceAccess::DeviceAccess() {
    device_lock.lock();
    now_us_ = velkshim_now_us();
    driver().advance(now_us_);
}

DeviceAccess::~DeviceAccess() {
    device_lock.unlock();
}

std::shared_ptr<IpmiClient> DeviceAccess::client(int descriptor) const {
    const auto found = device().clients.find(descriptor);
    return found == device().clients.end() ? nullptr : found->second;
}

IpmiDriver &DeviceAccess::driver() const {
    return device().driver;
}

std::optional<int> open_device(const Rerooted &target, int flags) {
    if (target.fixed() != kDevicePath || !controller_hook.is_set()) {
        return std::nullopt;
    }
    const DeviceAccess access;
    if (access.driver().is_gone()) {
        return fail_with<int>(ENOENT);
    }
    // A number of the kernel's, on which a read by mistake does not hang.
    const int descriptor = eventfd(0, EFD_NONBLOCK | ((flags & O_CLOEXEC) != 0 ? EFD_CLOEXEC : 0));
    if (descriptor >= 0) {
        assign(descriptor, std::make_shared<IpmiClient>());
    }
    return descriptor;
}

void forget_device(int descriptor) {
    if (device_is_open()) {
        const DeviceAccess access;
        assign(descriptor, nullptr);
    }
}

void copy_device(int descriptor, int copy) {
    if (device_is_open() && copy >= 0 && copy != descriptor) {
        const DeviceAccess access;
        assign(copy, access.client(descriptor));
    }
}

}  // namespace velkhost::shim

void velkshim_set_device(velkshim_controller controller, void *context) {
    velkhost::shim::controller_hook.set(controller, context);
    const std::lock_guard lock(velkhost::shim::device_lock);
    velkhost::shim::device().driver.reset();
}
