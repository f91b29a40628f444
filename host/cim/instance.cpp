#include "host/cim/instance.h"

#include "host/cim/names.h"

namespace velkhost::cim {

bool ObjectPath::operator==(const ObjectPath &other) const {
    return same_name(host, other.host) && same_name(name_space, other.name_space) &&
           same_name(class_name, other.class_name) && keys == other.keys;
}

std::string to_text(const ObjectPath &path) {
    std::string text = path.host.empty() ? "" : "//" + path.host + '/';
    text += path.name_space + ':' + path.class_name;
    if (!path.keys.empty()) {
        text += '.' + to_text(path.keys, ",");
    }
    return text;
}

std::string to_text(const Instance &instance) {
    return "instance of " + instance.path.class_name + " { " + to_text(instance.properties) + " }";
}

}  // namespace velkhost::cim
