// Requests out of the bytes of one connection, in whatever pieces they come.
#pragma once

#include "host/cimxml/http_message.h"

#include <cstddef>
#include <string>
#include <string_view>

namespace velkhost::cimxml {

struct HttpLimits {
    std::size_t line = 8192;       // of a request line or a field
    std::size_t fields = 32'768;   // of all fields of a request, and of its trailers
    std::size_t body = 4'194'304;  // after chunks have been put together
};

class HttpReader {
  public:
    enum class State {
        kIncomplete,
        kReady,   // a request can be taken
        kBroken,  // the connection cannot be read on
    };

    explicit HttpReader(HttpLimits limits = {}) : limits_(limits) {}

    // Takes the next bytes of the connection.
    State feed(std::string_view bytes);

    [[nodiscard]] State state() const;

    // Of a broken connection: the status to answer with (400, 411, 413, 414, 431, 501 or 505), and
    // why.
    [[nodiscard]] int status() const { return status_; }
    [[nodiscard]] const std::string &error() const { return error_; }

    // Takes the request and goes on with what came behind it.
    HttpRequest take();

    // Whether nothing of a request is there.
    [[nodiscard]] bool is_idle() const {
        return phase_ == Phase::kRequestLine && at_ == buffer_.size();
    }

    // Whether the client waits for leave to send the body; true once for each request.
    bool wants_leave();

  private:
    enum class Phase {
        kRequestLine,
        kFields,
        kBody,       // of a known length
        kChunkSize,  // the line before a chunk
        kChunk,
        kChunkEnd,  // the line behind it
        kTrailers,
        kReady,
        kBroken,
    };

    // One step; false when it takes more bytes.
    bool step();
    bool step_line(std::string_view line);
    void read_request_line(std::string_view line);
    void read_field(std::string_view line);
    void read_chunk_size(std::string_view line);
    void begin_body();
    void begin_length(const std::string &text);
    bool read_body();
    void fail(int status, const std::string &why);

    const HttpLimits limits_;
    std::string buffer_;
    std::size_t at_ = 0;  // what is before it has been read
    Phase phase_ = Phase::kRequestLine;
    HttpRequest request_;
    std::size_t field_bytes_ = 0;
    std::size_t expected_ = 0;  // bytes of the body or the chunk that are still to come
    bool chunked_ = false;
    bool wants_leave_ = false;
    int status_ = 0;
    std::string error_;
};

}  // namespace velkhost::cimxml
