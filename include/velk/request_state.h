// The globals of one install request. They are zero at load and most are never reset between
// requests; who writes each of them is said beside it.
#pragma once

#include <pthread.h>

#include <atomic>
#include <cstddef>

#include "velk/api.h"

namespace velk {

inline constexpr std::size_t kInstanceIdSize = 40;

// Kind of location of a request's packages; the first package decides for all.
enum FileLocation : int { kLocal = 1, kTftp = 2, kFtp = 3, kSftp = 4, kUnknownLocation = 5 };

// Who sent the request: the update manager sends remote locations, the PAKRO client local ones.
enum InvokingClient : int { kUpdateManager = 0, kPakroClient = 1 };

}  // namespace velk

VELK_API int filelocation;          // velk::FileLocation, by the package list
VELK_API int totalstatus;           // 1 once the last package has reported a final result
VELK_API int is_sync_install;       // by the request; never cleared
VELK_API int is_async_install;      // by the request; never cleared
VELK_API int invoke_client;         // velk::InvokingClient, by the request
VELK_API int g_is_backup_update;    // "--backup" given; kept by a request without UpdateArgs
VELK_API int g_is_noreboot_update;  // "--no-reboot" given; likewise
VELK_API int Velkchild_thread_num;  // install threads running
VELK_API int ga_is_thread_running;  // 1 while a session watcher is to go on polling
VELK_API char instanceID[velk::kInstanceIdSize];  // id of the current request's job
VELK_API char update_file_location[4100];         // kept for other modules
VELK_API pthread_mutex_t mutex;  // guards the rewriting of the job's status file alone

namespace velk {

// The plain integers above are shared by threads without a lock. Their order is nobody's promise,
// but every access is atomic.
inline int load(int &shared) {
    return std::atomic_ref<int>(shared).load();
}
inline void store(int &shared, int value) {
    std::atomic_ref<int>(shared).store(value);
}

}  // namespace velk
