// The services that take a whole unpacked package: Broadcom's, which is asked how far it is, and
// LSI's, which returns when all is over.
#include "providers_adapter_fixture.h"

namespace velkhost::providers::testing {
namespace {

using cim::NamedValues;
using cim::Value;
using ::testing::ElementsAre;

cim::ObjectPath fixed_path(const std::string &name_space, const std::string &prefix) {
    return {"",
            name_space,
            prefix + "_SoftwareInstallationService",
            {{"SystemCreationClassName", Value::string(prefix + " Provider")},
             {"SystemName", Value::string("Management Controller")},
             {"CreationClassName", Value::string(prefix + "_SoftwareInstallationService")},
             {"Name", Value::string(prefix + "SoftwareInstallationService")}}};
}

class BroadcomProvider : public AdapterProvider {
  protected:
    BroadcomProvider() { play_with(""); }

    void play_with(const std::string &text) {
        play("[[adapter]]\nfamily = 'broadcom'\ndfn = 'B1'\nnic_ports = ['p1']\n" + text);
    }
    static cim::ObjectPath service() { return fixed_path("brcmfwup/cimv2", "BRCMFWUP"); }
    broker::MethodReply install(const std::string &place, const std::string &option = "asyn") {
        return broker_.invoke_method(
            service(), "InstallFromURI",
            {{"URI", Value::string(place)}, {"FacadeOption", Value::string(option)}});
    }
    broker::MethodReply check(const std::string &id = "0") {
        return broker_.invoke_method(service(), "CheckStatus", {{"ID", Value::string(id)}});
    }
    // The output of the next checks; 999999: none.
    std::vector<std::uint64_t> statuses(int count) {
        std::vector<std::uint64_t> out;
        for (int look = 0; look < count; ++look) {
            out.push_back(number(check().out, "status"));
        }
        return out;
    }
};

TEST_F(BroadcomProvider, ServiceHasItsFixedKeys) {
    EXPECT_EQ(path_at(class_path("brcmfwup/cimv2", "BRCMFWUP_SoftwareInstallationService")),
              service());
}

TEST_F(BroadcomProvider, UpdateRunsAndIsDone) {
    const auto reply = install(unpack("B1"));
    EXPECT_EQ(reply.return_value, Value::uint32(4096));
    EXPECT_TRUE(reply.out.empty());
    EXPECT_THAT(statuses(5), ElementsAre(1, 1, 1, 0, 0));
    EXPECT_EQ(check().return_value, Value::uint32(0));
}

TEST_F(BroadcomProvider, ScenarioDecidesWhatEachCheckSees) {
    play_with(
        "[[broadcom.answer]]\nmatch = 'fw.bin'\njob = [{}, { absent = true }, { state = 7 }]");
    install(unpack("B1"));
    EXPECT_THAT(statuses(3), ElementsAre(1, 999999, 7));
}

TEST_F(BroadcomProvider, LaterUpdateIsTheLatest) {
    play_with("[[broadcom.answer]]\njob = [{ state = 9 }]\n[[broadcom.answer]]");
    install(unpack("B1"));
    EXPECT_THAT(statuses(2), ElementsAre(9, 9));
    install(unpack("B1"));
    EXPECT_THAT(statuses(1), ElementsAre(1));
}

TEST_F(BroadcomProvider, UpdateThatIsNotKnownHasNoStatus) {
    EXPECT_EQ(check().return_value, Value::uint32(2));
    EXPECT_TRUE(check().out.empty());
    install(unpack("B1"));
    EXPECT_EQ(check("17").return_value, Value::uint32(2));
    EXPECT_THAT(statuses(1), ElementsAre(1)) << "no look was used up";
}

TEST_F(BroadcomProvider, ObstaclesAreReturned) {
    EXPECT_EQ(install("/nonexistent").return_value, Value::uint32(4107));
    EXPECT_EQ(install("relative/path").return_value, Value::uint32(4107));
    EXPECT_EQ(install(unpack("B1"), "sync").return_value, Value::uint32(5));
    EXPECT_EQ(install(unpack("B2")).return_value, Value::uint32(4097));
    std::filesystem::remove(folder_ / "package/image/fw.bin");
    EXPECT_EQ(install(unpack("B1", "")).return_value, Value::uint32(4107));
    EXPECT_EQ(check().return_value, Value::uint32(2)) << "nothing was begun";
}

TEST_F(BroadcomProvider, ArgumentsAreChecked) {
    const auto message = [&](const char *method, const NamedValues &in) {
        const auto reply = broker_.invoke_method(service(), method, in);
        EXPECT_EQ(reply.status.code, CMPI_RC_ERR_INVALID_PARAMETER);
        return reply.status.message;
    };
    EXPECT_EQ(message("InstallFromURI", {}), "Parameter URI is missing or null");
    EXPECT_EQ(message("InstallFromURI", {{"URI", Value::string("/x")}}),
              "Parameter FacadeOption is missing or null");
    EXPECT_EQ(message("CheckStatus", {}), "Parameter ID is missing or null");
    EXPECT_EQ(message("CheckStatus", {{"ID", Value::uint32(0)}}), "Parameter ID must be a string");
}

TEST_F(BroadcomProvider, WrongKeysAndMethodsAreNotFound) {
    cim::ObjectPath wrong = service();
    wrong.keys.set("Name", Value::string("x"));
    for (const char *method : {"InstallFromURI", "CheckStatus"}) {
        EXPECT_EQ(broker_.invoke_method(wrong, method).status.code, CMPI_RC_ERR_NOT_FOUND);
    }
    EXPECT_EQ(broker_.invoke_method(service(), "Check").status.code, CMPI_RC_ERR_METHOD_NOT_FOUND);
}

TEST_F(BroadcomProvider, FaultsStrikeTheirSteps) {
    play_with(
        "[[fault]]\nstep = 'broadcom.install'\nmatch = 'fw.bin'\ncode = 1\nmessage = 'a'\n"
        "[[fault]]\nstep = 'broadcom.status'\nmatch = 'fw.bin'\ncode = 1\nmessage = 'b'\n");
    EXPECT_EQ(install(unpack("B1")).status.message, "a");
    EXPECT_EQ(install(unpack("B1")).return_value, Value::uint32(4096));
    EXPECT_EQ(check().status.message, "b");
    EXPECT_THAT(statuses(1), ElementsAre(1));
}

class LsiProvider : public AdapterProvider {
  protected:
    LsiProvider() { play_with(""); }

