// The network table: making it, filling it, and what becomes of a mapping that cannot be used.

#include "ipmi/network_table.h"

#include <cstdlib>

#include "tests/unit/library/network_fixture.h"

namespace {

using velktest::dated;

// A table as its owner keeps it.
struct OwnedTable {
    velk::NetTable table{};
    OwnedTable() = default;
    OwnedTable(const OwnedTable &) = delete;
    OwnedTable &operator=(const OwnedTable &) = delete;
    ~OwnedTable() {
        for (velk::NetNode &node : table.node) {
            for (char *text : {node.ipmiDev, node.spare, node.esxiIp, node.rxcIp}) {
                std::free(text);  // NOLINT: made with malloc, for owners in C
            }
        }
    }
};

class NetworkTable : public velktest::NetworkTest {
  protected:
    void SetUp() override {
        ASSERT_EQ(InitializeTable(&owned_.table), 0);
        clear_log();
    }

    // Expects that the mapping is refused and deleted, with these lines at the end.
    void expect_refused(const std::vector<std::string_view> &lines) {
        EXPECT_EQ(GetNetTable(&owned_.table), -1);
        EXPECT_FALSE(mapping_exists());
        EXPECT_EQ(log(), dated("gettimestamp :  enter.") + dated(lines));
    }

    OwnedTable owned_;
    velk::NetTable &table_ = owned_.table;
};

std::string node_line(int node) {
    const std::string number = std::to_string(node);
    return "node " + number + " /dev/ipmi" + number + " 255.255.0.0 169.254." + number +
           ".1 169.254." + number + ".2\n";
}

}  // namespace

TEST_F(NetworkTable, IsMadeWithNumberedEntriesAndBuffersOfTheirOwn) {
    OwnedTable made;
    made.table.nodeNumber = 3;
    EXPECT_EQ(InitializeTable(&made.table), 0);
    EXPECT_EQ(made.table.nodeNumber, 0);
    for (int i = 0; i < 4; ++i) {
        const velk::NetNode &node = made.table.node[i];
        EXPECT_EQ(node.id, i);
        EXPECT_EQ(node.index, i);
        for (const char *text : {node.ipmiDev, node.spare, node.esxiIp, node.rxcIp}) {
            EXPECT_EQ(std::string(text, 20), std::string(20, '\0'));
        }
    }
    EXPECT_EQ(log(), dated("enter  InitializeTable \n") + dated("exit  InitializeTable \n"));
}

TEST_F(NetworkTable, IsNotMadeFromNothing) {
    EXPECT_EQ(InitializeTable(nullptr), -1);
    EXPECT_EQ(log(), dated("enter  InitializeTable \n"));
}

TEST_F(NetworkTable, IsFilledNodeByNode) {
    write_nodes(1726300800, node_line(0) + node_line(1));
    EXPECT_EQ(GetNetTable(&table_), 0);
    EXPECT_EQ(table_.timestamp, 1726300800);
    EXPECT_EQ(table_.nodeNumber, 2);
    EXPECT_STREQ(table_.node[1].ipmiDev, "/dev/ipmi1");
    EXPECT_STREQ(table_.node[1].esxiIp, "169.254.1.1");
    EXPECT_STREQ(table_.node[1].rxcIp, "169.254.1.2");
    EXPECT_STREQ(table_.node[1].spare, "");
    EXPECT_STREQ(table_.node[2].ipmiDev, "");
    EXPECT_TRUE(mapping_exists());
    EXPECT_EQ(log(), dated({"gettimestamp :  enter.", "GetNetTable :  gettimestamp 1726300800 ",
                            "GetNetTable :   0 ipmi dev  /dev/ipmi0  ",
                            "GetNetTable :   0 rxc ip  169.254.0.2  ",
                            "GetNetTable :   0 ESXi ip  169.254.0.1  ",
                            "GetNetTable :   1 ipmi dev  /dev/ipmi1  ",
                            "GetNetTable :   1 rxc ip  169.254.1.2  ",
                            "GetNetTable :   1 ESXi ip  169.254.1.1  "}));
}

TEST_F(NetworkTable, HoldsFourNodesHoweverManyLinesThereAre) {
    std::string nodes;
    for (int i = 0; i < 9; ++i) {
        nodes += node_line(i);
    }
    write_nodes(1, nodes);
    EXPECT_EQ(GetNetTable(&table_), 0);
    EXPECT_EQ(table_.nodeNumber, 4);
    EXPECT_STREQ(table_.node[3].ipmiDev, "/dev/ipmi3");
    EXPECT_TRUE(mapping_exists());
}

TEST_F(NetworkTable, LongTextsAreCutInsideTheirBuffers) {
    write_nodes(1, "node 0 " + std::string(90, 'd') + " m " + std::string(90, 'e') + " " +
                       std::string(50, 'r') + "\n");
    EXPECT_EQ(GetNetTable(&table_), 0);
    EXPECT_EQ(table_.node[0].ipmiDev, std::string(19, 'd'));
    EXPECT_EQ(table_.node[0].esxiIp, std::string(19, 'e'));
    EXPECT_EQ(table_.node[0].rxcIp, std::string(19, 'r'));
}

TEST_F(NetworkTable, NullTableIsRefusedAndKeepsTheMapping) {
    write_nodes(1, node_line(0));
    EXPECT_EQ(GetNetTable(nullptr), -1);
    EXPECT_EQ(log(), dated("GetNetTable :  (table ==NULL) "));
    EXPECT_TRUE(mapping_exists());
}

TEST_F(NetworkTable, MappingWithoutAStampIsDeleted) {
    write_mapping("heading\n" + node_line(0));
    expect_refused({"GetNetTable :  gettimestamp fail "});
}

TEST_F(NetworkTable, AbsentMappingFailsAtTheStamp) {
    expect_refused({"GetNetTable :  gettimestamp fail "});
}

TEST_F(NetworkTable, MappingWithoutNodesIsDeleted) {
    write_nodes(5, "");
    expect_refused({"GetNetTable :  gettimestamp 5 ", "GetNetTable :  nodeNumber 0 "});
    EXPECT_EQ(table_.nodeNumber, 0);
}

TEST_F(NetworkTable, MappingOfAStampAloneIsDeleted) {
    write_mapping(velktest::kMarker + "5\n");
    expect_refused({"GetNetTable :  gettimestamp 5 ", "GetNetTable :  nodeNumber -1 "});
}

TEST_F(NetworkTable, NodeWithoutAControllersAddressIsRefused) {
    write_nodes(5, "node 0 /dev/ipmi0 m e\n");
    expect_refused({"GetNetTable :  gettimestamp 5 ", "GetNetTable :   0 getRXCIP fail "});
}

TEST_F(NetworkTable, NodesMustBeNumberedFromZero) {
    write_nodes(5, node_line(0) + node_line(2));
    EXPECT_EQ(GetNetTable(&table_), -1);
    EXPECT_FALSE(mapping_exists());
    EXPECT_TRUE(log().ends_with(dated("GetNetTable :   1 getRXCIP fail ")));
    EXPECT_STREQ(table_.node[0].rxcIp, "169.254.0.2") << "what was read before stays";
}
