#include "velk/debug_log.h"

#include <fcntl.h>

#include <cstdarg>
#include <cstdio>
#include <ctime>

#include "velk/bounded_text.h"
#include "velk/file_io.h"

namespace velk {
namespace {

constexpr int kAppend = O_WRONLY | O_CREAT | O_APPEND;
constexpr std::size_t kPrefixSize = 32;
constexpr std::size_t kLineSize = 2048;
constexpr std::size_t kDateSize = 24;  // "Sat Nov 21 08:05:03 2026"

std::tm local_time() {
    const std::time_t now = std::time(nullptr);
    std::tm local = {};
    localtime_r(&now, &local);
    return local;
}

std::size_t format_prefix(std::span<char> prefix) {
    const std::tm now = local_time();
    return print(prefix, 0, "[%2d:%2d:%2d] ", now.tm_hour, now.tm_min, now.tm_sec);
}

}  // namespace

int log_entry(std::string_view message) {
    FileDescriptor log(kDebugLog, kAppend);
    char prefix[kPrefixSize];
    log.write({prefix, format_prefix(prefix)});
    log.write(message);
    return log.close();
}

int log_format(const char *format, ...) {
    char line[kLineSize];
    // NOLINTBEGIN(cppcoreguidelines-init-variables,clang-analyzer-valist.*): va_start sets it
    std::va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(line, sizeof line, format, arguments);
    va_end(arguments);
    // NOLINTEND(cppcoreguidelines-init-variables,clang-analyzer-valist.*)
    return log_entry(line);
}

int log_dated(std::string_view message) {
    const std::tm now = local_time();
    char date[64] = {};  // asctime_r asks for 26 bytes at least
    asctime_r(&now, date);
    Text<kLineSize> line;
    line.add(std::string_view(date).substr(0, kDateSize)).add(" ");
    FileDescriptor log(kDebugLog, O_RDWR | O_CREAT | O_APPEND);
    log.write(line.c_str());
    log.write(Text<kLineSize>(message).add("\n").c_str());
    return log.close();
}

int log_dated_format(const char *format, ...) {
    char message[kLineSize];
    // NOLINTBEGIN(cppcoreguidelines-init-variables,clang-analyzer-valist.*): va_start sets it
    std::va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(message, sizeof message, format, arguments);
    va_end(arguments);
    // NOLINTEND(cppcoreguidelines-init-variables,clang-analyzer-valist.*)
    return log_dated(message);
}

void log_value(std::string_view label, std::string_view value) {
    log_entry(label);
    log_untimed({}, value);
}

void log_value(std::string_view label, int value) {
    log_entry(label);
    log_untimed({}, value);
}

void log_untimed(std::string_view label, int value) {
    char number[16];
    log_untimed(label, std::string_view{number, print(number, 0, "%d", value)});
}

void log_untimed(std::string_view label, std::string_view value) {
    for (const std::string_view text : {label, value, std::string_view{"\n"}}) {
        if (!text.empty()) {
            FileDescriptor(kDebugLog, kAppend).write(text);
        }
    }
}

int open_debug_log() {
    return FileDescriptor(kDebugLog, kAppend).release();
}

}  // namespace velk

int debug(const char *text) {
    velk::FileDescriptor log(velk::kDebugLog, velk::kAppend);
    log.write(velk::view(text));
    return log.close();
}
