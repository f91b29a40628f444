// What the MOF compiler has to say about a source, and where.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::mof {

// A place in a source. Lines and columns count from 1; a column is one character, not one byte.
// The file's name is owned by the compilation.
struct Position {
    std::string_view file;
    std::uint32_t line = 1;
    std::uint32_t column = 1;
};

// "file:line:column", as compilers print it.
std::string to_string(const Position &position);

// One error, owning its texts, so that it outlives the compilation.
struct Diagnostic {
    std::string file;
    std::uint32_t line = 1;
    std::uint32_t column = 1;
    std::string text;  // "expected A, found B"

    // "file:line:column: text"
    [[nodiscard]] std::string to_string() const;
};

// The errors of one compilation, in the order in which they were met. It is bounded: a source that
// is not MOF at all must not make a report as long as itself.
class ErrorList {
  public:
    static constexpr std::size_t kMaxErrors = 20;

    void add(const Position &position, std::string text);

    // No more errors are taken from here on: what follows could only be a consequence.
    void close() { closed_ = true; }

    // True once further reading is pointless.
    [[nodiscard]] bool closed() const { return closed_; }

    [[nodiscard]] const std::vector<Diagnostic> &all() const { return errors_; }

  private:
    std::vector<Diagnostic> errors_;
    bool closed_ = false;
};

// Thrown inside the parser, after the error was added to the list, to get to the nearest place
// where reading can go on. It never leaves the compiler.
struct SyntaxError {};

inline constexpr std::size_t kMaxShownBytes = 40;
// Longer names of files are not looked up, and longer paths not shown whole.
inline constexpr std::size_t kMaxPathBytes = 1000;

// A text from a source as an error message may show it: in quotes, cut when long, no control
// characters.
std::string shown(std::string_view text, std::size_t max_bytes = kMaxShownBytes);

}  // namespace velkhost::mof
