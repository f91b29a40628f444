#include "tests/integration/kernel/machine.h"

#include "host/bmc/qemu_server.h"
#include "host/bmc/trace.h"
#include "tests/integration/kernel/initramfs.h"
#include "tests/integration/kernel/process.h"
#include "tests/support/files.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <filesystem>
#include <sstream>
#include <thread>

#include <sys/eventfd.h>

namespace velkkernel {
namespace {

namespace bmc = velkhost::bmc;
namespace fs = std::filesystem;

constexpr std::chrono::seconds kLimit{200};
constexpr std::string_view kGuestLine = "velk: ";

const fs::path kKernel = fs::path(VELK_KERNEL_DIR) / "vmlinux";
constexpr std::array kModules = {"ipmi_msghandler", "ipmi_devintf", "ipmi_si"};

fs::path module_file(std::string_view name) {
    return fs::path(VELK_KERNEL_DIR) / "modules" / (std::string(name) + ".ko");
}

std::string make_initramfs(Abi abi) {
    const char *const program = abi == Abi::k64 ? VELK_GUEST_64 : VELK_GUEST_32;
    Initramfs out;
    out.add_folder("dev");
    out.add_character_device("dev/console", 5, 1);
    out.add_folder("modules");
    for (const char *name : kModules) {
        out.add_file("modules/" + std::string(name) + ".ko",
                     velktest::read_file(module_file(name)));
    }
    out.add_file("init", velktest::read_file(program), true);
    return out.finish();
}

// The controller at work in a thread of its own, as long as the object lives.
class Serving {
  public:
    Serving(const fs::path &socket, bmc::Controller &controller)
        : server_(socket, controller), thread_([this] { server_.run(stop_.get()); }) {}
    ~Serving() {
        eventfd_write(stop_.get(), 1);
        thread_.join();
    }
    Serving(const Serving &) = delete;
    Serving &operator=(const Serving &) = delete;

  private:
    bmc::OwnedDescriptor stop_{eventfd(0, EFD_CLOEXEC)};
    bmc::QemuServer server_;
    std::thread thread_;
};

// Nothing but a panic may come between the guest's lines. The last three are for a host that is
// busy: the kernel does not count its timer's interrupts at boot and panic for lack of them, does
// not complain of a processor that stands still, and takes the time from a clock whose rate it need
// not measure.
const std::string kKernelOptions =
    "console=ttyS0 loglevel=1 panic=-1 rdinit=/init no_timer_check nowatchdog clocksource=acpi_pm "
    "velk_actions=";

// QEMU connects to the socket again when it is too early: without "reconnect" it does not start.
std::vector<std::string> command_line(const fs::path &socket, const fs::path &initramfs,
                                      const std::string &actions) {
    return {"qemu-system-x86_64",
            "-M",
            "pc,graphics=off,hpet=off",
            "-accel",
            "tcg",
            "-m",
            "128",
            "-smp",
            "1",
            "-nodefaults",
            "-no-user-config",
            "-display",
            "none",
            "-serial",
            "stdio",
            "-no-reboot",
            "-chardev",
            "socket,id=link,path=" + socket.string() + ",reconnect=1",
            "-device",
            "ipmi-bmc-extern,id=bmc,chardev=link",
            "-device",
            "isa-ipmi-kcs,bmc=bmc,irq=5",
            "-kernel",
            kKernel.string(),
            "-initrd",
            initramfs.string(),
            "-append",
            kKernelOptions + actions};
}

// The firmware clears its terminal; ours is to be left alone.
bool is_control(char letter) {
    return std::iscntrl(static_cast<unsigned char>(letter)) != 0;
}

std::vector<std::string> split_lines(const std::string &text) {
    std::vector<std::string> out;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);) {
        line.resize(line.find_last_not_of('\r') + 1);
        std::ranges::replace_if(line, is_control, '.');
        out.push_back(line);
    }
    return out;
}

std::vector<std::string> guest_lines(const std::vector<std::string> &console) {
    std::vector<std::string> out;
    for (const std::string &line : console) {
        if (line.starts_with(kGuestLine)) {
            out.push_back(line.substr(kGuestLine.size()));
        }
    }
    return out;
}

// The driver's probe ends with a question for the channel; what comes before is its own.
std::vector<bmc::Exchange> without_probe(std::vector<bmc::Exchange> all) {
    constexpr std::uint8_t kGetChannelInfo = 0x42;
    const auto last = std::find_if(all.rbegin(), all.rend(), [](const bmc::Exchange &exchange) {
        return exchange.request.netfn == 0x06 && exchange.request.cmd == kGetChannelInfo;
    });
    all.erase(all.begin(), last.base());
    return all;
}

}  // namespace

const char *name_of(Abi abi) {
    return abi == Abi::k64 ? "lp64" : "ilp32";
}

void PrintTo(Abi abi, std::ostream *out) {
    *out << name_of(abi);
}

std::string Outcome::result_of(const std::string &action, int occurrence) const {
    for (const std::string &line : lines) {
        if (line.starts_with(action + " ") && occurrence-- == 0) {
            return line.substr(action.size() + 1);
        }
    }
    return "(nothing)";
}

std::vector<std::string> Outcome::words() const {
    std::vector<std::string> out;
    for (const bmc::Exchange &exchange : exchanges) {
        out.push_back(exchange.words);
    }
    return out;
}

std::vector<std::string> Outcome::log() const {
    constexpr std::string_view kEntry = "log ";
    constexpr std::size_t kDateSize = 25;
    std::vector<std::string> out;
    for (const std::string &line : lines) {
        if (line.starts_with(kEntry) && line.size() > kEntry.size() + kDateSize) {
            out.push_back(line.substr(kEntry.size() + kDateSize));
        }
    }
    return out;
}

std::string Outcome::report() const {
    std::string out;
    for (const std::string &line : console) {
        out += line + "\n";
    }
    for (const bmc::Exchange &exchange : exchanges) {
        out += bmc::in_words(exchange, exchanges.front().time_us) + "\n";
    }
    return out;
}

std::string why_not() {
    if (!is_program("qemu-system-x86_64")) {
        return "there is no qemu-system-x86_64";
    }
    return fs::exists(kKernel) ? "" : "there is no kernel; prepare_kernel.sh says why";
}

Outcome run(const Setup &setup) {
    const velktest::TempFolder folder;
    const fs::path socket = folder.path() / "bmc";
    const fs::path initramfs = folder.path() / "initramfs";
    velktest::write_file(initramfs, make_initramfs(setup.abi));
    velkhost::scenario::FaultRules rules(setup.faults);
    bmc::Controller controller(
        setup.controller,
        [&](std::string_view step, std::string_view subject) { return rules.take(step, subject); });
    Outcome outcome;
    {
        const Serving serving(socket, controller);
        outcome.console =
            split_lines(output_of(command_line(socket, initramfs, setup.actions), kLimit));
    }
    outcome.lines = guest_lines(outcome.console);
    outcome.exchanges = without_probe(controller.trace());
    return outcome;
}

}  // namespace velkkernel
