#include "host/broker/os_services.h"

#include "host/broker/tables.h"

#include <pthread.h>

#include <bit>
#include <cstring>
#include <memory>
#include <mutex>
#include <string>

namespace velkhost::broker {
namespace {

static_assert(sizeof(pthread_once_t) == sizeof(int));
static_assert(sizeof(pthread_key_t) == sizeof(CMPI_THREAD_KEY_TYPE));

using Folders = std::vector<std::filesystem::path>;

struct AllFolders {
    std::mutex lock;
    std::vector<const Folders *> of_brokers;
};

AllFolders &all_folders() {
    static AllFolders folders;
    return folders;
}

// The file of that name in the first folder that has it; empty if none has.
std::filesystem::path find_in(const Folders &folders, const std::string &file) {
    for (const std::filesystem::path &folder : folders) {
        std::error_code ignored;
        if (std::filesystem::exists(folder / file, ignored)) {
            return folder / file;
        }
    }
    return {};
}

// The path of a library, to be freed by the caller; null if no folder has it.
char *resolve_file_name(const char *name) {
    const std::string file = "lib" + std::string(name) + ".so";
    const std::lock_guard lock(all_folders().lock);
    for (const Folders *folders : all_folders().of_brokers) {
        const std::filesystem::path found = find_in(*folders, file);
        if (!found.empty()) {
            return ::strdup(found.c_str());
        }
    }
    return nullptr;
}

// -- Threads --

CMPI_THREAD_TYPE new_thread(CMPI_THREAD_RETURN (*entry)(void *), void *user, int detached) {
    pthread_attr_t attributes;
    ::pthread_attr_init(&attributes);
    ::pthread_attr_setdetachstate(
        &attributes, detached != 0 ? PTHREAD_CREATE_DETACHED : PTHREAD_CREATE_JOINABLE);
    pthread_t thread{};
    const int error = ::pthread_create(&thread, &attributes, entry, user);
    ::pthread_attr_destroy(&attributes);
    return error == 0 ? std::bit_cast<CMPI_THREAD_TYPE>(thread) : nullptr;
}

int thread_once(int *control, void (*init)()) {
    return ::pthread_once(control, init);
}

int create_thread_key(CMPI_THREAD_KEY_TYPE *key, void (*cleanup)(void *)) {
    return ::pthread_key_create(key, cleanup);
}

int destroy_thread_key(CMPI_THREAD_KEY_TYPE key) {
    return ::pthread_key_delete(key);
}

void *get_thread_specific(CMPI_THREAD_KEY_TYPE key) {
    return ::pthread_getspecific(key);
}

int set_thread_specific(CMPI_THREAD_KEY_TYPE key, void *value) {
    return ::pthread_setspecific(key, value);
}

// -- Mutexes and conditions --

pthread_mutex_t *as_mutex(CMPI_MUTEX_TYPE mutex) {
    return static_cast<pthread_mutex_t *>(mutex);
}

pthread_cond_t *as_condition(CMPI_COND_TYPE condition) {
    return static_cast<pthread_cond_t *>(condition);
}

CMPI_MUTEX_TYPE new_mutex(int) {
    auto mutex = std::make_unique<pthread_mutex_t>();
    return ::pthread_mutex_init(mutex.get(), nullptr) == 0 ? mutex.release() : nullptr;
}

void destroy_mutex(CMPI_MUTEX_TYPE mutex) {
    const std::unique_ptr<pthread_mutex_t> owned(as_mutex(mutex));
    if (owned) {
        ::pthread_mutex_destroy(owned.get());
    }
}

void lock_mutex(CMPI_MUTEX_TYPE mutex) {
    ::pthread_mutex_lock(as_mutex(mutex));
}

void unlock_mutex(CMPI_MUTEX_TYPE mutex) {
    ::pthread_mutex_unlock(as_mutex(mutex));
}

CMPI_COND_TYPE new_condition(int) {
    auto condition = std::make_unique<pthread_cond_t>();
    return ::pthread_cond_init(condition.get(), nullptr) == 0 ? condition.release() : nullptr;
}

void destroy_condition(CMPI_COND_TYPE condition) {
    const std::unique_ptr<pthread_cond_t> owned(as_condition(condition));
    if (owned) {
        ::pthread_cond_destroy(owned.get());
    }
}

int cond_wait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex) {
    return ::pthread_cond_wait(as_condition(condition), as_mutex(mutex));
}

int timed_cond_wait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex, ::timespec *deadline) {
    return ::pthread_cond_timedwait(as_condition(condition), as_mutex(mutex), deadline);
}

}  // namespace

LibraryFolders::LibraryFolders(const Folders &folders) : folders_(folders) {
    const std::lock_guard lock(all_folders().lock);
    all_folders().of_brokers.push_back(&folders_);
}

LibraryFolders::~LibraryFolders() {
    const std::lock_guard lock(all_folders().lock);
    std::erase(all_folders().of_brokers, &folders_);
}

const CMPIBrokerExtFT kOsServicesTable{
    .ftVersion = 200,
    .resolveFileName = resolve_file_name,
    .newThread = new_thread,
    .joinThread = nullptr,
    .exitThread = nullptr,
    .cancelThread = nullptr,
    .threadSleep = nullptr,
    .threadOnce = thread_once,
    .createThreadKey = create_thread_key,
    .destroyThreadKey = destroy_thread_key,
    .getThreadSpecific = get_thread_specific,
    .setThreadSpecific = set_thread_specific,
    .newMutex = new_mutex,
    .destroyMutex = destroy_mutex,
    .lockMutex = lock_mutex,
    .unlockMutex = unlock_mutex,
    .newCondition = new_condition,
    .destroyCondition = destroy_condition,
    .condWait = cond_wait,
    .timedCondWait = timed_cond_wait,
    .signalCondition = nullptr,
};

}  // namespace velkhost::broker
