// The mapping file of the in-band network: its stamp, its node lines, and what is read from them.

#include "ipmi/node_mapping.h"

#include <array>
#include <climits>

#include "tests/unit/library/network_fixture.h"

namespace {

using velktest::dated;
using velktest::kHeading;
using velktest::kMarker;
using velktest::kTestBegin;

class NodeMapping : public velktest::NetworkTest {
  protected:
    static int stamp() {
        int value = -7;
        EXPECT_EQ(gettimestamp(&value), 0);
        return value;
    }

    static int node_number() {
        int count = -7;
        EXPECT_EQ(getNodeNumber(&count), 0);
        return count;
    }

    // One of the three look-ups, into a buffer of 20 bytes between two guards.
    static std::string look_up(int (*function)(char *, int), int node) {
        std::array<char, 40> room;
        room.fill('#');
        EXPECT_EQ(function(&room[10], node), 0);
        EXPECT_EQ(std::string(room.data(), 10), "##########");
        EXPECT_EQ(std::string(&room[30], 10), "##########") << "written behind the buffer";
        return &room[10];
    }

    // As a look-up that finds nothing: 1, and the buffer as it was.
    static bool finds_nothing(int (*function)(char *, int), int node) {
        std::array<char, 20> room{"untouched"};
        return function(room.data(), node) == 1 && std::string(room.data()) == "untouched";
    }
};

const std::string kNodeZero = "node 0 /dev/ipmi0 255.255.0.0 169.254.1.1 169.254.1.2\n";
const std::string kNodeOne = "node 1 /dev/ipmi1 255.255.0.0 169.254.2.1 169.254.2.2\n";

}  // namespace

TEST_F(NodeMapping, NodesAreTheLinesBehindStampAndHeading) {
    write_nodes(1, kNodeZero + kNodeOne);
    EXPECT_EQ(node_number(), 2);
}

TEST_F(NodeMapping, EmptyFileHasMinusTwoNodes) {
    write_mapping("");
    EXPECT_EQ(node_number(), -2);
}

TEST_F(NodeMapping, LinesOfLessThanTwoCharactersAreNotCounted) {
    write_nodes(1, "\n" + kNodeZero + "\n\n" + kNodeOne + "x");
    EXPECT_EQ(node_number(), 2);
}

TEST_F(NodeMapping, NumberOfNodesIsZeroWithoutAFile) {
    int count = -7;
    EXPECT_EQ(getNodeNumber(&count), 1);
    EXPECT_EQ(count, 0);
    EXPECT_EQ(getNodeNumber(nullptr), -1);
}

TEST_F(NodeMapping, StampIsTheNumberBehindItsMarker) {
    write_nodes(1726300800, kNodeZero);
    EXPECT_EQ(stamp(), 1726300800);
    EXPECT_EQ(log(), dated("gettimestamp :  enter."));
}

TEST_F(NodeMapping, BlanksAroundTheStampAreSkipped) {
    write_mapping(kMarker + " \t\r 42 \t rest\n");
    EXPECT_EQ(stamp(), 42);
}

TEST_F(NodeMapping, StampOfMoreThanTwelveCharactersIsCutThere) {
    write_mapping(kMarker + "0000000001239\n");
    EXPECT_EQ(stamp(), 123);
}

TEST_F(NodeMapping, StampBeyondTheRangeOfAnIntegerStaysAtItsEnd) {
    write_mapping(kMarker + "999999999999\n");
    EXPECT_EQ(stamp(), INT_MAX);
    write_mapping(kMarker + "-99999999999\n");
    EXPECT_EQ(stamp(), INT_MIN);
}

TEST_F(NodeMapping, StampWithoutANumberIsZero) {
    for (const char *text : {"", "soon", "\n"}) {
        write_mapping(kMarker + text);
        EXPECT_EQ(stamp(), 0) << text;
    }
}

TEST_F(NodeMapping, StampIsTakenFromTheFirstLineThatHasTheMarker) {
    write_mapping("heading\n" + kMarker + "5\n" + kMarker + "6\n");
    EXPECT_EQ(stamp(), 5);
}

TEST_F(NodeMapping, MarkerThatDoesNotOpenItsLineMovesTheDigits) {
    write_mapping("# " + kMarker + "77\n");
    EXPECT_EQ(stamp(), 0) << "position 29 is still inside the marker";
}

TEST_F(NodeMapping, StampFailsWithoutAFileAMarkerOrARoom) {
    int value = -7;
    EXPECT_EQ(gettimestamp(&value), -1);
    write_mapping(kHeading);
    EXPECT_EQ(gettimestamp(&value), -1);
    write_nodes(1, "");
    EXPECT_EQ(gettimestamp(nullptr), -1);
    EXPECT_EQ(value, -7);
}

TEST_F(NodeMapping, UpdateSetsTheStampToNow) {
    write_nodes(1, kNodeZero);
    EXPECT_EQ(updatetimestamp(0), 0);
    EXPECT_EQ(mapping_text(), kMarker + std::to_string(kTestBegin) + "\n" + kHeading + kNodeZero);
}

TEST_F(NodeMapping, UpdateSetsTheStampToZero) {
    write_nodes(1, kNodeZero);
    EXPECT_EQ(updatetimestamp(1), 0);
    EXPECT_EQ(mapping_text(), kMarker + "0\n" + kHeading + kNodeZero);
}

