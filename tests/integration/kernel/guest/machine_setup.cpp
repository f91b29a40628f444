#include "tests/integration/kernel/guest/machine_setup.h"

#include "tests/integration/kernel/guest/text.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <string>

#include <fcntl.h>
#include <sys/mount.h>
#include <sys/reboot.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace velkguest {
namespace {

constexpr const char *kDevice = "/dev/ipmi0";

void mount_one(const char *type, const char *folder) {
    mkdir(folder, 0755);
    if (mount(type, folder, type, 0, nullptr) != 0) {
        say(std::string("mount ") + folder + ": " + strerrorname_np(errno));
    }
}

void load(const std::string &module) {
    const std::string file = "/modules/" + module + ".ko";
    const int fd = open(file.c_str(), O_RDONLY | O_CLOEXEC);
    if (syscall(SYS_finit_module, fd, "", 0) != 0) {
        say(module + ": " + strerrorname_np(errno));
    }
    close(fd);
}

bool device_appears() {
    constexpr int kAttempts = 3000;
    for (int i = 0; i < kAttempts && access(kDevice, F_OK) != 0; ++i) {
        usleep(10'000);
    }
    return access(kDevice, F_OK) == 0;
}

}  // namespace

bool set_up() {
    mount_one("proc", "/proc");
    mount_one("sysfs", "/sys");
    mount_one("devtmpfs", "/dev");
    mkdir("/tmp", 01777);
    for (const char *module : {"ipmi_msghandler", "ipmi_devintf", "ipmi_si"}) {
        load(module);
    }
    return device_appears();
}

void unbind_driver() {
    const std::filesystem::path driver = "/sys/bus/platform/drivers/ipmi_si";
    for (const auto &entry : std::filesystem::directory_iterator(driver)) {
        const std::string name = entry.path().filename();
        if (entry.is_symlink() && name != "module") {
            std::ofstream(driver / "unbind") << name;
        }
    }
}

void power_off() {
    sync();
    reboot(RB_POWER_OFF);
    std::abort();
}

}  // namespace velkguest
