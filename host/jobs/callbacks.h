// The two functions that a job's provider registered.
#pragma once

#include <optional>
#include <string>

#include "host/jobs/job_registration.h"

namespace velkhost::jobs {

// The fields of a registration as texts.
struct Registration {
    std::string provider_name;
    std::string library_path;
    std::string status_function;
    std::string cleanup_function;

    // No value when a field is empty or lacks its terminator.
    static std::optional<Registration> read(const JobRegistration &record);
};

// What a status function tells.
struct Reading {
    int state = 0;
    std::string message;
};

// Holds the provider's library open. Its functions may be called by several threads at once.
class Callbacks {
  public:
    // Opens the library and finds the functions. Where that fails, error() says why; the calls
    // that need what is missing then do nothing.
    explicit Callbacks(const Registration &registration);
    ~Callbacks();
    Callbacks(const Callbacks &) = delete;
    Callbacks &operator=(const Callbacks &) = delete;

    // Why the status cannot be asked for; empty when it can.
    [[nodiscard]] const std::string &error() const { return error_; }

    // What the status function makes of what is known of the job; no value when it knows nothing.
    [[nodiscard]] std::optional<Reading> status(const std::string &id, const Reading &known) const;

    void clean_up(const std::string &id) const;

  private:
    using StatusFunction = int(const char *, int *, char *, int);
    using CleanupFunction = int(const char *);

    void *library_ = nullptr;
    StatusFunction *status_ = nullptr;
    CleanupFunction *cleanup_ = nullptr;
    std::string error_;
};

}  // namespace velkhost::jobs
