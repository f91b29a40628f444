// What the QLogic provider shows of adapters, and the jobs of its services.
#include "providers_adapter_fixture.h"

namespace velkhost::providers::testing {
namespace {

using cim::Value;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class QlogicProvider : public AdapterProvider {
  protected:
    static cim::ObjectPath of(const std::string &name) { return class_path("qlogic/cimv2", name); }

    void play_with(const std::string &text) {
        play(
            "[[adapter]]\nfamily = 'qlogic'\ndfn = 'Q1'\nserial = 'S1'\nnic_ports = ['n1', 'n2']\n"
            "fc_ports = ['f1']\n[[adapter]]\nfamily = 'qlogic'\ndfn = ' Q2 '\nserial = 'S2'\n"
            "fc_ports = ['f2']\n" +
            text);
    }
    broker::InstancesReply ports(const std::string &kind, std::size_t adapter) {
        return associated(path_at(of("QLogic_Adapter_PhysicalPackage"), adapter),
                          "QLogic_" + kind + "_PhysicalPackagePortController",
                          "QLogic_" + kind + "_PortController");
    }

    broker::MethodReply install(const std::string &uri) {
        return broker_.invoke_method(
            path_at(of("QLogic_NIC_SoftwareInstallationService")), "InstallFromURI",
            {{"URI", Value::string(uri)},
             {"InstallOptions", Value::array(CMPI_uint16, {Value::uint16(32768)})},
             {"Target", Value::reference(path_at(of("QLogic_NIC_PortController")))}});
    }
    cim::ObjectPath start(const std::string &uri) {
        const broker::MethodReply reply = install(uri);
        const cim::Value *job = reply.out.find("Job");
        EXPECT_TRUE(job != nullptr) << reply.status.message;
        return job == nullptr || job->as_path() == nullptr ? cim::ObjectPath{} : *job->as_path();
    }
    // JobState of the next reads; 0: the job cannot be had.
    std::vector<std::uint64_t> states(const cim::ObjectPath &job, int count) {
        std::vector<std::uint64_t> out;
        for (int read = 0; read < count; ++read) {
            const broker::InstanceReply reply = broker_.get_instance(job);
            out.push_back(reply.instance ? number(reply.instance->properties, "JobState") : 0);
        }
        return out;
    }
};

TEST_F(QlogicProvider, AdaptersTellModelAndSerialNumber) {
    play_with("");
    const auto adapters = of("QLogic_Adapter_PhysicalPackage");
    EXPECT_THAT(texts(adapters, "Model"), ElementsAre("Q1", " Q2 "));
    EXPECT_THAT(texts(adapters, "SerialNumber"), ElementsAre("S1", "S2"));
}

TEST_F(QlogicProvider, AdapterLeadsToItsPortControllersOfEitherKind) {
    play_with("");
    EXPECT_THAT(texts_of(ports("NIC", 0), "DeviceID"), ElementsAre("n1", "n2"));
    EXPECT_THAT(texts_of(ports("FCHBA", 0), "DeviceID"), ElementsAre("f1"));
    EXPECT_THAT(ports("NIC", 1).instances, IsEmpty());
    EXPECT_TRUE(ports("NIC", 1).status.ok());
    EXPECT_THAT(texts_of(ports("FCHBA", 1), "DeviceID"), ElementsAre("f2"));
}

TEST_F(QlogicProvider, PortControllerLeadsBackToItsAdapter) {
    play_with("");
    const auto reply = associated(path_at(of("QLogic_FCHBA_PortController"), 1), "CIM_Realizes",
                                  "QLogic_Adapter_PhysicalPackage");
    EXPECT_THAT(texts_of(reply, "SerialNumber"), ElementsAre("S2"));
}

TEST_F(QlogicProvider, UsualJobIsRunningFromItsFirstLookOn) {
    play_with("");
    const std::string uri = make_file("fw.bin");
    const auto job = start(uri);
    EXPECT_EQ(job.class_name, "QLogic_SoftwareInstallationJob");
    EXPECT_THAT(states(job, 5), ElementsAre(4, 4, 4, 4, 7));
    const auto done = broker_.get_instance(job);
    EXPECT_EQ(text(done.instance->properties, "URI"), uri);
    EXPECT_EQ(text(done.instance->properties, "JobStatus"), "Update completed");
    EXPECT_EQ(number(done.instance->properties, "PercentComplete"), 100U);
}

TEST_F(QlogicProvider, ScenarioDecidesWhatEachReadSees) {
    play_with(
        "[[qlogic.answer]]\nmatch = 'fw'\njob = [{ percent = 5, looks = 2 }, { absent = true }, "
        "{ state = 10, status = 'Flash write failed' }]");
    const auto job = start(make_file("fw.bin"));
    EXPECT_EQ(number(broker_.get_instance(job).instance->properties, "PercentComplete"), 5U);
    EXPECT_THAT(states(job, 3), ElementsAre(4, 0, 10));
    EXPECT_EQ(text(broker_.get_instance(job).instance->properties, "JobStatus"),
              "Flash write failed");
}

TEST_F(QlogicProvider, AnswerCanForgetToNameItsJob) {
    play_with("[[qlogic.answer]]\njob = []");
    const auto reply = install(make_file("fw.bin"));
    EXPECT_EQ(reply.return_value, Value::uint32(4096));
    EXPECT_TRUE(reply.out.empty());
}

TEST_F(QlogicProvider, JobFaultStrikesOneRead) {
    play_with("[[fault]]\nstep = 'qlogic.job'\nmatch = 'fw.bin'\nafter = 1\ncode = 1");
    EXPECT_THAT(states(start(make_file("fw.bin")), 3), ElementsAre(4, 0, 4));
}

TEST_F(QlogicProvider, JobsOfBothServicesAreTold) {
    play_with("");
    const auto first = start(make_file("a.bin"));
    const auto second = start(make_file("b.bin"));
    EXPECT_NE(first, second);
    EXPECT_THAT(
        texts(of("QLogic_SoftwareInstallationJob"), "InstanceID"),
        ElementsAre("QLogic:SoftwareInstallationJob:1", "QLogic:SoftwareInstallationJob:2"));
}

}  // namespace
}  // namespace velkhost::providers::testing
