// The mapping file /etc/cim/zeb/nodemapping:
//
//   line 1     "RXC IN-Band Network Mappings: <seconds since the epoch>"
//   line 2     a heading
//   line 3...  one node each: <label> <node number> <IPMI device> <unused> <ESXi IP> <RXC IP>
#pragma once

#include "velk/api.h"

namespace velk {

inline constexpr const char *kNodeMapping = "/etc/cim/zeb/nodemapping";

}  // namespace velk

// The number of node lines, by count of all lines but two: an empty file gives -2. Returns 0, 1
// when the file cannot be opened, -1 for a null pointer.
VELK_API int getNodeNumber(int *count);

// The time stamp of the first line. Returns 0, or -1 without a file or stamp.
VELK_API int gettimestamp(int *stamp);

// Rewrites the file with the stamp set to now (mode 0), to 0 (mode 1) or kept (others), and of its
// lines the first seven. Returns 0, or 1 when the file cannot be read or rewritten.
VELK_API int updatetimestamp(int mode);

// A node's IPMI device, hypervisor address or controller address, cut to 19 characters, into `dest`
// of 20 bytes. Return 0 when found, else 1.
VELK_API int getIPMI(char *dest, int node);
VELK_API int getESXiIP(char *dest, int node);
VELK_API int getRXCIP(char *dest, int node);
