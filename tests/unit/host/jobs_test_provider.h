// What a test tells its provider library to answer, and what the library was asked.
#pragma once

#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

namespace velkhost::jobs::test {

struct Script {
    std::mutex mutex;
    int result = 0;  // of the status function
    int state = 4;
    std::string message = "0|a: 10: on its way|";
    bool tells = true;  // false: leaves state and message as they are

    std::vector<std::int64_t> asked_us;   // when the status function was called
    std::vector<std::string> cleaned_up;  // for which jobs
};

}  // namespace velkhost::jobs::test
