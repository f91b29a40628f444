#include "host/providers/hypervisor/installed_vibs.h"

#include <cstring>

namespace velkhost::providers {

bool is_later(const std::string &version, const std::string &than) {
    return strverscmp(version.c_str(), than.c_str()) > 0;
}

InstalledVibs::InstalledVibs(const std::vector<std::string> &packages) {
    for (const std::string &package : packages) {
        const auto blank = package.find(' ');
        versions_[package.substr(0, blank)] = package.substr(blank + 1);
    }
}

bool InstalledVibs::take_later(const std::vector<Vib> &vibs) {
    const std::lock_guard lock(mutex_);
    bool any = false;
    for (const Vib &vib : vibs) {
        const auto known = versions_.find(vib.name);
        if (known == versions_.end() || is_later(vib.version, known->second)) {
            versions_[vib.name] = vib.version;
            any = true;
        }
    }
    return any;
}

}  // namespace velkhost::providers
