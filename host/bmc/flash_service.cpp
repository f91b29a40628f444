#include "host/bmc/flash_service.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <optional>
#include <utility>

namespace velkhost::bmc {

struct FlashOperation {
    std::uint8_t code;
    const char *name;
    Answer (FlashService::*serve)(const FlashRequest &);
    Step step = Step::kStatus;  // for those that only move the transaction on

    static const FlashOperation *find(std::uint8_t code);
};

const FlashOperation *FlashOperation::find(std::uint8_t code) {
    static constexpr std::array kOperations{
        FlashOperation{0x01, "create", &FlashService::create},
        FlashOperation{0x02, "destroy", &FlashService::step, Step::kDestroy},
        FlashOperation{0x03, "open", &FlashService::open, Step::kOpen},
        FlashOperation{0x04, "close", &FlashService::step, Step::kClose},
        FlashOperation{0x08, "begin", &FlashService::step, Step::kBegin},
        FlashOperation{0x09, "status", &FlashService::step, Step::kStatus},
        FlashOperation{0x0E, "cancel", &FlashService::step, Step::kCancel},
        FlashOperation{0x16, "variable", &FlashService::get_variable},
    };
    const auto *const found = std::ranges::find(kOperations, code, &FlashOperation::code);
    return found == kOperations.end() ? nullptr : found;
}

namespace {

constexpr std::size_t kReserved = 2;
constexpr std::uint32_t kOpenFlag = 0x80;
constexpr const char *kSubsystem = "XFLASH";
constexpr const char *kSecureModeVariable = "secure_mode";

Bytes frame(std::uint8_t code, bool result, const Bytes &elements) {
    Bytes out{kCompleted, code, static_cast<std::uint8_t>(result ? 1 : 0), 0,
              static_cast<std::uint8_t>(elements.size())};
    out.reserve(out.size() + elements.size());
    out.insert(out.end(), elements.begin(), elements.end());
    return out;
}

Answer success(const FlashRequest &request, const Bytes &elements, std::string words) {
    return {frame(request.operation->code, true, elements), std::move(words)};
}

Answer refuse(const FlashRequest &request) {
    return refusal(request.operation->code);
}

template <typename T>
std::optional<T> only(const FlashRequest &request, std::optional<T> (*as)(const Element &)) {
    return request.elements.size() == 1 ? as(request.elements.front()) : std::nullopt;
}

bool says_yes(const std::string &text) {
    return strcasestr(text.c_str(), "yes") != nullptr;
}

}  // namespace

std::string FlashRequest::name() const {
    return operation == nullptr ? "unknown" : operation->name;
}

std::string FlashRequest::words() const {
    std::string out = name();
    for (const Element &element : elements) {
        out += " " + in_words(element);
    }
    return out;
}

FlashRequest read_flash_request(const Bytes &data) {
    ByteCursor in(data);
    FlashRequest request;
    const auto code = in.byte();
    request.operation = code ? FlashOperation::find(*code) : nullptr;
    const auto reserved = in.take(kReserved);
    const auto length = in.byte();
    if (!reserved || !length || *length != in.left()) {
        request.completion = kInvalidLength;
        return request;
    }
    auto elements = read_elements(in);
    if (elements) {
        request.elements = *std::move(elements);
    }
    if (!elements || request.operation == nullptr) {
        request.completion = kInvalidField;
    }
    return request;
}

Answer refusal(std::uint8_t operation_code) {
    return {frame(operation_code, false, {}), "refused"};
}

FlashService::FlashService(std::string secure_mode, std::uint32_t first_handle)
    : secure_mode_(std::move(secure_mode)), transaction_(says_yes(secure_mode_), first_handle) {}

Answer FlashService::serve(const FlashRequest &request) {
    if (request.completion != kCompleted) {
        return not_completed(request.completion);
    }
    return (this->*request.operation->serve)(request);
}

Answer FlashService::create(const FlashRequest &request) {
    const auto name = only(request, text_of);
    if (!name) {
        return not_completed(kInvalidField);
    }
    const auto handle = *name == kSubsystem ? transaction_.create() : std::nullopt;
    if (!handle) {
        return refuse(request);
    }
    Bytes elements;
    append_number(elements, *handle);
    return success(request, elements, "handle " + std::to_string(*handle));
}

Answer FlashService::get_variable(const FlashRequest &request) {
    const auto name = only(request, text_of);
    if (!name) {
        return not_completed(kInvalidField);
    }
    if (*name != kSecureModeVariable) {
        return refuse(request);
    }
    Bytes elements;
    append_text(elements, secure_mode_);
    return success(request, elements, '"' + secure_mode_ + '"');
}

// Handle, name and, optionally, the flag.
Answer FlashService::open(const FlashRequest &request) {
    const auto &elements = request.elements;
    const bool right_number = elements.size() == 2 || elements.size() == 3;
    const auto handle = right_number ? number_of(elements[0]) : std::nullopt;
    const auto name = right_number ? text_of(elements[1]) : std::nullopt;
    const auto flag = elements.size() == 3 ? number_of(elements[2]) : kOpenFlag;
    if (!handle || !name || flag != kOpenFlag) {
        return not_completed(kInvalidField);
    }
    return transaction_.take(Step::kOpen, *handle) ? success(request, {}, "done") : refuse(request);
}

Answer FlashService::step(const FlashRequest &request) {
    const auto handle = only(request, number_of);
    if (!handle) {
        return not_completed(kInvalidField);
    }
    return transaction_.take(request.operation->step, *handle) ? success(request, {}, "done")
                                                               : refuse(request);
}

}  // namespace velkhost::bmc
