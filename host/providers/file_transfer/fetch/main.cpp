// velkfetch: fetches one file for the file transfer service, which starts it. A process of its own
// has the machine's own clock, which the network needs, whatever the host's clock does; and nothing
// that a server sends can harm the broker. The request comes on standard input, so that no password
// is seen in a list of processes; frames go to standard output.
#include "host/providers/file_transfer/fetch/curl_fetch.h"
#include "host/providers/file_transfer/fetch/frame_writer.h"
#include "host/providers/file_transfer/fetch_protocol.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <string>

#include <sys/prctl.h>
#include <unistd.h>

namespace {

constexpr std::size_t kLongestRequest = 65536;

std::string read_request() {
    std::string text;
    std::array<char, 4096> block{};
    while (text.size() < kLongestRequest) {
        const ssize_t got = ::read(STDIN_FILENO, block.data(), block.size());
        if (got == 0 || (got < 0 && errno != EINTR)) {
            break;
        }
        text.append(block.data(), got < 0 ? 0 : static_cast<std::size_t>(got));
    }
    return text;
}

}  // namespace

int main() {
    using namespace velkhost;
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);  // nobody would want the file
    const auto request = providers::decode_request(read_request());
    fetch::FrameWriter out(STDOUT_FILENO);
    if (!request) {
        out.end({providers::FetchResult::kInvalid, "no request"});
        return 2;
    }
    const providers::FetchOutcome outcome = fetch::fetch(*request, out);
    return out.end(outcome) && outcome.result == providers::FetchResult::kFetched ? 0 : 1;
}
