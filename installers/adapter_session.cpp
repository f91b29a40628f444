#include "installers/adapter_session.h"

#include <pthread.h>
#include <unistd.h>

#include <array>

#include "ipmi/kcs_channel.h"
#include "ipmi/update_session.h"
#include "velk/debug_log.h"
#include "velk/request_state.h"

namespace velk::adapter {
namespace {

constexpr unsigned kPollSeconds = 30;

// 16 bytes, of which the first word is the session's value; -1 stands for no session. Static,
// because a watcher can come to read it after its install has already ended.
constinit std::array<int, 4> session_block = {-1, -1, -1, -1};

int open_session() {
    for (int &word : session_block) {
        store(word, -1);
    }
    return start_update_option_firmware(session_block.data());
}

}  // namespace

UpdateSession::UpdateSession(void *(*watcher)(void *)) : result_(open_session()) {
    store(ga_is_thread_running, 1);
    if (result_ == 0) {
        start_watcher(watcher);
    }
}

void UpdateSession::start_watcher(void *(*watcher)(void *)) {
    log_dated("Start SMM successfully.");
    disconnect_kcs();  // for the watcher to open it anew
    pthread_t thread = {};
    result_ = pthread_create(&thread, nullptr, watcher, session_block.data());
    if (result_ != 0) {
        log_dated("Fail to create smm thread.");
        return;
    }
    pthread_detach(thread);
}

void UpdateSession::close() const {
    store(ga_is_thread_running, 0);
    if (result_ == 0) {
        smm_disconnect(session_block.data());
    }
}

void *watch_session(void *block, int (*poll)(int)) {
    log_dated("SMM :  query_fw_update, query_fw_update thread start");
    poll(load(*static_cast<int *>(block)));
    return nullptr;
}

int poll_session(int session_value, const char *start_line) {
    log_dated(start_line);
    int result = 0;
    while (load(ga_is_thread_running) != 0) {
        result = get_flash_status(session_value);
        sleep(kPollSeconds);
    }
    return result;
}

}  // namespace velk::adapter
