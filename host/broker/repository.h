// The classes that the broker knows, per namespace, with what they inherit.
#pragma once

#include "host/broker/api.h"
#include "host/cim/class_decl.h"
#include "host/cim/instance.h"
#include "host/cim/names.h"

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::broker {

// A class with the members of its ancestors: theirs first, root class first; a member declared
// again takes the place of the inherited one.
struct VELKBROKER_API MergedClass {
    cim::ClassDecl declaration;
    std::vector<std::string> ancestors;  // nearest first
    cim::ClassDecl own;                  // without what it inherits

    [[nodiscard]] const cim::PropertyDecl *find_property(std::string_view name) const;
    [[nodiscard]] const cim::MethodDecl *find_method(std::string_view name) const;
    [[nodiscard]] std::vector<std::string> key_names() const;
    // Whether it is, or derives from, the class of that name.
    [[nodiscard]] bool is_a(std::string_view name) const;
};
using ClassPointer = std::shared_ptr<const MergedClass>;

class VELKBROKER_API Repository {
  public:
    // Adds a class; its namespace comes to be with it. Returns why not, or an empty text: the
    // superclass must be there, the class must not.
    std::string add_class(const std::string &name_space, const cim::ClassDecl &declaration);

    void add_namespace(const std::string &name_space);

    [[nodiscard]] bool has_namespace(std::string_view name_space) const;
    [[nodiscard]] std::vector<std::string> namespaces() const;

    // Null for an unknown class or namespace.
    [[nodiscard]] ClassPointer find_class(std::string_view name_space,
                                          std::string_view class_name) const;
    [[nodiscard]] ClassPointer find_class(const cim::ObjectPath &path) const {
        return find_class(path.name_space, path.class_name);
    }

    // All classes of a namespace, or those that are, or derive from, `ancestor`; by name.
    [[nodiscard]] std::vector<ClassPointer> classes(std::string_view name_space,
                                                    std::string_view ancestor = {}) const;

    // Whether `class_name` is, or derives from, `ancestor`; also for unknown classes of one name.
    [[nodiscard]] bool is_a(std::string_view name_space, std::string_view class_name,
                            std::string_view ancestor) const;

    // An instance of the class in the path: its properties null or as the class initialises them,
    // the path's keys as properties. An unknown class gives the keys alone.
    [[nodiscard]] cim::Instance new_instance(const cim::ObjectPath &path) const;

    // The path that names the instance: that of its making, with its key properties as keys. No
    // value when nothing is known as a key.
    [[nodiscard]] std::optional<cim::ObjectPath> path_of(const cim::Instance &instance) const;

    // The qualifier's value, a string or an array of strings, or true for a bare one.
    [[nodiscard]] std::optional<cim::Value> property_qualifier(const cim::ObjectPath &path,
                                                               std::string_view property,
                                                               std::string_view qualifier) const;

  private:
    using Classes = std::map<std::string, ClassPointer, cim::NameLess>;

    mutable std::shared_mutex lock_;
    std::map<std::string, Classes, cim::NameLess> namespaces_;
};

}  // namespace velkhost::broker
