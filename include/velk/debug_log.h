// The debug log /tmp/velkdebug.txt. It is opened for every single write and closed straight after,
// so that it can be deleted at any moment. Nothing here fails loudly.
#pragma once

#include <string_view>

#include "velk/api.h"

// Appends `text` as it is. Returns the result of closing the log, -1 when it could not be opened.
VELK_API int debug(const char *text);

namespace velk {

inline constexpr const char *kDebugLog = "/tmp/velkdebug.txt";

// An entry: "[hh:mm:ss] " in local time, each number padded with blanks to two places, and then
// the message, as two writes. The message brings its own line end. Result as of `debug`.
int log_entry(std::string_view message);

// The same with a message made by a printf format, cut at 2047 characters.
[[gnu::format(printf, 1, 2)]] int log_format(const char *format, ...);

// An entry `label`, then, untimed, the value and a line end.
void log_value(std::string_view label, std::string_view value);
void log_value(std::string_view label, int value);

// The same wholly untimed.
void log_untimed(std::string_view label, std::string_view value);
void log_untimed(std::string_view label, int value);

// An entry of the session with the management controller: the local time as asctime(3) renders it,
// without its line end, a blank, the message and a line end. Result as of `debug`.
int log_dated(std::string_view message);
[[gnu::format(printf, 1, 2)]] int log_dated_format(const char *format, ...);

// Opens the log for appending and leaves it open; returns the descriptor.
int open_debug_log();

}  // namespace velk
