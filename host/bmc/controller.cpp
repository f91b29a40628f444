#include "host/bmc/controller.h"

#include "host/bmc/strike.h"

#include <utility>

namespace velkhost::bmc {
namespace {

constexpr std::uint8_t kOemFunction = 0x3A;
constexpr std::uint8_t kTypeQuery = 0xC1;
constexpr std::uint8_t kFlashCommand = 0xF0;
constexpr std::uint8_t kResponseBit = 1;

constexpr std::uint8_t kFirstGenerationBit = 0x80;   // of the first byte
constexpr std::uint8_t kSecondGenerationBit = 0x01;  // of the second

std::string code_words(const Request &request) {
    return "0x" + hex(request.netfn) + "/0x" + hex(request.cmd);
}

}  // namespace

Controller::Controller(Settings settings, FaultSource faults)
    : settings_(std::move(settings)),
      faults_(std::move(faults)),
      flash_(settings_.secure_mode, settings_.first_handle) {}

Reply Controller::handle(const Request &request, std::int64_t now_us) {
    const std::lock_guard lock(mutex_);
    if (gone_) {
        return gone();
    }
    const Call call = understand(request);
    std::string words;
    const Reply reply = reply_to(request, call, words);
    trace_.push_back({now_us, request, reply, call.words + " -> " + words});
    return reply;
}

std::vector<Exchange> Controller::trace() const {
    const std::lock_guard lock(mutex_);
    return trace_;
}

TransactionState Controller::transaction_state() const {
    const std::lock_guard lock(mutex_);
    return flash_.state();
}

Controller::Call Controller::understand(const Request &request) {
    const bool has_flash = settings_.generation == Generation::kSecond;
    if (request.netfn == kOemFunction && request.cmd == kTypeQuery) {
        return {"bmc.type",
                "type query",
                [&] { return serve_type_query(request); },
                {{kCompleted, 0, 0}, "zeros"}};
    }
    if (request.netfn == kOemFunction && request.cmd == kFlashCommand && has_flash) {
        return flash_call(request);
    }
    if (request.netfn == kApplicationFunction) {
        return {"bmc.standard",
                std::string(standard_command_name(request.cmd)),
                [&] { return standard_.serve(request); },
                {{kCompleted}, "nothing"}};
    }
    return {"bmc.unknown",
            code_words(request),
            [] { return not_completed(kInvalidCommand); },
            {{kCompleted}, "nothing"}};
}

Controller::Call Controller::flash_call(const Request &request) {
    FlashRequest parsed = read_flash_request(request.data);
    const std::uint8_t code = request.data.empty() ? std::uint8_t{0} : request.data.front();
    std::string step = "bmc." + parsed.name();
    std::string words = parsed.words();
    return {std::move(step), std::move(words),
            [this, parsed = std::move(parsed)] { return flash_.serve(parsed); }, refusal(code)};
}

Answer Controller::serve_type_query(const Request &request) const {
    if (!request.data.empty()) {
        return not_completed(kInvalidLength);
    }
    switch (settings_.generation) {
        case Generation::kFirst:
            return {{kCompleted, kFirstGenerationBit, 0}, "first generation"};
        case Generation::kSecond:
            return {{kCompleted, 0, kSecondGenerationBit}, "second generation"};
        case Generation::kNone:
            break;
    }
    return {{kCompleted, 0, 0}, "no sessions"};
}

Reply Controller::reply_to(const Request &request, const Call &call, std::string &words) {
    const auto fault = faults_ ? faults_(call.step, call.words) : std::nullopt;
    const auto response_with = [&request](Bytes data) {
        return Response{static_cast<std::uint8_t>(request.netfn | kResponseBit), request.cmd,
                        std::move(data)};
    };
    if (!fault) {
        Answer answer = call.serve();
        words = std::move(answer.words);
        return Reply{response_with(std::move(answer.data))};
    }
    Answer answer = reaches_the_controller(*fault) ? call.serve() : call.refused;
    words = std::move(answer.words);
    Reply reply{response_with(std::move(answer.data))};
    words = strike(*fault, reply, words);
    gone_ = reply.device_gone;
    return reply;
}

}  // namespace velkhost::bmc