TEST_F(NodeMapping, UpdateOfAnyOtherModeKeepsTheStamp) {
    for (const int mode : {2, -1, 77}) {
        write_nodes(1234, kNodeZero);
        EXPECT_EQ(updatetimestamp(mode), 0);
        EXPECT_EQ(mapping_text(), kMarker + "1234\n" + kHeading + kNodeZero) << mode;
    }
}

TEST_F(NodeMapping, UpdateKeepsSevenLines) {
    write_nodes(1, "3\n\n4-\n5-\n6-\n7-\n8-\n9-\n");
    EXPECT_EQ(updatetimestamp(1), 0);
    EXPECT_EQ(mapping_text(), kMarker + "0\n" + kHeading + "3\n4-\n5-\n6-\n7-\n");
}

TEST_F(NodeMapping, UpdateOfAnEmptyFileWritesTheStampAlone) {
    write_mapping("");
    EXPECT_EQ(updatetimestamp(1), 0);
    EXPECT_EQ(mapping_text(), kMarker + "0\n");
}

TEST_F(NodeMapping, UpdateFailsWithoutAFile) {
    EXPECT_EQ(updatetimestamp(0), 1);
    EXPECT_FALSE(mapping_exists());
}

TEST_F(NodeMapping, LineOfTheLongestKindIsKeptWhole) {
    const std::string line(254, 'x');
    write_nodes(1, line + "\n" + kNodeZero);
    EXPECT_EQ(updatetimestamp(1), 0);
    EXPECT_EQ(mapping_text(), kMarker + "0\n" + kHeading + line + "\n" + kNodeZero);
}

TEST_F(NodeMapping, LookUpsTakeTheThirdFifthAndSixthToken) {
    write_nodes(1, kNodeZero + kNodeOne);
    EXPECT_EQ(look_up(getIPMI, 1), "/dev/ipmi1");
    EXPECT_EQ(look_up(getESXiIP, 1), "169.254.2.1");
    EXPECT_EQ(look_up(getRXCIP, 1), "169.254.2.2");
    EXPECT_EQ(look_up(getRXCIP, 0), "169.254.1.2");
}

TEST_F(NodeMapping, NodeIsFoundByTheTextOfItsNumber) {
    write_nodes(1, "node 01 /dev/ipmi1 m e r\n");
    EXPECT_TRUE(finds_nothing(getIPMI, 1));
    write_nodes(1, "node 1x /dev/ipmi1 m e r\nnode -1 /dev/ipmi9 m e r\n");
    EXPECT_TRUE(finds_nothing(getIPMI, 1));
    EXPECT_EQ(look_up(getIPMI, -1), "/dev/ipmi9");
}

TEST_F(NodeMapping, LabelIsIgnored) {
    write_nodes(1, "1 0 /dev/ipmi0 m e r\n");
    EXPECT_TRUE(finds_nothing(getIPMI, 1));
    EXPECT_EQ(look_up(getIPMI, 0), "/dev/ipmi0");
}

TEST_F(NodeMapping, LinesThatLackATokenAreIncomplete) {
    write_nodes(1, "node 0 /dev/ipmi0 m e\n");
    EXPECT_EQ(look_up(getESXiIP, 0), "e");
    EXPECT_TRUE(finds_nothing(getRXCIP, 0));
}

TEST_F(NodeMapping, LaterLineOfTheSameNodeHasWhatTheFirstLacks) {
    write_nodes(1, "node 0 /dev/ipmi0\nnode 0 other m e r\n");
    EXPECT_EQ(look_up(getIPMI, 0), "/dev/ipmi0");
    EXPECT_EQ(look_up(getRXCIP, 0), "r");
}

TEST_F(NodeMapping, SeveralBlanksSeparateLikeOne) {
    write_nodes(1, "node  0   /dev/ipmi0 m  e  r\n");
    EXPECT_EQ(look_up(getRXCIP, 0), "r");
}

TEST_F(NodeMapping, StampAndHeadingAreNoNodes) {
    write_mapping("node 0 a m e r\nnode 1 b m e r\nnode 2 c m e r\n");
    EXPECT_TRUE(finds_nothing(getIPMI, 0));
    EXPECT_TRUE(finds_nothing(getIPMI, 1));
    EXPECT_EQ(look_up(getIPMI, 2), "c");
}

TEST_F(NodeMapping, TokensAreCutToNineteenCharacters) {
    write_nodes(
        1, "node 0 " + std::string(60, 'd') + " m 1234567890123456789 " + "12345678901234567890\n");
    EXPECT_EQ(look_up(getIPMI, 0), std::string(19, 'd'));
    EXPECT_EQ(look_up(getESXiIP, 0), "1234567890123456789");
    EXPECT_EQ(look_up(getRXCIP, 0), "1234567890123456789");
}

TEST_F(NodeMapping, LastLineNeedsNoEnd) {
    write_nodes(1, "node 0 /dev/ipmi0 m e 10.0.0.1");
    EXPECT_EQ(look_up(getRXCIP, 0), "10.0.0.1");
}

TEST_F(NodeMapping, NothingIsFoundWithoutAFile) {
    EXPECT_TRUE(finds_nothing(getIPMI, 0));
    EXPECT_TRUE(finds_nothing(getESXiIP, 0));
    EXPECT_TRUE(finds_nothing(getRXCIP, 0));
    EXPECT_EQ(log(), "");
}
