// How long the library wanted to pause.
#pragma once

namespace velkguest {

// Seconds of all calls of sleep() since the last look.
unsigned take_paused_seconds();

// Returns when another thread has just begun a pause.
void wait_for_next_pause();

}  // namespace velkguest
