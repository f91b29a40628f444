#include "host/cimxml/http_reader.h"

#include "host/cim/names.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <optional>
#include <utility>

namespace velkhost::cimxml {
namespace {

bool is_token(std::string_view text) {
    constexpr std::string_view kMarks = "!#$%&'*+-.^_`|~";
    return !text.empty() && std::all_of(text.begin(), text.end(), [kMarks](char c) {
        return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
               kMarks.find(c) != std::string_view::npos;
    });
}

bool has_control(std::string_view text) {
    return std::any_of(text.begin(), text.end(), [](char c) {
        const auto byte = static_cast<unsigned char>(c);
        return (byte < 0x20 && c != '\t') || byte == 0x7F;
    });
}

// The largest number stands for all that are larger.
std::optional<std::size_t> number_from(std::string_view text, int base) {
    std::size_t number = 0;
    const char *const end = text.data() + text.size();
    const auto read = std::from_chars(text.data(), end, number, base);
    if (read.ec == std::errc::invalid_argument || read.ptr != end) {
        return std::nullopt;
    }
    return read.ec == std::errc() ? number : std::numeric_limits<std::size_t>::max();
}

}  // namespace

HttpReader::State HttpReader::feed(std::string_view bytes) {
    if (phase_ != Phase::kBroken) {
        buffer_.append(bytes);
        while (step()) {
        }
    }
    return state();
}

HttpReader::State HttpReader::state() const {
    return phase_ == Phase::kReady    ? State::kReady
           : phase_ == Phase::kBroken ? State::kBroken
                                      : State::kIncomplete;
}

HttpRequest HttpReader::take() {
    HttpRequest taken = std::exchange(request_, {});
    buffer_.erase(0, at_);
    at_ = 0;
    field_bytes_ = 0;
    chunked_ = false;
    wants_leave_ = false;
    phase_ = Phase::kRequestLine;
    while (step()) {
    }
    return taken;
}

bool HttpReader::wants_leave() {
    return std::exchange(wants_leave_, false) && state() == State::kIncomplete;
}

void HttpReader::fail(int status, const std::string &why) {
    phase_ = Phase::kBroken;
    status_ = status;
    error_ = why;
}

bool HttpReader::step() {
    if (phase_ == Phase::kReady || phase_ == Phase::kBroken) {
        return false;
    }
    if (phase_ == Phase::kBody || phase_ == Phase::kChunk) {
        return read_body();
    }
    const std::size_t end = buffer_.find('\n', at_);
    if (std::min(end, buffer_.size()) - at_ > limits_.line) {
        fail(phase_ == Phase::kRequestLine ? 414 : 431, "a line is too long");
        return false;
    }
    if (end == std::string::npos) {
        return false;
    }
    std::string_view line = std::string_view(buffer_).substr(at_, end - at_);
    at_ = end + 1;
    if (line.ends_with('\r')) {
        line.remove_suffix(1);
    }
    return step_line(line);
}

bool HttpReader::step_line(std::string_view line) {
    switch (phase_) {
        case Phase::kRequestLine:
            read_request_line(line);
            break;
        case Phase::kFields:
        case Phase::kTrailers:
            read_field(line);
            break;
        case Phase::kChunkSize:
            read_chunk_size(line);
            break;
        default:  // behind a chunk
            phase_ = Phase::kChunkSize;
            if (!line.empty()) {
                fail(400, "a chunk is longer than it was to be");
            }
    }
    return phase_ != Phase::kBroken;
}

void HttpReader::read_request_line(std::string_view line) {
    if (line.empty()) {
        return;  // left over from a request before (RFC 9112, 2.2)
    }
    const std::size_t first = line.find(' ');
    const std::size_t last = line.rfind(' ');
    if (first == std::string_view::npos || first == last || has_control(line) ||
        !is_token(line.substr(0, first))) {
        fail(400, "the request line is none of HTTP");
        return;
    }
    const std::string_view version = line.substr(last + 1);
    request_.method = line.substr(0, first);
    request_.target = line.substr(first + 1, last - first - 1);
    if (request_.target.find(' ') != std::string::npos || !version.starts_with("HTTP/")) {
        fail(400, "the request line is none of HTTP");
        return;
    }
    if (version != "HTTP/1.1" && version != "HTTP/1.0") {
        fail(505, "only HTTP/1.1 and HTTP/1.0 are spoken here");
        return;
    }
    request_.minor_version = version.back() - '0';
    phase_ = Phase::kFields;
}

void HttpReader::read_field(std::string_view line) {
    field_bytes_ += line.size();
    if (field_bytes_ > limits_.fields) {
        fail(431, "the fields are too long");
        return;
    }
    const bool trailers = phase_ == Phase::kTrailers;
    if (line.empty()) {
        if (trailers) {
            phase_ = Phase::kReady;
        } else {
            begin_body();
        }
        return;
    }
    const std::size_t colon = line.find(':');
    if (colon == std::string_view::npos || !is_token(line.substr(0, colon)) || has_control(line)) {
        fail(400, "a field is none of HTTP");
        return;
    }
    if (!trailers) {
        request_.fields.push_back({std::string(line.substr(0, colon)),
                                   std::string(without_blanks(line.substr(colon + 1)))});
    }
}

// RFC 9112, 6.3.
void HttpReader::begin_body() {
    const std::string *const coding = request_.field("Transfer-Encoding");
    const std::string *const length = request_.field("Content-Length");
    const std::string *const expectation = request_.field("Expect");
    if (request_.minor_version == 1 && request_.field("Host") == nullptr) {
        fail(400, "a request without the field Host");
    } else if (expectation != nullptr && !cim::same_name(*expectation, "100-continue")) {
        fail(417, "an expectation that cannot be met");
    } else if (coding != nullptr && length != nullptr) {
        fail(400, "a body with two lengths");
    } else if (coding != nullptr && !cim::same_name(*coding, "chunked")) {
        fail(501, "a transfer coding other than chunked");
    } else if (coding != nullptr) {
        chunked_ = true;
        phase_ = Phase::kChunkSize;
    } else if (length != nullptr) {
        begin_length(*length);
    } else if (request_.method == "POST" || request_.method == "M-POST") {
        fail(411, "a body without a length");
    } else {
        phase_ = Phase::kReady;
    }
    wants_leave_ = expectation != nullptr && phase_ != Phase::kBroken;
}

void HttpReader::begin_length(const std::string &text) {
    const bool differ =
        std::any_of(request_.fields.begin(), request_.fields.end(), [&text](const HttpField &each) {
            return cim::same_name(each.name, "Content-Length") && each.value != text;
        });
    const auto number = number_from(text, 10);
    if (!number || differ) {
        fail(400, "a length that is none");
    } else if (*number > limits_.body) {
        fail(413, "the body is too long");
    } else {
        expected_ = *number;
        phase_ = expected_ == 0 ? Phase::kReady : Phase::kBody;
    }
}

void HttpReader::read_chunk_size(std::string_view line) {
    const auto size = number_from(without_blanks(line.substr(0, line.find(';'))), 16);
    if (!size) {
        fail(400, "the length of a chunk is none");
    } else if (*size > limits_.body - request_.body.size()) {
        fail(413, "the body is too long");
    } else {
        expected_ = *size;
        phase_ = expected_ == 0 ? Phase::kTrailers : Phase::kChunk;
    }
}

bool HttpReader::read_body() {
    const std::size_t count = std::min(expected_, buffer_.size() - at_);
    request_.body.append(buffer_, at_, count);
    at_ += count;
    expected_ -= count;
    buffer_.erase(0, at_);
    at_ = 0;
    if (expected_ > 0) {
        return false;
    }
    phase_ = chunked_ ? Phase::kChunkEnd : Phase::kReady;
    return true;
}

}  // namespace velkhost::cimxml
