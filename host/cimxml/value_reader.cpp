#include "host/cimxml/value_reader.h"

#include "host/cim/names.h"
#include "host/cimxml/errors.h"

#include <optional>
#include <utility>

namespace velkhost::cimxml {
namespace {

constexpr CMPIType without_array(CMPIType type) {
    return static_cast<CMPIType>(type & ~CMPI_ARRAY);
}

// The type that an attribute names; no value where there is no such attribute.
std::optional<CMPIType> type_attribute(const XmlElement &element, std::string_view name) {
    const std::string *const text = element.attribute(name);
    if (text == nullptr) {
        return std::nullopt;
    }
    const CMPIType type = cim::type_from_name(*text);
    if (type == CMPI_null || type == CMPI_instance || type == CMPI_ptr) {
        fail_not_valid("\"" + *text + "\" is no type");
    }
    return type;
}

// What a key without any declaration is.
CMPIType type_of_key(const XmlElement &element) {
    if (const auto type = type_attribute(element, "TYPE")) {
        return *type;
    }
    const std::string *const kind = element.attribute("VALUETYPE");
    if (kind != nullptr && *kind == "boolean") {
        return CMPI_boolean;
    }
    if (kind != nullptr && *kind == "numeric") {
        return element.text.find('-') == std::string::npos ? CMPI_uint64 : CMPI_sint64;
    }
    return CMPI_string;
}

bool is_embedded(const XmlElement &element) {
    return element.attribute("EmbeddedObject") != nullptr ||
           element.attribute("EMBEDDEDOBJECT") != nullptr;
}

CMPIType element_type(const XmlElement &parameter, CMPIType declared) {
    if (const auto named = type_attribute(parameter, "PARAMTYPE")) {
        return *named;
    }
    if (const auto named = type_attribute(parameter, "TYPE")) {
        return *named;
    }
    return declared != CMPI_null ? without_array(declared) : CMPI_string;
}

}  // namespace

// -- Paths --

cim::ObjectPath ValueReader::class_name(const XmlElement &element) const {
    if (element.name != "CLASSNAME") {
        fail_not_valid("a CLASSNAME was expected, not " + element.name);
    }
    return {{}, name_space_, required_attribute(element, "NAME"), {}};
}

cim::ObjectPath ValueReader::instance_name(const XmlElement &element) const {
    if (element.name != "INSTANCENAME") {
        fail_not_valid("an INSTANCENAME was expected, not " + element.name);
    }
    cim::ObjectPath path{{}, name_space_, required_attribute(element, "CLASSNAME"), {}};
    const broker::ClassPointer declared = repository_.find_class(path);
    path.keys = keys(element, declared.get());
    return path;
}

cim::NamedValues ValueReader::keys(const XmlElement &element,
                                   const broker::MergedClass *declared) const {
    cim::NamedValues result;
    for (const XmlElement &child : element.children) {
        if (child.name == "KEYBINDING") {
            const std::string &name = required_attribute(child, "NAME");
            const auto *const property =
                declared != nullptr ? declared->find_property(name) : nullptr;
            const CMPIType type = property != nullptr ? property->type.type : CMPI_null;
            result.set(name, key_value(only_child(child), type, name));
            continue;
        }
        // A class with a single key may leave its name out.
        const auto names = declared != nullptr ? declared->key_names() : std::vector<std::string>();
        if (element.children.size() != 1 || names.size() != 1) {
            fail_not_valid("a key without a name in " + element.name);
        }
        const CMPIType type = declared->find_property(names.front())->type.type;
        result.set(names.front(), key_value(child, type, names.front()));
    }
    return result;
}

cim::Value ValueReader::key_value(const XmlElement &element, CMPIType declared,
                                  std::string_view name) const {
    if (element.name == "VALUE.REFERENCE") {
        return cim::Value::reference(path(only_child(element)));
    }
    if (element.name != "KEYVALUE") {
        fail_not_valid("key " + std::string(name) + " has a " + element.name);
    }
    const bool scalar = declared != CMPI_null && declared != CMPI_ref;
    return read_scalar(scalar ? declared : type_of_key(element), element.text, name);
}

cim::ObjectPath ValueReader::path(const XmlElement &element) const {
    if (element.name == "INSTANCENAME") {
        return instance_name(element);
    }
    if (element.name == "CLASSNAME") {
        return class_name(element);
    }
    if (element.children.size() != 2) {
        fail_not_valid(element.name + " is no path");
    }
    const XmlElement &place = element.children.front();
    std::string host;
    const XmlElement *name_space = &place;
    if (place.name == "NAMESPACEPATH") {
        if (place.children.size() != 2 || place.children.front().name != "HOST") {
            fail_not_valid("NAMESPACEPATH has no host and namespace");
        }
        host = place.children.front().text;
        name_space = &place.children.back();
    }
    const ValueReader inner(repository_, read_namespace(*name_space));
    const XmlElement &object = element.children.back();
    cim::ObjectPath result =
        object.name == "CLASSNAME" ? inner.class_name(object) : inner.instance_name(object);
    result.host = host;
    return result;
}

// -- Values --

cim::Value ValueReader::parameter(const XmlElement &element, CMPIType declared) const {
    const std::string &name = required_attribute(element, "NAME");
    if (element.children.empty()) {
        return cim::Value::null(declared != CMPI_null ? declared : element_type(element, declared));
    }
    const XmlElement &given = only_child(element);
    return is_embedded(element) ? embedded(given, name)
                                : value(given, element_type(element, declared), name);
}

cim::Value ValueReader::value(const XmlElement &element, CMPIType type,
                              std::string_view what) const {
    if (element.name == "VALUE.REFERENCE") {
        return cim::Value::reference(path(only_child(element)));
    }
    if (element.name == "VALUE.ARRAY" || element.name == "VALUE.REFARRAY") {
        return array(element, type, what);
    }
    if (element.name != "VALUE" || !element.children.empty()) {
        fail_not_valid(element.name + " is no value of " + std::string(what));
    }
    return read_scalar(type, element.text, what);
}

cim::Value ValueReader::array(const XmlElement &element, CMPIType type,
                              std::string_view what) const {
    const bool references = element.name == "VALUE.REFARRAY";
    const CMPIType inner = references ? CMPI_ref : type;
    cim::Value::Array elements;
    for (const XmlElement &child : element.children) {
        if (child.name == "VALUE.NULL") {
            elements.push_back(cim::Value::null(inner));
        } else if (child.name == (references ? "VALUE.REFERENCE" : "VALUE")) {
            elements.push_back(value(child, inner, what));
        } else {
            fail_not_valid(child.name + " stands in " + element.name);
        }
    }
    return cim::Value::array(inner, std::move(elements));
}

// The text of a VALUE is a document of its own (DSP0201, 5.2.3.1).
cim::Value ValueReader::embedded(const XmlElement &element, std::string_view what) const {
    if (element.name == "VALUE.ARRAY") {
        cim::Value::Array elements;
        for (const XmlElement &child : element.children) {
            elements.push_back(embedded(child, what));
        }
        return cim::Value::array(CMPI_instance, std::move(elements));
    }
    try {
        const XmlElement document = read_xml(element.text);
        if (element.name == "VALUE" && document.name == "INSTANCE") {
            return cim::Value::instance(instance(document));
        }
    } catch (const XmlError &error) {
        throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, std::string(what) + ": " + error.what());
    }
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER,
                   std::string(what) + ": an embedded object that is no instance");
}

cim::Instance ValueReader::instance(const XmlElement &element) const {
    cim::Instance result{{{}, name_space_, required_attribute(element, "CLASSNAME"), {}}, {}};
    for (const XmlElement &child : element.children) {
        if (!child.name.starts_with("PROPERTY")) {
            continue;  // qualifiers say nothing new
        }
        const bool array = child.name == "PROPERTY.ARRAY";
        const bool reference = child.name == "PROPERTY.REFERENCE";
        const CMPIType type =
            reference ? CMPI_ref : type_attribute(child, "TYPE").value_or(CMPI_string);
        result.properties.set(
            required_attribute(child, "NAME"),
            parameter(child, array ? static_cast<CMPIType>(type | CMPI_ARRAY) : type));
    }
    return result;
}

}  // namespace velkhost::cimxml
