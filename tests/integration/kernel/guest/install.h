// An adapter's installation as the session sees it: the session opens, its watcher polls, the main
// thread is busy for a while and closes the session.
#pragma once

#include <string>

namespace velkguest {

// The main thread is busy until the watcher has asked `queries` times, and closes the session while
// the watcher pauses. "watched=S closing=S": for how many seconds either wanted to pause.
std::string install(unsigned queries);

// The main thread closes the session after one second, whatever the watcher does then, and gets
// `limit_s` seconds for it: "closing ended" or "closing hangs".
std::string install_in_a_hurry(int limit_s);

// How many descriptors of the device this process has.
int open_channels();

}  // namespace velkguest
