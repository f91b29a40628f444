// CIM names (DSP0004, 5.2.1): compared without regard to case.
#pragma once

#include <string_view>

namespace velkhost::cim {

// Whether both spell the same name. ASCII letters ignore case; other characters must be equal.
[[nodiscard]] bool same_name(std::string_view left, std::string_view right);

// Order by name, for maps and sets keyed by a CIM name; lets them be searched by string_view.
struct NameLess {
    using is_transparent = void;
    bool operator()(std::string_view left, std::string_view right) const;
};

}  // namespace velkhost::cim
