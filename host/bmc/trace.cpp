#include "host/bmc/trace.h"

#include "host/bmc/hex.h"

#include <array>
#include <cstdio>

namespace velkhost::bmc {
namespace {

constexpr std::int64_t kMicrosPerMilli = 1'000;
constexpr std::int64_t kMillisPerSecond = 1'000;

std::string seconds(std::int64_t time_us) {
    const std::int64_t millis = time_us / kMicrosPerMilli;
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%5lld.%03lld",
                  static_cast<long long>(millis / kMillisPerSecond),
                  static_cast<long long>(millis % kMillisPerSecond));
    return text.data();
}

std::string answer(const Reply &reply) {
    return reply.response ? hex(reply.response->data) : "silence";
}

}  // namespace

std::string in_words(const Exchange &exchange, std::int64_t origin_us) {
    const Request &request = exchange.request;
    const std::string data = request.data.empty() ? "" : hex(request.data) + " ";
    return seconds(exchange.time_us - origin_us) + "  " + hex(request.netfn) + " " +
           hex(request.cmd) + " | " + data + "-> " + answer(exchange.reply) + " | " +
           exchange.words;
}

}  // namespace velkhost::bmc
