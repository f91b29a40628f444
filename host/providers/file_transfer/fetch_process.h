// A source in another process: the fetcher, which this one starts, hears and ends.
#pragma once

#include "host/providers/file_transfer/source.h"

#include <array>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include <sys/types.h>

namespace velkhost::providers {

// Waiting for the fetcher is work on the host's clock, which therefore stands still meanwhile.
class FetchProcess final : public Source {
  public:
    // Starts `program` with the request; one that cannot be started shows as the outcome.
    FetchProcess(const std::filesystem::path &program, const FetchRequest &request);
    // Ends the fetcher if it still runs.
    ~FetchProcess() override;

    Piece next(const std::stop_token &stop) override;

  private:
    void start(const std::filesystem::path &program, int socket);
    void send(const std::string &text) const;
    enum class Read { kDone, kEnded, kStopped, kSilent };
    Read read(char *into, std::size_t length, const std::stop_token &stop) const;
    Read wait_for_bytes(const std::stop_token &stop) const;
    std::optional<Piece> read_frame(Read &how, const std::stop_token &stop);
    std::optional<Piece> piece_of(char kind) const;
    void finish();

    int socket_ = -1;
    pid_t process_ = -1;
    std::uint32_t silent_seconds_;     // after which the fetcher itself counts as stuck
    std::optional<int> start_failed_;  // an errno value
    std::vector<char> content_;        // of the latest frame
};

// The fetcher that belongs to this shared object: the program velkfetch beside it.
std::filesystem::path fetcher_beside_this_library();

}  // namespace velkhost::providers
