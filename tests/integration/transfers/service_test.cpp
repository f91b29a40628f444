// The file transfer service itself, in a host of the test's own, with a real SSH server.
#include "host/rig/rig.h"
#include "host/rig/shim_session.h"
#include "tests/integration/transfers/servers.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <chrono>
#include <fstream>
#include <set>
#include <thread>

namespace velkhost::testing {
namespace {

namespace fs = std::filesystem;
using broker::MethodReply;
using cim::Value;

constexpr std::uint64_t kRunning = 4;
constexpr std::uint64_t kCompleted = 7;
constexpr std::int64_t kSecond = 1'000'000;

class FileTransfers : public ::testing::Test {
  protected:
    FileTransfers() : place_(rig::RunFolder::make_temporary()) {
        fs::permissions(place_.path(), fs::perms(0755));
        server_ = std::make_unique<SftpServer>(place_.path());
    }

    // `settings` are further keys of the scenario's section.
    void set_up(const std::string &settings) {
        const fs::path file = place_.path() / "scenario.toml";
        std::ofstream(file) << "[file_transfer]\nuser = 'velk'\nprivate_key = '"
                            << server_->user_key().string() << "'\nknown_hosts = '"
                            << server_->known_hosts(server_->port()).string() << "'\n"
                            << settings;
        rig_.emplace(rig::RigOptions{.scenario_file = file});
    }

    std::string served(const std::string &name, std::size_t size) {
        std::ofstream(place_.path() / name) << std::string(size, 'x');
        return "sftp://127.0.0.1:" + std::to_string(server_->port()) +
               (place_.path() / name).string();
    }

    MethodReply call(const std::string &method, const char *argument, const std::string &text) {
        return rig_->broker().invoke_method({"", "zeb/cimv2", "ZEB_FileTransferService", {}},
                                            method, {{argument, Value::string(text)}});
    }
    MethodReply start(const std::string &uri) { return call("TransferViaURL", "SourceURI", uri); }

    static std::string text(const cim::NamedValues &values, const char *name) {
        const Value *value = values.find(name);
        return value != nullptr && value->as_text() ? std::string(*value->as_text()) : "(none)";
    }

    cim::NamedValues job_of(const MethodReply &reply) {
        const Value *job = reply.out.find("Job");
        EXPECT_NE(job, nullptr);
        const auto got = rig_->broker().get_instance(*job->as_path());
        EXPECT_TRUE(got.status.ok()) << got.status.message;
        return got.instance ? got.instance->properties : cim::NamedValues{};
    }
    std::uint64_t state_of(const MethodReply &reply) {
        const cim::NamedValues job = job_of(reply);
        const Value *state = job.find("JobState");
        return state == nullptr ? 0 : state->as_unsigned().value_or(0);
    }

    fs::path stored(const std::string &uri) {
        return rig_->folder().inside(uri.substr(sizeof("file://") - 1));
    }

