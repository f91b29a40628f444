// A record of the calls through a broker: clients' requests and providers' up-calls.
#pragma once

#include "host/broker/api.h"
#include "host/broker/status.h"

#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace velkhost::broker {

struct TraceEntry {
    enum class Side { kClient, kUpCall };

    std::uint64_t number = 0;  // from 1, in the order in which the calls began
    Side side = Side::kClient;
    std::string operation;  // as the slot is called: "invokeMethod"
    std::string name_space;
    std::string class_name;
    std::string method;     // of invokeMethod; association class or query elsewhere
    std::string arguments;  // as text: keys of the path, input arguments, instance
    unsigned thread = 0;
    bool finished = false;
    Status status;
    std::string result;  // as text: return value and output arguments, or what was found
};

// `#3 up-call invokeMethod zeb/cimv2:ZEB_X.InstallFromURI(URI="..") -> 0 4096, Job=..`, one line.
VELKBROKER_API std::string to_text(const TraceEntry &entry);

class VELKBROKER_API Trace {
  public:
    // Older entries are dropped.
    static constexpr std::size_t kMaxEntries = 65536;

    // Called when a call begins and when it has ended (then `finished` is set), on its thread, with
    // no lock held; by several threads at once. An empty function ends it.
    using Subscriber = std::function<void(const TraceEntry &)>;
    void subscribe(Subscriber subscriber);

    [[nodiscard]] std::vector<TraceEntry> entries() const;
    void clear();

    // -- For the broker's own code --

    std::uint64_t begin(TraceEntry entry);
    void finish(std::uint64_t number, const Status &status, std::string result);

  private:
    std::shared_ptr<const Subscriber> subscriber() const;

    mutable std::mutex lock_;
    std::deque<TraceEntry> entries_;
    std::uint64_t last_ = 0;
    std::shared_ptr<const Subscriber> subscriber_;
};

}  // namespace velkhost::broker
