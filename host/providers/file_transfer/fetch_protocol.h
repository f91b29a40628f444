// What the file transfer service and its fetcher say to each other over one stream socket. The
// service sends a request and closes its side; the fetcher answers with frames, the last of which
// is the outcome. Both run on the same machine, from the same build.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace velkhost::providers {

// What to fetch, and how. Texts hold no NUL; an empty one means none.
struct FetchRequest {
    std::string url;  // without user information
    std::string scheme;
    std::string user;
    std::string password;
    std::string private_key;
    std::string known_hosts;
    std::uint32_t block_size = 512;  // of TFTP, 8 to 65464 (RFC 2348)
    std::uint32_t connect_seconds = 30;
    std::uint32_t stall_seconds = 60;
};

std::string encode(const FetchRequest &request);
// No value for a text that `encode` did not make.
std::optional<FetchRequest> decode_request(std::string_view text);

// How a fetch ended; also how a whole transfer ends.
enum class FetchResult : char {
    kFetched = 'F',
    kFailed = 'X',
    kTimedOut = 'T',
    kInvalid = 'I',
    kNoSpace = 'S',
};

struct FetchOutcome {
    FetchResult result = FetchResult::kFailed;
    std::string text;  // why, for people; empty when fetched
};

// A frame: its kind, the length of what follows (least significant byte first), and that.
enum class FrameKind : char {
    kSize = 's',  // the file's size as the server announces it, in decimal; at most once, first
    kData = 'd',  // the next bytes of the file
    kEnd = 'e',   // a FetchResult, then the outcome's text
};

inline constexpr std::size_t kFrameHeader = 5;
// The longest content of a frame. Data comes in frames of this length, but for the last one.
inline constexpr std::size_t kLongestFrame = 16384;

std::array<char, kFrameHeader> frame_header(FrameKind kind, std::size_t length);
std::size_t frame_length(const std::array<char, kFrameHeader> &header);

}  // namespace velkhost::providers
