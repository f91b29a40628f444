// An install meets a session with the management controller in every state, and ends as it would
// without: the two are crossed for every family.
#include <algorithm>
#include <ostream>
#include <tuple>

#include "ipmi/kcs_channel.h"
#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

using enum ControllerFault;

struct SessionCase {
    const char *name;
    std::vector<FaultRule> faults;
    velkhost::bmc::Settings settings;
    bool starts = false;  // in the library's eyes
    bool is_watched = false;
    bool ends = false;                    // with the whole of its end
    const char *last_exchange = nullptr;  // null: whatever it is
    bool has_device = true;
    bool has_threads = true;
};

enum class Payload { kSucceeds, kFails, kCannotStart };

struct PayloadCase {
    const char *name;
    Payload payload;
};

void PrintTo(const SessionCase &row, std::ostream *out) {
    *out << row.name;
}
void PrintTo(const PayloadCase &row, std::ostream *out) {
    *out << row.name;
}

FaultRule vanishing_at_the_second_type_query() {
    FaultRule rule = fault("bmc.type", kVanish);
    rule.after = 1;
    return rule;
}

const SessionCase kSessions[] = {
    {.name = "NoDevice", .faults = {}, .settings = {}, .has_device = false},
    {.name = "TypeFails", .faults = {fault("bmc.type", kCompletionCode, 0xC1)}, .settings = {}},
    {.name = "ControllerIsSilent", .faults = {fault("bmc.type", kNoAnswer)}, .settings = {}},
    {.name = "FirstGeneration",
     .faults = {},
     .settings = {.generation = Generation::kFirst},
     .last_exchange = "type query -> first generation"},
    {.name = "ControllerKnowsNoSessions",
     .faults = {},
     .settings = {.generation = Generation::kNone},
     .starts = true,
     .is_watched = true,
     .ends = true,
     .last_exchange = "type query -> no sessions"},
    {.name = "SecureModeFails", .faults = {fault("bmc.variable", kRefuse)}, .settings = {}},
    {.name = "CreateIsRefused",
     .faults = {fault("bmc.create", kRefuse)},
     .settings = {},
     .last_exchange = "create XFLASH -> refused"},
    {.name = "CreateIsNotAnswered", .faults = {fault("bmc.create", kNoAnswer)}, .settings = {}},
    {.name = "OpenIsRefused",
     .faults = {fault("bmc.open", kRefuse)},
     .settings = {},
     .last_exchange = "destroy 1 -> done"},
    {.name = "BeginIsRefused",
     .faults = {fault("bmc.begin", kRefuse)},
     .settings = {},
     .last_exchange = "destroy 1 -> done"},
    {.name = "Opens",
     .faults = {},
     .settings = {},
     .starts = true,
     .is_watched = true,
     .ends = true,
     .last_exchange = "destroy 1 -> done"},
    {.name = "OpensInSecureMode",
     .faults = {},
     .settings = {.secure_mode = "yes"},
     .starts = true,
     .is_watched = true,
     .ends = true,
     .last_exchange = "destroy 1 -> done"},
    {.name = "WatcherCannotStart",
     .faults = {},
     .settings = {},
     .starts = true,
     .last_exchange = "begin 1 -> done",
     .has_threads = false},
    {.name = "EndIsRefused",
     .faults = {fault("bmc.cancel", kRefuse), fault("bmc.close", kRefuse),
                fault("bmc.destroy", kRefuse)},
     .settings = {},
     .starts = true,
     .is_watched = true,
     .ends = true,
     .last_exchange = "destroy 1 -> refused"},
    {.name = "DeviceVanishes",
     .faults = {vanishing_at_the_second_type_query()},
     .settings = {},
     .starts = true,
     .is_watched = true},
};

constexpr PayloadCase kPayloads[] = {
    {"PayloadSucceeds", Payload::kSucceeds},
    {"PayloadFails", Payload::kFails},
    {"PayloadCannotStart", Payload::kCannotStart},
};

using Cross = std::tuple<AdapterFamily, SessionCase, PayloadCase>;

class AdapterSession : public AdapterTest, public ::testing::WithParamInterface<Cross> {
  protected:
    static const AdapterFamily &family() { return std::get<AdapterFamily>(GetParam()); }
    static const SessionCase &session() { return std::get<SessionCase>(GetParam()); }
    static Payload payload() { return std::get<PayloadCase>(GetParam()).payload; }

    void prepare_session() {
        if (session().has_device) {
            attach(session().faults, session().settings);
        }
        if (!session().has_threads) {
            fail_step("thread.create", EAGAIN);
        }
    }

    void prepare_payload() {
        family().furnish(*this);
        VendorClass &service = vendor(family().service);
        service.seconds = 5;  // the watcher has its first query behind it
        service.on_call = [&] { flag_during_call_ = velk::load(ga_is_thread_running); };
        if (payload() == Payload::kFails) {
            family().end_with(*this, 2);
        } else if (payload() == Payload::kCannotStart) {
            service.answers["InstallFromURI"] = {
                {.value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "busy"}};
        }
    }

    int flag_during_call_ = -1;
};

TEST_P(AdapterSession, DoesNotChangeWhatBecomesOfThePayload) {
    prepare_session();
    prepare_payload();
    EXPECT_EQ(install(family().install), 0);

    EXPECT_EQ(reports(), std::vector<std::string>{payload() == Payload::kSucceeds
                                                      ? "50: Package installation successfully."
                                                      : family().failure_report});
    EXPECT_FALSE(is_unpacked());
    EXPECT_EQ(flag_during_call_, 1) << "whether or not the session was opened";
    EXPECT_EQ(velk::load(ga_is_thread_running), 0);

    EXPECT_EQ(logged("Start SMM successfully.\n"), session().starts ? 1 : 0);
    EXPECT_EQ(logged("Fail to create smm thread.\n"), session().has_threads ? 0 : 1);
    EXPECT_EQ(logged("SMM :  query_fw_update, query_fw_update thread start\n"),
              session().is_watched ? 1 : 0);
    EXPECT_EQ(logged("SMM : smm_disconnect enter .\n"), session().is_watched ? 1 : 0);
    EXPECT_EQ(logged("smm : smm_disconnect successfully.\n"), session().ends ? 1 : 0);
    if (session().last_exchange != nullptr) {
        EXPECT_EQ(exchanges().back(), session().last_exchange);
    }
    EXPECT_LT(velk::load(kcs_fd), 0);
}

INSTANTIATE_TEST_SUITE_P(
    Cross, AdapterSession,
    ::testing::Combine(::testing::ValuesIn(adapter_families().begin(), adapter_families().end()),
                       ::testing::ValuesIn(kSessions), ::testing::ValuesIn(kPayloads)),
    [](const auto &about) {
        return std::string(std::get<AdapterFamily>(about.param).name) + "_" +
               std::get<SessionCase>(about.param).name + "_" +
               std::get<PayloadCase>(about.param).name;
    });

}  // namespace
}  // namespace velktest
