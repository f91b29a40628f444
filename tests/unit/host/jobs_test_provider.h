// What a test tells its provider library to answer, and what the library was asked.
#pragma once

#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

namespace velkhost::jobs::test {

struct Answer {
    int state = 4;
    std::string message = "0|a: 10: on its way|";
    bool is_told = true;  // false: state and message stay as they are
    int result = 0;       // of the status function
};

struct Script {
    std::mutex mutex;  // guards all; the clock orders threads but hands nothing over
    Answer answer;
    std::vector<std::int64_t> asked_us;   // when the status function was called
    std::vector<std::string> cleaned_up;  // for which jobs
};

}  // namespace velkhost::jobs::test
