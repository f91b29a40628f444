// The in-band network table of a host with several nodes: through which IPMI device and internal
// addresses each node's management controller is reached. The host keeps the mapping in a text
// file; the install of packages does not use it.
#pragma once

#include "velk/api.h"

namespace velk {

inline constexpr int kMaxNodes = 4;
inline constexpr int kTokenSize = 20;  // of each text below, with its terminator

// One node. The texts are buffers of 20 bytes that InitializeTable allocates with malloc and that
// belong to the table's owner.
struct NetNode {
    int id;
    int index;
    char *ipmiDev;
    char *spare;  // allocated, not filled
    char *esxiIp;
    char *rxcIp;
};

struct NetTable {
    int timestamp;  // seconds since the epoch, from the mapping's first line
    NetNode node[kMaxNodes];
    int nodeNumber;  // 0 to 4
};

}  // namespace velk

// Numbers the entries and allocates their buffers. Returns 0, or -1 when an allocation failed.
VELK_API int InitializeTable(velk::NetTable *table);

// Fills a table made by InitializeTable. Returns 0, or -1; the mapping file is then deleted, so
// that the host writes it anew. Nodes beyond the fourth are left out.
VELK_API int GetNetTable(velk::NetTable *table);
