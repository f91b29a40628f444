// The hypervisor's jobs as a client follows them: by enumerating all of them.
#include "providers_hypervisor_fixture.h"

namespace velkhost::providers::testing {
namespace {

using cim::Value;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class HypervisorJobs : public HypervisorProvider {
  protected:
    std::vector<std::uint64_t> states() {
        std::vector<std::uint64_t> out;
        for (const cim::Instance &job : instances("VMware_ConcreteJob")) {
            out.push_back(number(job.properties, "JobState"));
        }
        return out;
    }
};

TEST_F(HypervisorJobs, EachEnumerationIsALook) {
    install(depot_.write());
    EXPECT_THAT(looks(8), ElementsAre(kScanning, kUpdating, kUpdating, kUpdating, kUpdating,
                                      kCompleted, kCompleted, kCompleted));
}

TEST_F(HypervisorJobs, StatesFollowTheTexts) {
    install(depot_.write());
    for (int i = 0; i < 5; ++i) {
        EXPECT_THAT(states(), ElementsAre(4U));
    }
    EXPECT_THAT(states(), ElementsAre(7U));
}

TEST_F(HypervisorJobs, ReadOfOneJobIsNoLook) {
    const auto reply = install(depot_.write());
    const cim::ObjectPath job = *reply.out.find("Job")->as_path();
    for (int i = 0; i < 3; ++i) {
        const auto found = broker_.get_instance(job);
        ASSERT_TRUE(found.status.ok()) << found.status.message;
        EXPECT_EQ(text(found.instance->properties, "JobStatus"), kScanning);
    }
    EXPECT_THAT(looks(2), ElementsAre(kScanning, kUpdating));
}

TEST_F(HypervisorJobs, LatestJobComesLast) {
    install(depot_.write());
    install("file:///nonexistent/metadata.zip");
    EXPECT_THAT(look(), ElementsAre(kScanning, kScanning));
    const auto found = look();
    ASSERT_EQ(found.size(), 2U);
    EXPECT_EQ(found[0], kUpdating);
    EXPECT_EQ(found[1], "The update failed: index.xml cannot be read");
}

TEST_F(HypervisorJobs, EarlierOnesAreThereFromTheBegin) {
    play("[host]\nnode = 'host-1'\n[hypervisor]\nearlier_jobs = ['one', 'two']\n");
    EXPECT_THAT(look(), ElementsAre("one", "two"));
    EXPECT_THAT(states(), ElementsAre(7U, 7U));
    install(depot_.write());
    EXPECT_THAT(look(), ElementsAre("one", "two", kScanning));
}

TEST_F(HypervisorJobs, ThereAreNoneBeforeTheFirst) {
    EXPECT_THAT(look(), IsEmpty());
    cim::ObjectPath unknown = class_path("VMware_ConcreteJob");
    unknown.keys.set("InstanceID", Value::string("VMware:ConcreteJob:1"));
    EXPECT_EQ(broker_.get_instance(unknown).status.code, CMPI_RC_ERR_NOT_FOUND);
}

}  // namespace
}  // namespace velkhost::providers::testing
