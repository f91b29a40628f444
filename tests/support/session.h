// The library's session globals, as one: put back to what they were at load, and compared.
#pragma once

#include <span>
#include <string>
#include <vector>

#include "velk/package_table.h"

namespace velktest {

// Every session global, the broker handle included; the mutex is left out.
std::vector<std::span<char>> session_globals();

// Puts every session global back to its state at load.
void reset_session();

// The bytes of all session globals, one after the other.
std::string session_image();

// The bytes of one record.
std::string record_image(int index);

// Puts text into a field of a record, cut to it, with nothing left behind the terminator.
void set_field(std::span<char> field, std::string_view text);

}  // namespace velktest