    rig::RunFolder place_;
    std::unique_ptr<SftpServer> server_;
    std::optional<rig::Rig> rig_;
};

TEST_F(FileTransfers, JobShowsHowFarItIs) {
    set_up("bytes_per_second = 16384\n");
    const MethodReply reply = start(served("file", 10 * 16384));
    ASSERT_EQ(reply.return_value, Value::uint32(6));
    rig::host_pause_us(5 * kSecond + kSecond / 2);
    cim::NamedValues job = job_of(reply);
    EXPECT_EQ(text(job, "JobStatus"), "Transferring, 98304 of 163840 bytes received");
    EXPECT_EQ(job.find("PercentComplete")->as_unsigned(), 60U);
    EXPECT_EQ(job.find("JobState")->as_unsigned(), kRunning);
    rig::host_pause_us(5 * kSecond);
    job = job_of(reply);
    EXPECT_EQ(text(job, "JobStatus"), "Transfer completed");
    EXPECT_EQ(job.find("PercentComplete")->as_unsigned(), 100U);
    EXPECT_EQ(job.find("JobState")->as_unsigned(), kCompleted);
    EXPECT_EQ(text(job, "DestinationURI"), text(reply.out, "DestinationURI"));
    EXPECT_EQ(fs::file_size(stored(text(job, "DestinationURI"))), 10U * 16384U);
    EXPECT_EQ(rig_->broker()
                  .enumerate_instances({"", "zeb/cimv2", "ZEB_FileTransferJob", {}})
                  .instances.size(),
              1U);
}

TEST_F(FileTransfers, NoMoreThanTheBoundTransferAtOnceAndTheOthersFollow) {
    set_up("bytes_per_second = 16384\nat_once = 2\n");
    std::vector<MethodReply> replies;
    for (int i = 0; i < 5; ++i) {
        replies.push_back(start(served("file", 10 * 16384)));
    }
    // Ten seconds each, two at a time: two have ended after 15 seconds, and one waits.
    rig::host_pause_us(15 * kSecond);
    const auto count = [&](const std::string &begin) {
        return std::count_if(replies.begin(), replies.end(), [&](const MethodReply &reply) {
            return text(job_of(reply), "JobStatus").starts_with(begin);
        });
    };
    EXPECT_EQ(count("Transfer completed"), 2);
    EXPECT_EQ(count("Transferring, "), 2);
    EXPECT_EQ(count("Waiting for other transfers"), 1);
    rig::host_pause_us(20 * kSecond);
    EXPECT_EQ(count("Transfer completed"), 5);
    std::set<std::string> destinations;
    for (const MethodReply &reply : replies) {
        destinations.insert(text(reply.out, "DestinationURI"));
    }
    EXPECT_EQ(destinations.size(), 5U) << "files of one name do not meet";
}

TEST_F(FileTransfers, OnlyWhatWasTransferredIsDeleted) {
    set_up("");
    const MethodReply reply = start(served("file", 100));
    rig::host_pause_us(kSecond);
    ASSERT_EQ(state_of(reply), kCompleted);
    const std::string uri = text(reply.out, "DestinationURI");
    const fs::path own = stored("file:///var/tmp/filestore/own");
    std::ofstream(own) << "own";
    const auto refused = call("DeleteTransferredFile", "FileURI", "file:///var/tmp/filestore/own");
    EXPECT_EQ(refused.status.code, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_TRUE(fs::exists(own));
    EXPECT_TRUE(call("DeleteTransferredFile", "FileURI", uri).status.ok());
    EXPECT_FALSE(fs::exists(stored(uri)));
    EXPECT_FALSE(call("DeleteTransferredFile", "FileURI", uri).status.ok());
}

TEST_F(FileTransfers, FileThatIsStillComingIsNotDeleted) {
    set_up("bytes_per_second = 16384\n");
    const MethodReply reply = start(served("file", 10 * 16384));
    rig::host_pause_us(3 * kSecond);
    const std::string uri = text(reply.out, "DestinationURI");
    EXPECT_EQ(call("DeleteTransferredFile", "FileURI", uri).status.code, CMPI_RC_ERR_ACCESS_DENIED);
    rig::host_pause_us(10 * kSecond);
    EXPECT_EQ(state_of(reply), kCompleted);
    EXPECT_TRUE(call("DeleteTransferredFile", "FileURI", uri).status.ok());
}

TEST_F(FileTransfers, EmptyFileIsTransferred) {
    set_up("");
    const MethodReply reply = start(served("empty", 0));
    rig::host_pause_us(kSecond);
    EXPECT_EQ(text(job_of(reply), "JobStatus"), "Transfer completed");
    EXPECT_EQ(fs::file_size(stored(text(reply.out, "DestinationURI"))), 0U);
}

TEST_F(FileTransfers, HostThatGoesDownEndsWhatIsUnderWay) {
    set_up("bytes_per_second = 1\n");
    const MethodReply reply = start(served("file", 10 * 16384));
    rig::host_pause_us(kSecond);
    EXPECT_EQ(state_of(reply), kRunning);
    const fs::path file = stored(text(reply.out, "DestinationURI"));
    EXPECT_TRUE(fs::exists(file));
    EXPECT_TRUE(rig_->shut_down());
    EXPECT_FALSE(fs::exists(file));
    EXPECT_THAT(rig_->findings(), ::testing::IsEmpty());
}

}  // namespace
}  // namespace velkhost::testing
