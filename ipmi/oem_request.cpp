#include "ipmi/oem_request.h"

#include <algorithm>

#include "ipmi/kcs_channel.h"
#include "ipmi/payload_builders.h"
#include "velk/bounded_text.h"

namespace velk {
namespace {

constexpr unsigned char kSessionCommand = 0xF0;
constexpr std::size_t kHeaderSize = 4;
constexpr std::size_t kLengthByte = 3;
constexpr std::size_t kCompletionByte = 0;
constexpr std::size_t kResultByte = 2;
constexpr unsigned kResultFlag = 0x01;
constexpr std::size_t kReturnedHeader = 5;
constexpr std::size_t kReturnedValue = 6;
constexpr unsigned kStringLength = 0x7F;
constexpr std::size_t kDwordElementSize = 5;
constexpr std::size_t kMaxText = 127;

}  // namespace

OemRequest::OemRequest(Operation operation) : length_(kHeaderSize) {
    data_[0] = static_cast<unsigned char>(operation);
}

bool OemRequest::fits(std::size_t element_size) const {
    return length_ + element_size <= data_.size();
}

OemRequest &OemRequest::add_dword(std::uint32_t value) {
    if (fits(kDwordElementSize)) {
        length_ += static_cast<std::size_t>(build_dword_payload(data_.data() + length_, &value, 1));
    }
    return *this;
}

OemRequest &OemRequest::add_string(std::string_view text) {
    const Text<kMaxText + 1> element(text);
    if (fits(view(element.c_str()).size() + 2)) {
        length_ +=
            static_cast<std::size_t>(build_string_payload(data_.data() + length_, element.c_str()));
    }
    return *this;
}

Outcome OemRequest::send() {
    data_[kLengthByte] = static_cast<unsigned char>(length_ - kHeaderSize);
    auto response_length = static_cast<unsigned short>(response_.size());
    if (send_IPMI_command(kSessionCommand, data_.data(), static_cast<unsigned short>(length_),
                          response_.data(), &response_length, kOemFunction) != 0) {
        return Outcome::kTransportFailed;
    }
    if (response_[kCompletionByte] != 0) {
        return Outcome::kNotCompleted;
    }
    return (response_[kResultByte] & kResultFlag) != 0 ? Outcome::kSucceeded : Outcome::kRefused;
}

std::uint32_t OemRequest::returned_dword() const {
    std::uint32_t value = 0;
    for (std::size_t i = 0; i < sizeof value; ++i) {
        value = value << 8 | response_[kReturnedValue + i];
    }
    return value;
}

std::string_view OemRequest::returned_string() const {
    const std::size_t length = std::min<std::size_t>(response_[kReturnedHeader] & kStringLength,
                                                     response_.size() - kReturnedValue);
    return {reinterpret_cast<const char *>(response_.data() + kReturnedValue), length};
}

}  // namespace velk
