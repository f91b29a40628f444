// The texts of an XML document's elements, where they hold nothing but text.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace velkhost::providers {

// What stands between each <element> and the </element> behind it, blanks around it left out.
// Elements with attributes are not found.
std::vector<std::string> texts_of(std::string_view xml, std::string_view element);

}  // namespace velkhost::providers
