// The fixed paths of the provider's host and the text rules by which a path meets them. Pure text
// work: no file system, no allocation, no global state.
#pragma once

#include <cstddef>
#include <optional>
#include <span>
#include <string_view>

namespace velkhost::shim {

// An absolute path after its text was put in order.
struct OrderedPath {
    std::size_t length = 0;       // characters written, without a terminator
    bool names_a_folder = false;  // the text ended in '/', "." or ".."
};

// Writes `path` to `out` with runs of '/' collapsed and "." and ".." resolved by text alone; ".."
// at the top stays at the top. The result has no '/' at its end and is empty for the top itself.
// No value when `path` is not absolute or the result does not fit into `out`.
std::optional<OrderedPath> put_in_order(std::string_view path, std::span<char> out);

// True when `ordered` (as put_in_order writes it) is one of the fixed paths or lies under one.
bool is_fixed_path(std::string_view ordered);

}  // namespace velkhost::shim
