#include "host/providers/kit/association.h"

namespace velkhost::providers {

Instance Association::as_instance(const Link &link) const {
    return {{{roles_.first, link.first.reference()}, {roles_.second, link.second.reference()}}, {}};
}

std::vector<Instance> Association::instances() {
    std::vector<Instance> out;
    for (const Link &link : links()) {
        out.push_back(as_instance(link));
    }
    return out;
}

}  // namespace velkhost::providers
