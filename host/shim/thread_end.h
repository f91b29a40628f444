// A call at the end of a thread, after its own thread-local objects are gone.
#pragma once

namespace velkhost::shim {

// Makes the end of the calling thread known to the virtual clock, however the thread ends.
void watch_thread_end();

}  // namespace velkhost::shim
