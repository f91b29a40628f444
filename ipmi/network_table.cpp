#include "ipmi/network_table.h"

#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>

#include "ipmi/node_mapping.h"
#include "velk/debug_log.h"

namespace velk {
namespace {

// A mapping that cannot be used is deleted.
int discard_mapping(const char *format, int number = 0) {
    unlink(kNodeMapping);
    log_dated_format(format, number);
    return -1;
}

bool allocate(NetNode &node) {
    const std::array texts = {&node.ipmiDev, &node.spare, &node.esxiIp, &node.rxcIp};
    return std::all_of(texts.begin(), texts.end(), [](char **text) {
        *text = static_cast<char *>(std::calloc(kTokenSize, 1));  // NOLINT: freed by C callers
        return *text != nullptr;
    });
}

int fill_node(NetNode &node, int number) {
    if (getRXCIP(node.rxcIp, number) != 0) {
        return discard_mapping("GetNetTable :   %d getRXCIP fail ", number);
    }
    if (getESXiIP(node.esxiIp, number) != 0) {
        return discard_mapping("GetNetTable :   %d getESXiIP fail ", number);
    }
    if (getIPMI(node.ipmiDev, number) != 0) {
        return discard_mapping("GetNetTable :   %d  getIPMI fail ", number);
    }
    log_dated_format("GetNetTable :   %d ipmi dev  %s  ", number, node.ipmiDev);
    log_dated_format("GetNetTable :   %d rxc ip  %s  ", number, node.rxcIp);
    log_dated_format("GetNetTable :   %d ESXi ip  %s  ", number, node.esxiIp);
    return 0;
}

int read_node_number(NetTable &table) {
    if (getNodeNumber(&table.nodeNumber) != 0) {
        return discard_mapping("GetNetTable :  getNodeNumber fail ");
    }
    if (table.nodeNumber < 1) {
        return discard_mapping("GetNetTable :  nodeNumber %d ", table.nodeNumber);
    }
    table.nodeNumber = std::min(table.nodeNumber, kMaxNodes);
    return 0;
}

}  // namespace
}  // namespace velk

int InitializeTable(velk::NetTable *table) {
    using namespace velk;
    log_dated("enter  InitializeTable \n");
    if (table == nullptr) {
        return -1;
    }
    table->nodeNumber = 0;
    for (int i = 0; i < kMaxNodes; ++i) {
        NetNode &node = table->node[i];
        node.id = i;
        node.index = i;
        if (!allocate(node)) {
            return -1;
        }
    }
    log_dated("exit  InitializeTable \n");
    return 0;
}

int GetNetTable(velk::NetTable *table) {
    using namespace velk;
    if (table == nullptr) {
        log_dated("GetNetTable :  (table ==NULL) ");
        return -1;
    }
    if (gettimestamp(&table->timestamp) != 0) {
        return discard_mapping("GetNetTable :  gettimestamp fail ");
    }
    log_dated_format("GetNetTable :  gettimestamp %d ", table->timestamp);
    if (read_node_number(*table) != 0) {
        return -1;
    }
    for (int i = 0; i < table->nodeNumber; ++i) {
        if (fill_node(table->node[i], i) != 0) {
            return -1;
        }
    }
    return 0;
}
