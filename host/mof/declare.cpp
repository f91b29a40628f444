#include "host/mof/declare.h"

#include <string>

namespace velkhost::mof {

bool declare_new(NameTable &table, const Token &name, std::string_view what, TokenStream &in) {
    const NameTable::Entry *earlier = table.declare(name.spelling, name.position);
    if (earlier == nullptr) {
        return true;
    }
    const bool in_source = !earlier->position.file.empty();
    in.report(name.position,
              "expected a new " + std::string{what} + ", found " + describe(name) + " (declared " +
                  (in_source ? "at " + to_string(earlier->position) : "before") + ")");
    return false;
}

}  // namespace velkhost::mof
