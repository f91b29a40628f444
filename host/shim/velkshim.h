// The shim stands between the provider library and the machine. It defines the libc calls through
// which the library reaches files, time, threads and the host's identity, and so gives an
// unchanged binary another root folder and another clock.
//
// It works linked in front of libc (velkhost, the test programs) and as a preload under any other
// broker; there it is set up by the environment variables VELKSHIM_ROOT, VELKSHIM_CLOCK ("real" or
// "virtual"), VELKSHIM_EPOCH (seconds) and VELKSHIM_NODE. Functions return 0 or an errno value
// unless stated. All are safe to call from any thread. A signal handler may tell the time and use
// files outside the fixed paths; it must not pause, create or join threads, or call anything below
// but velkshim_now_us and velkshim_map.
#pragma once

#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

#define VELKSHIM_API __attribute__((visibility("default")))

// ---- Files ----

// Puts the host's fixed paths under `folder` (copied; it must exist): /tmp/velkdebug.txt,
// /tmp/sfcb, /tmp/networkflag, /var/tmp/filestore, /var/tmp/ZEB, /etc/cim, /etc/velkhost,
// /usr/lib/cim and /dev/ipmi0. Every other path stays where it is. NULL ends the re-rooting.
// dlopen finds what the root has in /usr/lib/cim by its bare name, too, before libc searches.
// ENOENT, ENOTDIR and the like for a folder that cannot be used, EINVAL for one that itself lies
// under a fixed path.
VELKSHIM_API int velkshim_set_root(const char *folder);

// Where `path` really lies: writes at most `size` bytes with the terminator to `out` and returns
// 1 when the path was re-rooted, 0 when it stands as it is. Runs of '/' count as one; "." and ".."
// are resolved in the text before the path is compared, so that none leads out of the root. -1 and
// errno ENAMETOOLONG when the answer does not fit `size` or PATH_MAX, EFAULT for a null path.
VELKSHIM_API int velkshim_map(const char *path, char *out, size_t size);

// Called after a descriptor that was opened for writing on a re-rooted path has been closed, with
// close or fclose, on the thread that closed it. `path` is the fixed path, `now_us` the clock's
// time.
//
// What holds for all callbacks of the shim: calls that a callback makes are served but call no
// callback; it must not pause or wait; it must not throw. When the setter returns, no thread is in
// the callback that was set before.
typedef void (*velkshim_file_observer)(void *context, const char *path, int64_t now_us);
VELKSHIM_API void velkshim_observe_files(velkshim_file_observer observer, void *context);

// ---- Clock ----

// From here on time stands still but for pauses: it jumps to the earliest wake-up once every
// thread that takes part is pausing, and one sleeper is woken at a time, in order of its wake-up
// time and then of its arrival. `epoch_us` is the wall-clock time to begin with, in microseconds
// since 1970-01-01 UTC. Both calls cut the pauses that are under way short, as a signal does, and
// no thread takes part yet.
VELKSHIM_API void velkshim_use_virtual_clock(int64_t epoch_us);
VELKSHIM_API void velkshim_use_real_clock(void);

// The clock's time, microseconds since 1970-01-01 UTC, under either clock.
VELKSHIM_API int64_t velkshim_now_us(void);

// Under the virtual clock a thread takes part from its first pause on, or from its creation when
// another thread that takes part created it with pthread_create, and until it ends. These two let
// a thread come in and leave by hand; they do not nest and do nothing under the real clock.
VELKSHIM_API void velkshim_thread_enter(void);
VELKSHIM_API void velkshim_thread_leave(void);

// Around a wait for anything but time (a join, a condition, a read): the calling thread does not
// hold the virtual clock up in between. Both do nothing for a thread that does not take part, and
// they nest. pthread_join is such a wait by itself; nothing else is.
VELKSHIM_API void velkshim_wait_begin(void);
VELKSHIM_API void velkshim_wait_end(void);

// Called for every pause that begins, on the pausing thread, before it pauses.
typedef void (*velkshim_pause_observer)(void *context, int64_t now_us, int64_t length_us);
VELKSHIM_API void velkshim_observe_pauses(velkshim_pause_observer observer, void *context);

// ---- Host ----

// The node name that uname reports (copied, cut to its field); NULL for the machine's own.
VELKSHIM_API void velkshim_set_node_name(const char *name);

// ---- Management controller ----

// A request that the IPMI driver gives to the controller. Valid during the call alone.
typedef struct velkshim_ipmi_request {
    uint8_t netfn;
    uint8_t cmd;
    const uint8_t *data;
    size_t length;
} velkshim_ipmi_request;

// The controller's answer. `data` begins with the completion code; `length` is that of the whole
// answer also where the data was cut to fit.
typedef struct velkshim_ipmi_answer {
    int64_t delay_us;  // from the request to the answer, 0 or more
    uint8_t netfn;
    uint8_t cmd;
    size_t length;
    uint8_t data[272];
} velkshim_ipmi_answer;

typedef enum velkshim_ipmi_outcome {
    VELKSHIM_IPMI_SILENT,    // no answer, ever
    VELKSHIM_IPMI_ANSWERED,  // `answer` is filled
    VELKSHIM_IPMI_GONE       // the controller has gone, and the device with it
} velkshim_ipmi_outcome;

// What answers behind /dev/ipmi0 under the root. NULL: nothing, and opening the device fails with
// ENOENT as long as there is no such file. `now_us` is when the request reaches the controller; a
// call may come later than that, but calls come in that order, one at a time.
//
// Descriptors of the device behave as the kernel's driver has them, in the shim's time: open,
// close, ioctl, poll and the dup family know them; select and the others do not. Setting another
// controller drops all that is under way.
typedef velkshim_ipmi_outcome (*velkshim_controller)(void *context,
                                                     const velkshim_ipmi_request *request,
                                                     int64_t now_us, velkshim_ipmi_answer *answer);
VELKSHIM_API void velkshim_set_device(velkshim_controller controller, void *context);

// ---- Faults ----

// Asked before each call that the shim serves on a re-rooted path, with the name of the step, such
// as "open:<fixed path>" (fopen and creat too), and before "thread.create". The verbs: open,
// opendir, unlink, rmdir, mkdir, rename, link, symlink, readlink, chmod, truncate, access, stat,
// lstat, dlopen. After "close:<fixed path>" (of a file opened for writing) and "closedir:<fixed
// path>" it is asked too. A result other than 0 is the errno with which the call then fails.
typedef int (*velkshim_fault_hook)(void *context, const char *step);
VELKSHIM_API void velkshim_set_fault_hook(velkshim_fault_hook hook, void *context);

#ifdef __cplusplus
}
#endif
