// The host's IPMI device as the Linux driver offers it (drivers/char/ipmi, <linux/ipmi.h>): one
// request to the controller's system interface and its response.
#pragma once

#include "velk/api.h"

// Opens the device read-write. Returns the descriptor or a negative value.
VELK_API int connect_ipmi(const char *path);

// Closes a descriptor of 0 or greater; does nothing for others.
VELK_API void disconnect_ipmi(int fd);

// Sends one request and waits up to 5 seconds for its response. `resp` takes the response's data,
// completion code first, cut to the capacity that `*resp_len` states; `*resp_len` then holds its
// length. Returns 0, or -1 when there was no matching response in time.
VELK_API int send_kcs_IPMI_command(int fd, unsigned char cmd, unsigned char *data,
                                   unsigned short data_len, unsigned char *resp,
                                   unsigned short *resp_len, unsigned char netfn);
