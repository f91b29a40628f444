// What the terminal behind a descriptor can do.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace velkhost::cli {

struct Terminal {
    bool interactive = false;  // the cursor can be moved: a terminal, and no dumb one
    bool colour = false;
    bool utf8 = false;

    // Looks at `fd`, TERM, NO_COLOR (any text but the empty one: no colour) and the locale.
    static Terminal of(int fd);
};

struct WindowSize {
    std::size_t columns = 80;
    std::size_t rows = 24;
};

// The window's size now; 80 x 24 where it cannot be told.
WindowSize window_size(int fd);

// What ends a text that was cut.
std::string_view cut_mark(const Terminal &terminal);

enum class Ink { kPlain, kDim, kBold, kGood, kBad, kBusy, kWarn };

// The text in that ink; as it is where there is no colour.
std::string paint(const Terminal &terminal, Ink ink, std::string_view text);

}  // namespace velkhost::cli
