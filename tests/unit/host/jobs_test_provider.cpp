// A provider library with a status and a clean-up function for its jobs.
#include "tests/unit/host/jobs_test_provider.h"

#include <chrono>

using velkhost::jobs::test::Answer;
using velkhost::jobs::test::Script;

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED Script *job_script() {
    static auto *const script = new Script;  // never destroyed: polls may come to the very end
    return script;
}

EXPORTED int tell_status(const char *, int *state, char *message, int size) {
    Script &script = *job_script();
    const std::lock_guard lock(script.mutex);
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    script.asked_us.push_back(std::chrono::duration_cast<std::chrono::microseconds>(now).count());
    const Answer &answer = script.answer;
    if (answer.is_told) {
        *state = answer.state;
        message[answer.message.copy(message, static_cast<std::size_t>(size) - 1)] = '\0';
    }
    return answer.result;
}

EXPORTED int clean_up_job(const char *instance_id) {
    Script &script = *job_script();
    const std::lock_guard lock(script.mutex);
    script.cleaned_up.emplace_back(instance_id);
    return 1;
}
