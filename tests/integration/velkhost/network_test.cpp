// `velkhost network`: the table by the shipped library, and the host that configures the network.
#include "tests/integration/velkhost/fixture.h"

#include <gmock/gmock.h>

#include <fstream>

namespace velkhost::testing {
namespace {

using ::testing::HasSubstr;
using ::testing::IsEmpty;

class VelkhostNetwork : public VelkhostTest {
  protected:
    // Runs it with this [network] and two nodes.
    Finished network(const std::string &settings, std::vector<std::string> arguments) {
        const auto scenario = write_file(
            "s.toml", "[network]\n" + settings +
                          "[[network.node]]\ndevice = '/dev/ipmi0'\nhypervisor = '10.0.0.1'\n"
                          "controller = '10.0.0.2'\n"
                          "[[network.node]]\ndevice = '/dev/ipmi1'\nhypervisor = '10.0.1.1'\n"
                          "controller = '10.0.1.2'\n");
        arguments.insert(arguments.begin(), {"network", "--scenario", scenario.string()});
        return velkhost(arguments);
    }

    nlohmann::json document(const std::string &settings, std::vector<std::string> arguments) {
        arguments.emplace_back("--json");
        const Finished finished = network(settings, arguments);
        EXPECT_EQ(finished.err, "");
        auto out = nlohmann::json::parse(finished.out, nullptr, false);
        EXPECT_FALSE(out.is_discarded()) << finished.out;
        EXPECT_EQ(out["exit_code"], finished.exit_code);
        return out;
    }
};

TEST_F(VelkhostNetwork, TableAndItsAgeAreShown) {
    const Finished finished = network("age = 1200\n", {});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_EQ(finished.err, "");
    EXPECT_EQ(finished.out, "In-band network of esxi-01.example.com, scenario " +
                                (place_ / "s.toml").string() +
                                "\n"
                                "made 2026-03-02T07:40:00Z, 1200 s ago\n"
                                "\n"
                                "node  device      hypervisor  controller\n"
                                "0     /dev/ipmi0  10.0.0.1    10.0.0.2\n"
                                "1     /dev/ipmi1  10.0.1.1    10.0.1.2\n");
    EXPECT_THAT(run_folders(), IsEmpty());
}

TEST_F(VelkhostNetwork, OldTableIsMadeAnew) {
    const auto made = document("age = 900\n", {"--configure", "if-old"});
    EXPECT_EQ(made["configure"]["done"], true);
    EXPECT_EQ(made["configure"]["seconds"], 15.0) << "it is looked for every five seconds";
    EXPECT_EQ(made["table"]["age_seconds"], 3);
}

TEST_F(VelkhostNetwork, YoungTableIsMadeAnewOnlyIfAskedTo) {
    const auto young = document("age = 899\n", {"--configure", "if-old"});
    EXPECT_EQ(young["configure"]["needed"], false);
    EXPECT_EQ(young["table"]["age_seconds"], 899);
    EXPECT_EQ(document("configure = 27\n", {"--configure", "always"})["configure"]["seconds"], 30);
}

TEST_F(VelkhostNetwork, HostThatDoesNothingIsNotWaitedForForEver) {
    const auto out = document("configure = 'never'\n", {"--configure", "always"});
    EXPECT_EQ(out["configure"]["done"], false);
    EXPECT_EQ(out["configure"]["seconds"], 130.0);
    EXPECT_EQ(out["exit_code"], 1);
    EXPECT_EQ(out["table"]["nodes"].size(), 2U) << "the old one";
}

TEST_F(VelkhostNetwork, HostThatIsTooSlowIsNotWaitedFor) {
    EXPECT_EQ(document("configure = 129\n", {"--configure", "always"})["exit_code"], 0);
    EXPECT_EQ(document("configure = 131\n", {"--configure", "always"})["exit_code"], 1);
}

TEST_F(VelkhostNetwork, HostWithoutNodesHasNoTable) {
    const Finished finished = velkhost({"network"});
    EXPECT_EQ(finished.exit_code, 1);
    EXPECT_THAT(finished.out, HasSubstr("no usable table: GetNetTable :  gettimestamp fail\n"));
    EXPECT_THAT(run_folders(), IsEmpty());
}

TEST_F(VelkhostNetwork, MappingThatCannotBeUsedIsGoneAfterwards) {
    const auto root = place_ / "root";
    const auto mapping = root / "etc/cim/zeb/nodemapping";
    std::filesystem::create_directories(mapping.parent_path());
    std::ofstream(mapping) << "RXC IN-Band Network Mappings: 5\nheading\nnode 0 /dev/ipmi0 m e\n";
    const Finished finished = velkhost({"network", "--root", root.string()});
    EXPECT_EQ(finished.exit_code, 1);
    EXPECT_THAT(finished.out, HasSubstr("no usable table: GetNetTable :   0 getRXCIP fail\n"));
    EXPECT_FALSE(std::filesystem::exists(mapping));
}

TEST_F(VelkhostNetwork, TableThatWasMadeAnewStaysInItsRoot) {
    const auto root = place_ / "root";
    network("age = 5000\n", {"--root", root.string(), "--configure", "always"});
    std::ifstream mapping(root / "etc/cim/zeb/nodemapping");
    std::string line;
    std::getline(mapping, line);
    EXPECT_EQ(line, "RXC IN-Band Network Mappings: 1772438412");
    EXPECT_FALSE(std::filesystem::exists(root / "tmp/networkflag"));
}

TEST_F(VelkhostNetwork, FiveNodesAreCutToFour) {
    std::string nodes;
    for (const char *number : {"2", "3", "4"}) {
        nodes += "[[network.node]]\ndevice = 'd" + std::string(number) +
                 "'\nhypervisor = 'h'\ncontroller = 'c'\n";
    }
    const auto out = document(nodes, {});
    EXPECT_EQ(out["table"]["nodes"].size(), 4U);
}

TEST_F(VelkhostNetwork, WrongArgumentsAreTwo) {
    EXPECT_EQ(velkhost({"network", "--configure", "maybe"}).exit_code, 2);
    EXPECT_EQ(velkhost({"network", "--clock", "fast"}).exit_code, 2);
    EXPECT_EQ(velkhost({"network", "extra"}).exit_code, 2);
    EXPECT_EQ(velkhost({"network", "--scenario", "/no/such.toml"}).exit_code, 4);
}

}  // namespace
}  // namespace velkhost::testing
