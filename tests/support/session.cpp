#include "tests/support/session.h"

#include <algorithm>
#include <cstring>

#include "velk/cim.h"
#include "velk/request_state.h"

namespace velktest {
namespace {

template <class Global>
std::span<char> bytes(Global &global) {
    return {reinterpret_cast<char *>(&global), sizeof(Global)};
}

}  // namespace

std::vector<std::span<char>> session_globals() {
    return {
        bytes(ZEB_VMWarePackageInstallationBroker),
        bytes(pkgInstance),
        bytes(pkgnum),
        bytes(PkgSeq),
        bytes(payload_result),
        bytes(filelocation),
        bytes(totalstatus),
        bytes(is_sync_install),
        bytes(is_async_install),
        bytes(invoke_client),
        bytes(g_is_backup_update),
        bytes(g_is_noreboot_update),
        bytes(Velkchild_thread_num),
        bytes(ga_is_thread_running),
        bytes(instanceID),
        bytes(update_file_location),
    };
}

void reset_session() {
    for (const std::span<char> global : session_globals()) {
        if (global.size() == sizeof(int)) {
            // A watcher at its end may be reading it.
            velk::store(*reinterpret_cast<int *>(global.data()), 0);
        } else {
            std::ranges::fill(global, '\0');
        }
    }
}

std::string session_image() {
    std::string image;
    for (const std::span<char> global : session_globals()) {
        image.append(global.data(), global.size());
    }
    return image;
}

std::string record_image(int index) {
    const std::span<char> record = bytes(pkgInstance[index]);
    return {record.data(), record.size()};
}

void set_field(std::span<char> field, std::string_view text) {
    const std::size_t length = std::min(text.size(), field.size() - 1);
    std::ranges::fill(field, '\0');
    std::memcpy(field.data(), text.data(), length);
}

}  // namespace velktest
