#include "host/providers/file_transfer/fetch_protocol.h"

#include <charconv>
#include <vector>

namespace velkhost::providers {
namespace {

constexpr std::size_t kFields = 9;

std::vector<std::string_view> split(std::string_view text) {
    std::vector<std::string_view> fields;
    while (!text.empty()) {
        const std::size_t end = text.find('\0');
        if (end == std::string_view::npos) {
            return {};
        }
        fields.push_back(text.substr(0, end));
        text.remove_prefix(end + 1);
    }
    return fields;
}

std::optional<std::uint32_t> number_of(std::string_view text) {
    std::uint32_t number = 0;
    const char *const end = text.data() + text.size();
    const auto [rest, error] = std::from_chars(text.data(), end, number);
    return error == std::errc() && rest == end ? std::optional(number) : std::nullopt;
}

}  // namespace

std::string encode(const FetchRequest &request) {
    std::string text;
    for (const std::string &field :
         {request.url, request.scheme, request.user, request.password, request.private_key,
          request.known_hosts, std::to_string(request.block_size),
          std::to_string(request.connect_seconds), std::to_string(request.stall_seconds)}) {
        text += field;
        text += '\0';
    }
    return text;
}

std::optional<FetchRequest> decode_request(std::string_view text) {
    const std::vector<std::string_view> fields = split(text);
    if (fields.size() != kFields) {
        return std::nullopt;
    }
    const auto block_size = number_of(fields[6]);
    const auto connect = number_of(fields[7]);
    const auto stall = number_of(fields[8]);
    if (!block_size || !connect || !stall) {
        return std::nullopt;
    }
    const auto string = [&fields](std::size_t i) { return std::string(fields[i]); };
    return FetchRequest{string(0), string(1),   string(2), string(3), string(4),
                        string(5), *block_size, *connect,  *stall};
}

std::array<char, kFrameHeader> frame_header(FrameKind kind, std::size_t length) {
    std::array<char, kFrameHeader> header{static_cast<char>(kind)};
    for (std::size_t i = 1; i < kFrameHeader; ++i) {
        header.at(i) = static_cast<char>(static_cast<unsigned char>(length & 0xFFU));
        length >>= 8U;
    }
    return header;
}

std::size_t frame_length(const std::array<char, kFrameHeader> &header) {
    std::size_t length = 0;
    for (std::size_t i = kFrameHeader - 1; i > 0; --i) {
        length = length << 8U | static_cast<unsigned char>(header.at(i));
    }
    return length;
}

}  // namespace velkhost::providers
