#include "bench/load.h"

#include "bench/http_client.h"

#include <algorithm>
#include <chrono>
#include <exception>
#include <mutex>
#include <thread>
#include <vector>

namespace velkbench {
namespace {

using Clock = std::chrono::steady_clock;

// What one connection has seen.
struct Sample {
    std::vector<double> times_ms;
    std::uint64_t errors = 0;
    std::string first_error;

    void note_error(const std::string &what) {
        ++errors;
        if (first_error.empty()) {
            first_error = what;
        }
    }
};

void ask_once(HttpClient &client, const Options &options, const Message &message, Sample &sample) {
    const auto start = Clock::now();
    try {
        const Response response = client.ask(message.bytes);
        const std::chrono::duration<double, std::milli> time = Clock::now() - start;
        if (response.status != 200 || response.body.find("<ERROR ") != std::string::npos) {
            sample.note_error("status " + std::to_string(response.status) + ": " + response.body);
            return;
        }
        sample.times_ms.push_back(time.count());
    } catch (const std::exception &error) {
        client.disconnect();
        sample.note_error(error.what());
    }
    if (options.new_connections) {
        client.disconnect();
    }
}

Sample ask_until(Clock::time_point end, const Options &options, const Message &message) {
    Sample sample;
    HttpClient client(options.url);
    while (Clock::now() < end) {
        ask_once(client, options, message, sample);
    }
    return sample;
}

double at_share(std::vector<double> &times, double share) {
    if (times.empty()) {
        return 0;
    }
    const auto place = static_cast<std::ptrdiff_t>(share * static_cast<double>(times.size() - 1));
    std::nth_element(times.begin(), times.begin() + place, times.end());
    return times[static_cast<std::size_t>(place)];
}

}  // namespace

Figures measure(const Options &options, const Message &message, std::size_t connections) {
    std::mutex mutex;
    Sample all;
    std::vector<std::thread> threads;
    const auto start = Clock::now();
    const auto end = start + options.length;
    for (std::size_t i = 0; i < connections; ++i) {
        threads.emplace_back([&] {
            const Sample sample = ask_until(end, options, message);
            const std::lock_guard lock(mutex);
            all.times_ms.insert(all.times_ms.end(), sample.times_ms.begin(), sample.times_ms.end());
            all.errors += sample.errors;
            all.first_error = all.first_error.empty() ? sample.first_error : all.first_error;
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    const std::chrono::duration<double> length = Clock::now() - start;
    Figures figures;
    figures.connections = connections;
    figures.answers = all.times_ms.size();
    figures.errors = all.errors;
    figures.first_error = all.first_error;
    figures.per_second = static_cast<double>(figures.answers) / length.count();
    figures.median_ms = at_share(all.times_ms, 0.5);
    figures.percentile99_ms = at_share(all.times_ms, 0.99);
    return figures;
}

}  // namespace velkbench
