// One client's connection. At any moment it belongs to one thread: the event loop, which reads from
// it, or the worker that answers a request of it.
#pragma once

#include "host/cimxml/descriptor.h"
#include "host/cimxml/http_reader.h"
#include "host/cimxml/machine_time.h"

#include <cstdint>
#include <string_view>
#include <utility>

namespace velkhost::cimxml {

class Connection {
  public:
    Connection(Descriptor fd, HttpLimits limits)
        : fd_(std::move(fd)), reader_(limits), since_ms_(machine_ms()) {}

    // What a read left: more is to come, something is to be answered, or the client has gone.
    enum class Reading { kMore, kAnswer, kGone };

    // Reads what is there without waiting.
    Reading read();

    // Sends all of it; false when the client does not take it. Waits for a slow client, but no
    // longer than `patience_ms` for each piece.
    bool send(std::string_view bytes, int patience_ms);

    // After the last response: takes a little of what the client still sends. A socket that is
    // closed with unread bytes in it would take the response from the client.
    void finish();

    [[nodiscard]] HttpReader &reader() { return reader_; }
    [[nodiscard]] int fd() const { return fd_.get(); }
    // Since when it has been idle, or in the middle of a request, on the machine's clock.
    [[nodiscard]] std::int64_t since_ms() const { return since_ms_; }

  private:
    Descriptor fd_;
    HttpReader reader_;
    std::int64_t since_ms_;
};

}  // namespace velkhost::cimxml
