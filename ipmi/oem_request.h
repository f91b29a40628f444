// One OEM request of the option-firmware session (network function 0x3A, command 0xF0):
//
//   byte 0     operation code
//   byte 1, 2  0
//   byte 3     length of the payload
//   byte 4...  payload elements (payload_builders.h)
//
// and its response: byte 0 is the IPMI completion code, bit 0 of byte 2 tells whether the operation
// succeeded, returned elements follow from byte 5 on.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace velk {

inline constexpr unsigned char kOemFunction = 0x3A;

enum class Operation : unsigned char {
    kCreate = 0x01,
    kDestroy = 0x02,
    kOpen = 0x03,
    kClose = 0x04,
    kBeginOptionUpdate = 0x08,
    kStatus = 0x09,
    kCancel = 0x0E,
    kGetVariable = 0x16,
};

// What became of a request. A completion code other than 0 is no failure here: the controller has
// answered, and the operation counts as done without a result.
enum class Outcome { kTransportFailed, kNotCompleted, kRefused, kSucceeded };

class OemRequest {
  public:
    explicit OemRequest(Operation operation);

    OemRequest &add_dword(std::uint32_t value);
    OemRequest &add_string(std::string_view text);  // of up to 127 characters

    // Sends over the KCS channel.
    [[nodiscard]] Outcome send();

    // The number in response bytes 6 to 9, most significant first, and the text element whose
    // header is byte 5. Bytes that the controller did not send count as 0.
    [[nodiscard]] std::uint32_t returned_dword() const;
    [[nodiscard]] std::string_view returned_string() const;

  private:
    static constexpr std::size_t kBufferSize = 272;
    static constexpr std::size_t kResponseSize = 128;

    [[nodiscard]] bool fits(std::size_t element_size) const;

    std::array<unsigned char, kBufferSize> data_ = {};
    std::size_t length_;
    std::array<unsigned char, kResponseSize> response_ = {};
};

}  // namespace velk
