// Requests side by side, and the threads, mutexes and conditions that providers get.
#include "broker_testing.h"

#include "host/shim/velkshim.h"

#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <ctime>
#include <latch>
#include <thread>

namespace {

std::atomic<int> waits_begun{0};
std::atomic<int> waits_ended{0};

}  // namespace

// In place of the shim's: a wait for a request's thread is announced to its clock.
void velkshim_wait_begin() {
    ++waits_begun;
}
void velkshim_wait_end() {
    ++waits_ended;
}

namespace velkhost::broker::testing {
namespace {

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

using BrokerThreads = BrokerTest;

TEST_F(BrokerThreads, RequestsOverlap) {
    constexpr int kRequests = 8;
    std::latch all_inside(kRequests);
    provider.invoke = [&](const auto *, const auto *, const auto *, const char *, const auto *,
                          auto *) {
        all_inside.arrive_and_wait();  // ends only if no lock keeps the others out
        return ok();
    };
    broker.register_provider(kNamespace, "Test_Service", provider.methods());
    std::vector<std::jthread> clients;
    for (int i = 0; i < kRequests; ++i) {
        clients.emplace_back([this] {
            broker.invoke_method(
                path_of("Test_Service"), "Run", {},
                {.principal = "root", .flags = 0, .thread = RequestThread::kFresh});
        });
    }
}

TEST_F(BrokerThreads, EverythingAtOnceLeavesCleanBooks) {
    std::atomic<unsigned> done{0};
    provider.get = [this](const auto *, const CMPIResult *result, const CMPIObjectPath *path) {
        return result->ft->returnInstance(result, make().newInstance(cmpi, path, nullptr));
    };
    provider.enumerate = provider.get;
    provider.invoke = [this, &done](const CMPIContext *context, const auto *, const auto *,
                                    const char *, const auto *, CMPIArgs *out) {
        const CMPIObjectPath *path = new_path("Test_Service");
        CMPIEnumeration *found =
            cmpi->bft->enumerateInstances(cmpi, context, path, nullptr, nullptr);
        while (found->ft->hasNext(found, nullptr) != 0) {
            CMPIValue value = found->ft->getNext(found, nullptr).value;
            out->ft->addArg(out, "Found", &value, CMPI_instance);
        }
        found->ft->release(found);
        CMPIInstance *instance = cmpi->bft->getInstance(cmpi, context, path, nullptr, nullptr);
        CMPIInstance *copy = instance->ft->clone(instance, nullptr);
        copy->ft->release(copy);
        ++done;
        return ok();
    };
    broker.register_provider(kNamespace, "Test_Service", provider.all());
    constexpr unsigned kClients = 4;
    constexpr unsigned kRounds = 50;
    {
        std::vector<std::jthread> clients;
        for (unsigned i = 0; i < kClients; ++i) {
            clients.emplace_back([this] {
                for (unsigned round = 0; round < kRounds; ++round) {
                    const MethodReply reply = broker.invoke_method(path_of("Test_Service"), "Run");
                    EXPECT_NE(reply.out.find("Found"), nullptr);
                    broker.enumerate_instances(path_of("Test_Base"));
                }
            });
        }
    }
    EXPECT_EQ(done, kClients * kRounds);
    EXPECT_EQ(broker.ledger().live_clones(), 0U);
    EXPECT_EQ(broker.trace().entries().size(), kClients * kRounds * 4);
}

TEST_F(BrokerThreads, ClassesAndProvidersCanBeAddedMeanwhile) {
    std::jthread reader([this](const std::stop_token &stop) {
        while (!stop.stop_requested()) {
            broker.enumerate_instances(path_of("Test_Base"));
        }
    });
    for (int i = 0; i < 50; ++i) {
        cim::ClassDecl more{.name = "Test_More" + std::to_string(i),
                            .superclass = "Test_Base",
                            .qualifiers = {},
                            .properties = {},
                            .methods = {}};
        EXPECT_EQ(broker.repository().add_class(kNamespace, more), "");
        broker.register_provider(kNamespace, more.name, provider.methods());
    }
}

TEST_F(BrokerThreads, WaitForAFreshThreadIsAnnouncedToTheClock) {
    const int before = waits_begun;
    int inside = 0;
    provider.invoke = [&](const auto *, const auto *, const auto *, const char *, const auto *,
                          auto *) {
        while (waits_begun == before) {
            std::this_thread::yield();
        }
        inside = waits_begun - waits_ended;
        return ok();
    };
    broker.register_provider(kNamespace, "Test_Service", provider.methods());
    broker.invoke_method(path_of("Test_Service"), "Run", {},
                         {.principal = "root", .flags = 0, .thread = RequestThread::kFresh});
    EXPECT_EQ(inside, 1);
    EXPECT_EQ(waits_begun, waits_ended);
}

// -- Services for providers' threads --

class BrokerOsServices : public BrokerTest {
  protected:
    const CMPIBrokerExtFT &services = *cmpi->xft;
};

TEST_F(BrokerOsServices, ThreadRunsAndConditionWaitSeesItsSignal) {
    struct Shared {
        const CMPIBrokerExtFT *services;
        CMPI_MUTEX_TYPE mutex;
        CMPI_COND_TYPE condition;
        bool seen = false;
    } shared{&services, services.newMutex(0), services.newCondition(0)};
    services.lockMutex(shared.mutex);
    void *thread = services.newThread(
        [](void *user) -> void * {
            auto &mine = *static_cast<Shared *>(user);
            mine.services->lockMutex(mine.mutex);
            mine.seen = true;
            // There is no slot to signal with; the waiter's deadline wakes it.
            mine.services->unlockMutex(mine.mutex);
            return nullptr;
        },
        &shared, 1);
    EXPECT_NE(thread, nullptr);
    while (!shared.seen) {
        ::timespec deadline{};
        ::clock_gettime(CLOCK_REALTIME, &deadline);
        deadline.tv_nsec += 1'000'000;
        deadline.tv_sec += deadline.tv_nsec / 1'000'000'000;
        deadline.tv_nsec %= 1'000'000'000;
        EXPECT_EQ(services.timedCondWait(shared.condition, shared.mutex, &deadline), ETIMEDOUT);
    }
    services.unlockMutex(shared.mutex);
    services.lockMutex(shared.mutex);
    services.unlockMutex(shared.mutex);
    services.destroyCondition(shared.condition);
    services.destroyMutex(shared.mutex);
}

TEST_F(BrokerOsServices, OnceRunsOnce) {
    static int runs = 0;
    int control = 0;
    const auto count = [] { ++runs; };
    EXPECT_EQ(services.threadOnce(&control, count), 0);
    EXPECT_EQ(services.threadOnce(&control, count), 0);
    EXPECT_EQ(runs, 1);
}

TEST_F(BrokerOsServices, KeysHoldAValuePerThread) {
    CMPI_THREAD_KEY_TYPE key = 0;
    ASSERT_EQ(services.createThreadKey(&key, nullptr), 0);
    int mine = 1;
    EXPECT_EQ(services.setThreadSpecific(key, &mine), 0);
    EXPECT_EQ(services.getThreadSpecific(key), &mine);
    std::thread([&] { EXPECT_EQ(services.getThreadSpecific(key), nullptr); }).join();
    EXPECT_EQ(services.destroyThreadKey(key), 0);
}

TEST_F(BrokerOsServices, LibrariesAreResolvedInTheProviderFolders) {
    EXPECT_EQ(services.resolveFileName("velkbroker_test_good"), nullptr);
    const Broker other(
        {.name = "other", .provider_folders = {VELKBROKER_TEST_LIBRARIES}, .strict_ledger = true});
    char *file = services.resolveFileName("velkbroker_test_good");
    EXPECT_STREQ(file, VELKBROKER_TEST_LIBRARIES "/libvelkbroker_test_good.so");
    std::free(file);
}

}  // namespace
}  // namespace velkhost::broker::testing
