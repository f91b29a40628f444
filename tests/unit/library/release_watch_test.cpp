// The watch that the fixture keeps on the broker's objects sees what it is there for.

#include "tests/support/broker_test.h"
#include "velk/cim.h"

namespace {

using ReleaseWatchTest = velktest::BrokerTest;
using Texts = std::vector<std::string>;

// Makes and gets one object of each kind; the caller releases them or not.
template <class Use>
void make_each(const CMPIContext *context, const CMPIBroker *broker, Use use) {
    CMPIObjectPath *path = CMNewObjectPath(broker, "zeb/cimv2", "ZEB_UpdateJob", nullptr);
    use(CMNewArgs(broker, nullptr));
    use(CMNewInstance(broker, path, nullptr));
    use(CBGetInstance(broker, context, path, nullptr, nullptr));
    use(path);
}

}  // namespace

TEST_F(ReleaseWatchTest, ReleasedObjectsAreNotNamedAndOthersAre) {
    job().show_nothing();
    job().show_nothing();
    in_request([&](const CMPIContext *context) {
        velktest::ReleaseWatch watch(broker().cmpi());
        make_each(context, watch.broker(), [](auto *object) { CMRelease(object); });
        EXPECT_EQ(watch.unreleased(), Texts{});
        make_each(context, watch.broker(), [](auto *) {});
        EXPECT_EQ(watch.unreleased(), (Texts{"path", "instance", "instance", "argument list"}));
        broker().ledger().clear_findings();  // made by asking
    });
}
