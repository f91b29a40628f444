// The fetcher's process as the service sees it, with programs of the test in its place; and what
// the two say to each other.
#include "host/providers/file_transfer/fetch_process.h"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>

namespace velkhost::providers {
namespace {

namespace fs = std::filesystem;

class TransferProcess : public ::testing::Test {
  public:
    ~TransferProcess() override { fs::remove_all(place_); }

  protected:
    TransferProcess() {
        std::string name = (fs::temp_directory_path() / "velk-proc-XXXXXX").string();
        place_ = ::mkdtemp(name.data());
    }

    // A program of the shell, in place of the fetcher.
    fs::path program(const std::string &text) {
        const fs::path path = place_ / "fetcher";
        std::ofstream(path) << "#!/bin/sh\n" << text << '\n';
        fs::permissions(path, fs::perms(0755));
        return path;
    }
    Piece first_piece(const std::string &text) {
        FetchProcess process(program(text), {});
        return process.next(std::stop_token());
    }
    static std::string failure_in(const Piece &piece) {
        const auto *outcome = std::get_if<FetchOutcome>(&piece);
        return outcome == nullptr ? "no outcome" : outcome->text;
    }

    fs::path place_;
};

constexpr const char *kEndedEarly = "The fetcher ended before the file did";

TEST_F(TransferProcess, FramesArePieces) {
    FetchProcess process(program("cat >/dev/null\n"
                                 "printf 's\\2\\0\\0\\00012'\n"
                                 "printf 'd\\3\\0\\0\\000abc'\n"
                                 "printf 'e\\4\\0\\0\\000Xbad'"),
                         {});
    const std::stop_token stop;
    EXPECT_EQ(std::get<AnnouncedSize>(process.next(stop)).bytes, 12U);
    const Piece data = process.next(stop);
    const auto content = std::get<FileBytes>(data);
    EXPECT_EQ(std::string(content.begin(), content.end()), "abc");
    const auto outcome = std::get<FetchOutcome>(process.next(stop));
    EXPECT_EQ(outcome.result, FetchResult::kFailed);
    EXPECT_EQ(outcome.text, "bad");
}

TEST_F(TransferProcess, RequestArrivesWhole) {
    FetchRequest request;
    request.url = "sftp://h/a.xml";
    request.password = "p w";
    request.block_size = 2048;
    FetchProcess process(program("cat >\"" + (place_ / "request").string() + "\""), request);
    EXPECT_EQ(failure_in(process.next(std::stop_token())), kEndedEarly);
    std::ifstream file(place_ / "request", std::ios::binary);
    const std::string text{std::istreambuf_iterator<char>(file), {}};
    const auto decoded = decode_request(text);
    ASSERT_TRUE(decoded);
    EXPECT_EQ(decoded->url, request.url);
    EXPECT_EQ(decoded->password, request.password);
    EXPECT_EQ(decoded->block_size, 2048U);
    EXPECT_EQ(decoded->stall_seconds, 60U);
}

TEST_F(TransferProcess, ProgramThatIsNotThereIsAFailure) {
    FetchProcess process(place_ / "missing", {});
    EXPECT_EQ(failure_in(process.next(std::stop_token())),
              "The fetcher cannot be started: No such file or directory");
}

TEST_F(TransferProcess, ProgramThatEndsEarlyIsAFailure) {
    EXPECT_EQ(failure_in(first_piece("exit 0")), kEndedEarly);
    EXPECT_EQ(failure_in(first_piece("kill -9 $$")), kEndedEarly);
    EXPECT_EQ(failure_in(first_piece("printf 'd\\3\\0\\0\\000ab'")), kEndedEarly);
}

TEST_F(TransferProcess, NonsenseIsAFailure) {
    EXPECT_EQ(failure_in(first_piece("printf 'x\\1\\0\\0\\000a'")), kEndedEarly);
    EXPECT_EQ(failure_in(first_piece("printf 's\\2\\0\\0\\0001x'")), kEndedEarly);
    EXPECT_EQ(failure_in(first_piece("printf 'e\\0\\0\\0\\000'")), kEndedEarly);
    EXPECT_EQ(failure_in(first_piece("printf 'd\\377\\377\\377\\377'")), kEndedEarly);
}

TEST_F(TransferProcess, ProgramThatSaysNothingIsEndedOnRequest) {
    std::stop_source stop;
    stop.request_stop();
    FetchProcess process(program("exec sleep 1000"), {});
    EXPECT_EQ(failure_in(process.next(stop.get_token())), "The transfer was ended");
}

TEST_F(TransferProcess, ProgramIsStartedWithoutAnotherClock) {
    ::setenv("VELKSHIM_CLOCK", "virtual", 1);
    ::setenv("VELK_KEPT", "kept", 1);
    FetchProcess process(
        program("cat >/dev/null; printf 'e\\5\\0\\0\\000X%s' \"$VELK_KEPT$VELKSHIM_CLOCK\""), {});
    EXPECT_EQ(failure_in(process.next(std::stop_token())), "kept");
    ::unsetenv("VELKSHIM_CLOCK");
}

TEST(TransferProtocol, OnlyWholeRequestsAreDecoded) {
    const std::string text = encode({});
    EXPECT_TRUE(decode_request(text));
    EXPECT_FALSE(decode_request(""));
    EXPECT_FALSE(decode_request(text.substr(0, text.size() - 1)));
    EXPECT_FALSE(decode_request(text + '\0'));
    EXPECT_FALSE(decode_request(std::string(9, '\0')));
}

TEST(TransferProtocol, LengthsSurviveTheirHeader) {
    for (const std::size_t length : {0UL, 1UL, 255UL, 256UL, 16384UL, 0xFFFFFFFFUL}) {
        EXPECT_EQ(frame_length(frame_header(FrameKind::kData, length)), length);
    }
}

}  // namespace
}  // namespace velkhost::providers
