// One line on stderr, written without stdio and without memory.
#pragma once

#include <initializer_list>
#include <string_view>

namespace velkhost::shim {

// Writes "velkshim: ", the parts one after the other, and a line end.
void complain(std::initializer_list<std::string_view> parts);

}  // namespace velkhost::shim