    void play_with(const std::string &text) {
        play("[[adapter]]\nfamily = 'lsi'\ndfn = 'L1'\n" + text);
    }
    broker::MethodReply install(const std::string &place) {
        return broker_.invoke_method(fixed_path("tavu/cimv2", "TAVU"), "InstallFromURI",
                                     {{"URI", Value::string(place)}});
    }
};

TEST_F(LsiProvider, ServiceHasItsFixedKeys) {
    EXPECT_EQ(path_at(class_path("tavu/cimv2", "TAVU_SoftwareInstallationService")),
              fixed_path("tavu/cimv2", "TAVU"));
}

TEST_F(LsiProvider, PackageIsInstalledAtOnceFromAPathOrALocation) {
    EXPECT_EQ(install(unpack("L1")).return_value, Value::uint32(0));
    EXPECT_EQ(install("file://" + unpack("L1")).return_value, Value::uint32(0));
}

TEST_F(LsiProvider, PackageForOtherControllersDoesNotApply) {
    EXPECT_EQ(install(unpack("L2")).return_value, Value::uint32(13));
    EXPECT_EQ(install(unpack("L")).return_value, Value::uint32(13));
    play("");
    EXPECT_EQ(install(unpack("L1")).return_value, Value::uint32(13));
}

TEST_F(LsiProvider, WhatIsNoPackageIsNotAccessible) {
    EXPECT_EQ(install(folder_.string()).return_value, Value::uint32(4107));
    EXPECT_EQ(install(unpack("L1", "")).return_value, Value::uint32(4107));
    EXPECT_EQ(broker_.invoke_method(fixed_path("tavu/cimv2", "TAVU"), "InstallFromURI").status.code,
              CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(LsiProvider, ScenarioAnswers) {
    play_with(
        "[[lsi.answer]]\nmatch = 'fw.bin'\nreturn_value = 12\n"
        "[[lsi.answer]]\nmatch = 'fw.bin'\nstatus = 1\nmessage = 'busy'\n");
    EXPECT_EQ(install(unpack("L1")).return_value, Value::uint32(12));
    EXPECT_EQ(install(unpack("L1")).status, (broker::Status{CMPI_RC_ERR_FAILED, "busy"}));
}

TEST_F(LsiProvider, FaultStrikesTheInstall) {
    play_with("[[fault]]\nstep = 'lsi.install'\ncode = 4\nmessage = 'x'");
    EXPECT_EQ(install(unpack("L1")).status.message, "x");
    EXPECT_EQ(install(unpack("L1")).return_value, Value::uint32(0));
}

}  // namespace
}  // namespace velkhost::providers::testing
