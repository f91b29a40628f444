#include "host/cim/class_decl.h"

#include "host/cim/names.h"

#include <algorithm>

namespace velkhost::cim {
namespace {

// A boolean qualifier's value: `absent` where it is not given, false where it is given as null.
bool flag(const std::vector<Qualifier> &qualifiers, const std::string &name, bool absent) {
    const Qualifier *found = find_qualifier(qualifiers, name);
    if (found == nullptr) {
        return absent;
    }
    return !found->values.empty() && same_name(found->values.front(), "true");
}

}  // namespace

bool PropertyDecl::is_key() const {
    return flag(qualifiers, "Key", false);
}

bool ParameterDecl::is_in() const {
    return flag(qualifiers, "In", true);
}

bool ParameterDecl::is_out() const {
    return flag(qualifiers, "Out", false);
}

bool ClassDecl::is_association() const {
    return flag(qualifiers, "Association", false);
}

bool ClassDecl::is_abstract() const {
    return flag(qualifiers, "Abstract", false);
}

const Qualifier *find_qualifier(const std::vector<Qualifier> &qualifiers, const std::string &name) {
    const auto found =
        std::find_if(qualifiers.begin(), qualifiers.end(),
                     [&name](const Qualifier &each) { return same_name(each.name, name); });
    return found == qualifiers.end() ? nullptr : &*found;
}

}  // namespace velkhost::cim
