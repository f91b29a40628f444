#include "host/cimxml/parameters.h"

#include "host/cim/names.h"
#include "host/cimxml/errors.h"
#include "host/cimxml/value_reader.h"

#include <algorithm>

namespace velkhost::cimxml {
namespace {

[[noreturn]] void refuse(const std::string &what) {
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, what);
}

bool contains(std::initializer_list<std::string_view> names, std::string_view name) {
    return std::any_of(names.begin(), names.end(),
                       [name](std::string_view each) { return cim::same_name(each, name); });
}

// Of a VALUE.
const std::string &text_in(const XmlElement &element, std::string_view name) {
    if (element.name != "VALUE") {
        refuse("parameter " + std::string(name) + " has a " + element.name + " for a value");
    }
    return element.text;
}

}  // namespace

Parameters::Parameters(const XmlElement &call, std::initializer_list<std::string_view> known) {
    for (std::size_t i = 1; i < call.children.size(); ++i) {
        const XmlElement &parameter = call.children[i];
        if (parameter.name != "IPARAMVALUE") {
            fail_not_valid(parameter.name + " stands among the parameters");
        }
        const std::string &name = required_attribute(parameter, "NAME");
        const bool again =
            std::any_of(parameters_.begin(), parameters_.end(),
                        [&name](const Parameter &each) { return cim::same_name(each.name, name); });
        if (again || !contains(known, name)) {
            refuse((again ? "parameter " : "unknown parameter ") + name +
                   (again ? " is given twice" : ""));
        }
        parameters_.push_back(
            {name, parameter.children.empty() ? nullptr : &only_child(parameter)});
    }
}

const XmlElement *Parameters::find(std::string_view name) const {
    const auto place =
        std::find_if(parameters_.begin(), parameters_.end(),
                     [name](const Parameter &each) { return cim::same_name(each.name, name); });
    return place == parameters_.end() ? nullptr : place->value;
}

const XmlElement &Parameters::require(std::string_view name) const {
    const XmlElement *const value = find(name);
    if (value == nullptr) {
        refuse("parameter " + std::string(name) + " is missing");
    }
    return *value;
}

bool Parameters::flag(std::string_view name, bool otherwise) const {
    const XmlElement *const value = find(name);
    if (value == nullptr) {
        return otherwise;
    }
    return *read_scalar(CMPI_boolean, text_in(*value, name), name).as_bool();
}

std::string Parameters::class_name(std::string_view name) const {
    const XmlElement *const value = find(name);
    if (value == nullptr) {
        return {};
    }
    if (value->name != "CLASSNAME") {
        refuse("parameter " + std::string(name) + " has a " + value->name + " for a class");
    }
    return required_attribute(*value, "NAME");
}

std::string Parameters::text(std::string_view name) const {
    const XmlElement *const value = find(name);
    return value == nullptr ? std::string() : text_in(*value, name);
}

broker::PropertyList Parameters::property_list() const {
    const XmlElement *const value = find("PropertyList");
    if (value == nullptr) {
        return std::nullopt;
    }
    if (value->name != "VALUE.ARRAY") {
        refuse("parameter PropertyList is no array");
    }
    std::vector<std::string> names;
    for (const XmlElement &element : value->children) {
        names.push_back(text_in(element, "PropertyList"));
    }
    return names;
}

std::function<bool(std::string_view)> membership(const broker::PropertyList &list) {
    if (!list) {
        return {};
    }
    return [list](std::string_view name) {
        return std::any_of(list->begin(), list->end(),
                           [name](const std::string &each) { return cim::same_name(each, name); });
    };
}

}  // namespace velkhost::cimxml
