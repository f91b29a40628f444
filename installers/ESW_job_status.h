// What the management controller's job says of an update, and what that means for the package.
#pragma once

#include <string_view>

namespace velk::esw {

// What to report for a job's status, and whether that is the end of it.
struct Verdict {
    enum Next { kWait, kInstalled, kFailed };

    int code;
    const char *message;
    Next next;
};

// `detail` is the status' primary part as a number, `text` what follows it.
Verdict judge(int detail, std::string_view text);

// The verdict on a job that gives no status any more.
Verdict no_status();

}  // namespace velk::esw
