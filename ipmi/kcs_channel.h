// The one process-wide channel to the management controller over the host's KCS interface. It is
// shared by the install thread and the session watcher without a lock.
#pragma once

#include "velk/api.h"

// Descriptor of the device, negative when closed.
VELK_API int kcs_fd;

// Opens the device at `path` and keeps it in `kcs_fd`, also when that failed. Returns 0 or -2.
VELK_API int connect_kcs(const char *path);

// Closes the channel if it is open.
VELK_API void disconnect_kcs(void);

// As send_kcs_IPMI_command on `kcs_fd`. Returns 0, or -2 on any failure.
VELK_API int send_IPMI_command(unsigned char cmd, unsigned char *data, unsigned short data_len,
                               unsigned char *resp, unsigned short *resp_len, unsigned char netfn);

namespace velk {

inline constexpr int kChannelFailed = -2;
inline constexpr const char *kIpmiDevice = "/dev/ipmi0";

}  // namespace velk
