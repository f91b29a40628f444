// The hypervisor's installation service: its instances, its arguments, and what scenarios make of
// it.
#include "providers_hypervisor_fixture.h"

namespace velkhost::providers::testing {
namespace {

using cim::Value;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

class HypervisorService : public HypervisorProvider {
  protected:
    // Names of the systems of the class's instances.
    std::vector<std::string> systems_of(const std::string &class_name, const char *key) {
        std::vector<std::string> out;
        for (const cim::Instance &instance : instances(class_name)) {
            out.push_back(text(instance.path.keys, key));
        }
        return out;
    }
};

TEST_F(HypervisorService, IsTheHostsByDefault) {
    const auto found = instances("VMware_SoftwareInstallationService");
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0].path, service());
    const auto systems = instances("OMC_UnitaryComputerSystem");
    ASSERT_EQ(systems.size(), 1U);
    EXPECT_EQ(systems[0].path, target());
}

TEST_F(HypervisorService, HasAnInstanceForEverySystemInTheirOrder) {
    play("[hypervisor]\nsystems = ['b', 'a', 'c']\n");
    EXPECT_THAT(systems_of("VMware_SoftwareInstallationService", "SystemName"),
                ElementsAre("b", "a", "c"));
    EXPECT_THAT(systems_of("OMC_UnitaryComputerSystem", "Name"), ElementsAre("b", "a", "c"));
}

TEST_F(HypervisorService, MayBeAbsent) {
    play("[hypervisor]\nsystems = []\n");
    EXPECT_THAT(systems_of("VMware_SoftwareInstallationService", "SystemName"), IsEmpty());
    EXPECT_EQ(install(depot_.write()).status.code, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(HypervisorService, StartsAJobAndNamesIt) {
    const auto reply = install(depot_.write());
    EXPECT_EQ(reply.return_value, Value::uint32(4096));
    const Value *job = reply.out.find("Job");
    ASSERT_NE(job, nullptr);
    ASSERT_NE(job->as_path(), nullptr);
    const auto found = broker_.get_instance(*job->as_path());
    ASSERT_TRUE(found.status.ok()) << found.status.message;
    EXPECT_EQ(text(found.instance->properties, "URI"), "file://" + depot_.archive().string());
}

TEST_F(HypervisorService, UpdatesTheSystemThatItBelongsTo) {
    play("[hypervisor]\nsystems = ['host-1', 'host-2']\n");
    const std::string uri = depot_.write();
    const auto install_on = [&](const std::string &one, const std::string &other) {
        return broker_
            .invoke_method(
                service(one), "InstallFromURI",
                {{"URI", Value::string(uri)}, {"Target", Value::reference(target(other))}})
            .return_value;
    };
    EXPECT_EQ(install_on("host-1", "host-2"), Value::uint32(4097));
    EXPECT_EQ(install_on("host-2", "host-2"), Value::uint32(4096));
    EXPECT_EQ(look().size(), 1U);
}

TEST_F(HypervisorService, ArgumentsAreChecked) {
    const auto message = [&](const cim::NamedValues &in) {
        const auto reply = broker_.invoke_method(service(), "InstallFromURI", in);
        EXPECT_EQ(reply.status.code, CMPI_RC_ERR_INVALID_PARAMETER);
        return reply.status.message;
    };
    EXPECT_EQ(message({}), "Parameter URI is missing or null");
    EXPECT_EQ(message({{"URI", Value::uint32(0)}}), "Parameter URI must be a string");
    EXPECT_EQ(message({{"URI", Value::string("file:///x")}}),
              "Parameter Target is missing or null");
}

TEST_F(HypervisorService, OtherPathsAndMethodsAreNotFound) {
    EXPECT_EQ(broker_.invoke_method(service("host-9"), "InstallFromURI").status.code,
              CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(
        broker_.invoke_method(class_path("VMware_SoftwareInstallationService"), "InstallFromURI")
            .status.code,
        CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(broker_.invoke_method(service(), "CheckSoftwareIdentity").status.code,
              CMPI_RC_ERR_METHOD_NOT_FOUND);
}

TEST_F(HypervisorService, ScenarioAnswersInTurn) {
    play(
        "[host]\nnode = 'host-1'\n"
        "[[hypervisor.answer]]\nstatus = 1\nmessage = 'host is in use'\n"
        "[[hypervisor.answer]]\nreturn_value = 4107\n"
        "[[hypervisor.answer]]\n");
    const std::string uri = depot_.write();
    EXPECT_EQ(install(uri).status, (broker::Status{CMPI_RC_ERR_FAILED, "host is in use"}));
    EXPECT_EQ(install(uri).return_value, Value::uint32(4107));
    EXPECT_THAT(look(), IsEmpty());
    EXPECT_EQ(install(uri).return_value, Value::uint32(4096));
    EXPECT_THAT(look(), ElementsAre(kScanning));
}

TEST_F(HypervisorService, ScenariosJobNeedsNoBundle) {
    play(
        "[host]\nnode = 'host-1'\n[[hypervisor.answer]]\nmatch = 'ftp://'\n"
        "job = [{ status = 'A' }, {}, { absent = true }, { status = 'B', looks = 2 }, "
        "{ status = 'C' }]\n");
    EXPECT_EQ(install("ftp://server/metadata.zip").return_value, Value::uint32(4096));
    EXPECT_THAT(looks(7), ElementsAre("A", "(none)", "(no job)", "B", "B", "C", "C"));
}

TEST_F(HypervisorService, AnswerMayStartNoJobThatIsSeen) {
    play(
        "[host]\nnode = 'host-1'\n[hypervisor]\nearlier_jobs = ['before']\n"
        "[[hypervisor.answer]]\njob = []\n");
    EXPECT_EQ(install(depot_.write()).return_value, Value::uint32(4096));
    EXPECT_THAT(look(), ElementsAre("before"));
}

TEST_F(HypervisorService, FaultsStrikeItsSteps) {
    play(
        "[host]\nnode = 'host-1'\n"
        "[[fault]]\nstep = 'hypervisor.install'\nmatch = 'metadata.zip'\ncode = 1\nmessage = 'a'\n"
        "[[fault]]\nstep = 'hypervisor.jobs'\nafter = 1\ncode = 1\nmessage = 'b'\n");
    EXPECT_EQ(install(depot_.write()).status.message, "a");
    EXPECT_EQ(install(depot_.write()).return_value, Value::uint32(4096));
    EXPECT_THAT(look(), ElementsAre(kScanning));
    EXPECT_EQ(broker_.enumerate_instances(class_path("VMware_ConcreteJob")).status.message, "b");
    EXPECT_THAT(look(), ElementsAre(kUpdating)) << "the fault used up no look";
}

}  // namespace
}  // namespace velkhost::providers::testing
