#include "host/broker/repository.h"

#include <algorithm>
#include <mutex>

namespace velkhost::broker {
namespace {

template <class Members>
auto locate(Members &members, std::string_view name) {
    return std::find_if(members.begin(), members.end(),
                        [name](const auto &member) { return cim::same_name(member.name, name); });
}

template <class Members>
const typename Members::value_type *find_member(const Members &members, std::string_view name) {
    const auto place = locate(members, name);
    return place == members.end() ? nullptr : &*place;
}

// `own` on top of `inherited`. A key stays a key when it is declared again (DSP0004, 5.6.3.30).
template <class Members>
Members merged(Members inherited, const Members &own) {
    for (const auto &member : own) {
        const auto place = locate(inherited, member.name);
        if (place == inherited.end()) {
            inherited.push_back(member);
            continue;
        }
        auto qualifiers = member.qualifiers;
        for (const cim::Qualifier &qualifier : place->qualifiers) {
            if (cim::find_qualifier(qualifiers, qualifier.name) == nullptr) {
                qualifiers.push_back(qualifier);
            }
        }
        *place = member;
        place->qualifiers = std::move(qualifiers);
    }
    return inherited;
}

MergedClass merged_class(const cim::ClassDecl &own, const MergedClass *superclass) {
    MergedClass result{own, {}, own};
    if (superclass != nullptr) {
        const cim::ClassDecl &inherited = superclass->declaration;
        result.declaration.properties = merged(inherited.properties, own.properties);
        result.declaration.methods = merged(inherited.methods, own.methods);
        result.ancestors = superclass->ancestors;
        result.ancestors.insert(result.ancestors.begin(), inherited.name);
    }
    return result;
}

cim::Value initial_value(const cim::PropertyDecl &property) {
    const CMPIType type = property.type.type;
    if (!property.default_value) {
        return cim::Value::null(type);
    }
    const auto element_type = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    cim::Value::Array elements;
    for (const std::string &text : *property.default_value) {
        elements.push_back(
            cim::value_from_text(element_type, text).value_or(cim::Value::null(element_type)));
    }
    if ((type & CMPI_ARRAY) != 0) {
        return cim::Value::array(element_type, std::move(elements));
    }
    return elements.empty() ? cim::Value::null(type) : elements.front();
}

// The key's value: the property's if it has one, else what the path was made with.
const cim::Value *key_value(const cim::Instance &instance, std::string_view name) {
    const cim::Value *property = instance.properties.find(name);
    const bool usable = property != nullptr && !property->is_null();
    return usable ? property : instance.path.keys.find(name);
}

}  // namespace

const cim::PropertyDecl *MergedClass::find_property(std::string_view name) const {
    return find_member(declaration.properties, name);
}

const cim::MethodDecl *MergedClass::find_method(std::string_view name) const {
    return find_member(declaration.methods, name);
}

std::vector<std::string> MergedClass::key_names() const {
    std::vector<std::string> names;
    for (const cim::PropertyDecl &property : declaration.properties) {
        if (property.is_key()) {
            names.push_back(property.name);
        }
    }
    return names;
}

bool MergedClass::is_a(std::string_view name) const {
    const auto matches = [name](const std::string &other) { return cim::same_name(name, other); };
    return matches(declaration.name) || std::any_of(ancestors.begin(), ancestors.end(), matches);
}

std::string Repository::add_class(const std::string &name_space,
                                  const cim::ClassDecl &declaration) {
    const std::unique_lock lock(lock_);
    Classes &classes = namespaces_[name_space];
    const MergedClass *superclass = nullptr;
    if (!declaration.superclass.empty()) {
        const auto place = classes.find(declaration.superclass);
        if (place == classes.end()) {
            return "class " + declaration.name + ": its superclass " + declaration.superclass +
                   " is not in " + name_space;
        }
        superclass = place->second.get();
    }
    const bool added =
        classes
            .try_emplace(declaration.name,
                         std::make_shared<const MergedClass>(merged_class(declaration, superclass)))
            .second;
    return added ? "" : "class " + declaration.name + " is already in " + name_space;
}

void Repository::add_namespace(const std::string &name_space) {
    const std::unique_lock lock(lock_);
    namespaces_.try_emplace(name_space);
}

bool Repository::has_namespace(std::string_view name_space) const {
    const std::shared_lock lock(lock_);
    return namespaces_.contains(name_space);
}

std::vector<std::string> Repository::namespaces() const {
    const std::shared_lock lock(lock_);
    std::vector<std::string> names;
    for (const auto &[name, classes] : namespaces_) {
        names.push_back(name);
    }
    return names;
}

ClassPointer Repository::find_class(std::string_view name_space,
                                    std::string_view class_name) const {
    const std::shared_lock lock(lock_);
    const auto home = namespaces_.find(name_space);
    if (home == namespaces_.end()) {
        return nullptr;
    }
    const auto place = home->second.find(class_name);
    return place == home->second.end() ? nullptr : place->second;
}

std::vector<ClassPointer> Repository::classes(std::string_view name_space,
                                              std::string_view ancestor) const {
    const std::shared_lock lock(lock_);
    std::vector<ClassPointer> found;
    const auto home = namespaces_.find(name_space);
    if (home == namespaces_.end()) {
        return found;
    }
    for (const auto &[name, declared] : home->second) {
        if (ancestor.empty() || declared->is_a(ancestor)) {
            found.push_back(declared);
        }
    }
    return found;
}

bool Repository::is_a(std::string_view name_space, std::string_view class_name,
                      std::string_view ancestor) const {
    const ClassPointer declared = find_class(name_space, class_name);
    return declared != nullptr ? declared->is_a(ancestor) : cim::same_name(class_name, ancestor);
}

cim::Instance Repository::new_instance(const cim::ObjectPath &path) const {
    cim::Instance instance{path, {}};
    if (const ClassPointer declared = find_class(path)) {
        for (const cim::PropertyDecl &property : declared->declaration.properties) {
            instance.properties.set(property.name, initial_value(property));
        }
    }
    for (const cim::NamedValue &key : path.keys) {
        instance.properties.set(key.name, key.value);
    }
    return instance;
}

std::optional<cim::ObjectPath> Repository::path_of(const cim::Instance &instance) const {
    const ClassPointer declared = find_class(instance.path);
    if (declared == nullptr && instance.path.keys.empty()) {
        return std::nullopt;
    }
    auto names = declared != nullptr ? declared->key_names() : std::vector<std::string>();
    for (const cim::NamedValue &key : instance.path.keys) {
        names.push_back(key.name);
    }
    cim::ObjectPath path{
        instance.path.host, instance.path.name_space, instance.path.class_name, {}};
    for (const std::string &name : names) {
        if (const cim::Value *value = key_value(instance, name)) {
            path.keys.set(name, *value);
        }
    }
    return path;
}

std::optional<cim::Value> Repository::property_qualifier(const cim::ObjectPath &path,
                                                         std::string_view property,
                                                         std::string_view qualifier) const {
    const ClassPointer declared = find_class(path);
    const auto *member = declared != nullptr ? declared->find_property(property) : nullptr;
    const auto *found = member != nullptr
                            ? cim::find_qualifier(member->qualifiers, std::string(qualifier))
                            : nullptr;
    if (found == nullptr) {
        return std::nullopt;
    }
    if (found->values.size() == 1) {
        const auto as_boolean = cim::value_from_text(CMPI_boolean, found->values.front());
        return as_boolean ? *as_boolean : cim::Value::string(found->values.front());
    }
    cim::Value::Array elements;
    for (const std::string &value : found->values) {
        elements.push_back(cim::Value::string(value));
    }
    return cim::Value::array(CMPI_string, std::move(elements));
}

}  // namespace velkhost::broker
