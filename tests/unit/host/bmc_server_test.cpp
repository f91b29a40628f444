// The socket to which QEMU connects.
#include "host/bmc/qemu_server.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <cstdlib>
#include <filesystem>
#include <system_error>
#include <thread>

#include <sys/eventfd.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include "tests/unit/host/bmc_testing.h"

namespace velkhost::bmc::test {
namespace {

class BmcServer : public ::testing::Test {
  protected:
    BmcServer() {
        std::string pattern = ::testing::TempDir() + "velkbmc-XXXXXX";
        folder_ = mkdtemp(pattern.data());
        server_.emplace(folder_ / "socket", controller_);
        serving_ = std::thread([this] { server_->run(stop_.get()); });
    }
    ~BmcServer() override {
        eventfd_write(stop_.get(), 1);
        serving_.join();
        server_.reset();
        EXPECT_FALSE(std::filesystem::exists(folder_ / "socket"));
        std::filesystem::remove_all(folder_);
    }

    [[nodiscard]] OwnedDescriptor connect() const {
        sockaddr_un address = {};
        address.sun_family = AF_UNIX;
        const std::string path = folder_ / "socket";
        path.copy(address.sun_path, sizeof address.sun_path - 1);
        OwnedDescriptor out(socket(AF_UNIX, SOCK_STREAM, 0));
        EXPECT_EQ(::connect(out.get(), reinterpret_cast<sockaddr *>(&address), sizeof address), 0);
        return out;
    }

    // Sends the type query and returns the answer up to its end byte.
    static std::string query(const OwnedDescriptor &connection) {
        const Bytes request = message_frame_of_query();
        EXPECT_EQ(write(connection.get(), request.data(), request.size()),
                  static_cast<ssize_t>(request.size()));
        Bytes answer;
        std::uint8_t byte = 0;
        while (byte != 0xA0 && read(connection.get(), &byte, 1) == 1) {
            answer.push_back(byte);
        }
        return hex(answer);
    }

    static Bytes message_frame_of_query() { return {0x09, 0xE8, 0xC1, 0x4E, 0xA0}; }

    std::filesystem::path folder_;
    Controller controller_{Settings{}};
    OwnedDescriptor stop_{eventfd(0, 0)};
    std::optional<QemuServer> server_;
    std::thread serving_;
};

TEST_F(BmcServer, ServesOneConnectionAfterTheOther) {
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(query(connect()), "09 EC C1 00 00 01 49 A0");
    }
    EXPECT_EQ(controller_.trace().size(), 3U);
}

TEST_F(BmcServer, ServesRequestsThatComeInPieces) {
    const OwnedDescriptor connection = connect();
    const std::uint8_t greeting = 0xFF;
    EXPECT_EQ(write(connection.get(), &greeting, 1), 1);
    const std::array<std::uint8_t, 2> rest{0x01, 0xA1};
    EXPECT_EQ(write(connection.get(), rest.data(), rest.size()), 2);
    std::array<std::uint8_t, 3> answer{};
    EXPECT_EQ(recv(connection.get(), answer.data(), answer.size(), MSG_WAITALL), 3);
    EXPECT_EQ(hex(answer), "FF 01 A1");
}

TEST(BmcServerPath, TooLongForASocketIsTold) {
    Controller controller({});
    try {
        const QemuServer server("/tmp/" + std::string(200, 'x'), controller);
        FAIL();
    } catch (const std::system_error &error) {
        EXPECT_EQ(error.code().value(), ENAMETOOLONG);
    }
}

}  // namespace
}  // namespace velkhost::bmc::test
