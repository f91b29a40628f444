// The update session around an adapter install, and the watcher that keeps it alive.
#pragma once

namespace velk::adapter {

// Opens a session with the management controller and starts its watcher. The install goes on
// whether or not that worked.
class UpdateSession {
  public:
    explicit UpdateSession(void *(*watcher)(void *session_block));

    // Lets the watcher end after its current pause, and closes the session if it was opened and is
    // watched.
    void close() const;

  private:
    void start_watcher(void *(*watcher)(void *session_block));

    int result_ = 0;  // as long as it is 0, the session is to be closed at the end
};

// Body of a watcher thread: hands the session's value to `poll`, and returns null.
void *watch_session(void *session_block, int (*poll)(int session_value));

// Asks the controller for the session's status every 30 seconds while `ga_is_thread_running` is
// set. Returns the last answer.
int poll_session(int session_value, const char *start_line);

}  // namespace velk::adapter
