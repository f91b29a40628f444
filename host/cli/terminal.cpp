#include "host/cli/terminal.h"

#include <langinfo.h>
#include <locale.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <cstdlib>

namespace velkhost::cli {
namespace {

std::string_view environment(const char *name) {
    const char *const value = std::getenv(name);
    return value == nullptr ? std::string_view{} : value;
}

// Asked without changing the process's own locale, which belongs to the libraries as well.
bool locale_is_utf8() {
    const locale_t locale = newlocale(LC_CTYPE_MASK, "", nullptr);
    if (locale == nullptr) {
        return false;
    }
    const bool utf8 = std::string_view(nl_langinfo_l(CODESET, locale)) == "UTF-8";
    freelocale(locale);
    return utf8;
}

const char *code_of(Ink ink) {
    switch (ink) {
        case Ink::kDim:
            return "\x1b[2m";
        case Ink::kBold:
            return "\x1b[1m";
        case Ink::kGood:
            return "\x1b[32m";
        case Ink::kBad:
            return "\x1b[31m";
        case Ink::kBusy:
            return "\x1b[36m";
        case Ink::kWarn:
            return "\x1b[33m";
        case Ink::kPlain:
            break;
    }
    return "";
}

}  // namespace

Terminal Terminal::of(int fd) {
    Terminal terminal;
    const std::string_view kind = environment("TERM");
    terminal.interactive = isatty(fd) == 1 && !kind.empty() && kind != "dumb";
    terminal.colour = terminal.interactive && environment("NO_COLOR").empty();
    terminal.utf8 = locale_is_utf8();
    return terminal;
}

WindowSize window_size(int fd) {
    winsize size{};
    WindowSize result;
    if (ioctl(fd, TIOCGWINSZ, &size) == 0 && size.ws_col > 0 && size.ws_row > 0) {
        result = {size.ws_col, size.ws_row};
    }
    return result;
}

std::string_view cut_mark(const Terminal &terminal) {
    return terminal.utf8 ? "…" : "...";
}

std::string paint(const Terminal &terminal, Ink ink, std::string_view text) {
    if (!terminal.colour || ink == Ink::kPlain || text.empty()) {
        return std::string(text);
    }
    return std::string(code_of(ink)).append(text).append("\x1b[0m");
}

}  // namespace velkhost::cli
