// One connection to an HTTP server, blocking, as small as a benchmark needs it.
#pragma once

#include "bench/options.h"
#include "host/cimxml/descriptor.h"

#include <string>
#include <string_view>

namespace velkbench {

struct Response {
    int status = 0;
    std::string body;
};

class HttpClient {
  public:
    explicit HttpClient(Url url) : url_(std::move(url)) {}

    // Sends the request on the connection, a new one where there is none, and reads the response.
    // Throws std::runtime_error when there is no answer.
    Response ask(std::string_view request);

    void disconnect() { fd_.reset(); }

  private:
    void connect();
    void send(std::string_view bytes) const;
    void read_more();
    std::string take_line();
    std::string take_bytes(std::size_t count);
    std::string take_chunks();

    const Url url_;
    velkhost::cimxml::Descriptor fd_;
    std::string buffer_;
};

}  // namespace velkbench
