// String and character literals: "..." and '...' with their escapes (DSP0004, annex A).
#pragma once

#include "host/mof/cursor.h"
#include "host/mof/diagnostics.h"

#include <string>

namespace velkhost::mof {

struct QuotedText {
    std::string text;    // decoded, UTF-8
    bool intact = true;  // false: something in it was wrong and is reported
};

// Reads from the opening quote, which decides what closes it, to behind the closing one, or to
// the end of the line where there is none. A bad escape is left out.
QuotedText read_quoted(Cursor &cursor, ErrorList &errors);

}  // namespace velkhost::mof
