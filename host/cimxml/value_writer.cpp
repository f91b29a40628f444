#include "host/cimxml/value_writer.h"

#include "host/mof/utf8.h"

#include <array>
#include <cmath>
#include <cstdio>

namespace velkhost::cimxml {
namespace {

constexpr CMPIType without_array(CMPIType type) {
    return static_cast<CMPIType>(type & ~CMPI_ARRAY);
}

std::string real_text(double number, CMPIType type) {
    if (std::isnan(number)) {
        return "NaN";
    }
    if (std::isinf(number)) {
        return number < 0 ? "-INF" : "INF";
    }
    std::array<char, 40> text{};
    std::snprintf(text.data(), text.size(), type == CMPI_real32 ? "%.9g" : "%.17g", number);
    return text.data();
}

std::string char16_text(std::uint64_t unit) {
    std::string text;
    mof::append_utf8(text, static_cast<std::uint32_t>(unit));
    return text;
}

// An instance as the text of a value.
std::string embedded_text(const cim::Instance &instance) {
    XmlWriter inner;
    write_instance(inner, instance);
    return inner.take();
}

// What stands between <VALUE> and </VALUE>.
std::string scalar_text(const cim::Value &value) {
    if (const auto yes = value.as_bool()) {
        return *yes ? "TRUE" : "FALSE";
    }
    if (const auto text = value.as_text()) {
        return std::string(*text);
    }
    if (const auto *instance = value.as_instance()) {
        return embedded_text(*instance);
    }
    if (const auto *number = std::get_if<double>(&value.content())) {
        return real_text(*number, value.type());
    }
    const auto number = value.as_unsigned();
    if (number && value.type() == CMPI_char16) {
        return char16_text(*number);
    }
    return cim::to_text(value);
}

const char *kind_of_key(const cim::Value &value) {
    if (value.as_bool()) {
        return "boolean";
    }
    const CMPIType type = value.type();
    const bool numeric = type != CMPI_char16 && (value.as_signed() || value.as_unsigned());
    return numeric || std::holds_alternative<double>(value.content()) ? "numeric" : "string";
}

void write_reference(XmlWriter &out, const cim::ObjectPath &path) {
    const XmlWriter::Scope reference(out, "VALUE.REFERENCE");
    if (!path.host.empty()) {
        write_instance_path(out, path, path.host);
    } else if (path.name_space.empty()) {
        write_instance_name(out, path);
    } else {
        const XmlWriter::Scope local(out, "LOCALINSTANCEPATH");
        write_namespace(out, path.name_space);
        write_instance_name(out, path);
    }
}

void write_array(XmlWriter &out, const cim::Value &value) {
    const bool references = without_array(value.type()) == CMPI_ref;
    const XmlWriter::Scope array(out, references ? "VALUE.REFARRAY" : "VALUE.ARRAY");
    for (const cim::Value &element : *value.as_array()) {
        if (element.is_null()) {
            out.empty("VALUE.NULL");
        } else {
            write_value(out, element);
        }
    }
}

void write_property(XmlWriter &out, const cim::NamedValue &property, const InstanceForm &form) {
    const CMPIType type = property.value.type();
    const bool reference = type == CMPI_ref;
    const std::string type_text = type_attribute_of(type);
    const std::string origin = form.origin ? form.origin(property.name) : std::string();
    const auto *const path = property.value.as_path();
    const bool embedded = without_array(type) == CMPI_instance;
    const XmlWriter::Scope scope(
        out,
        reference                   ? "PROPERTY.REFERENCE"
        : property.value.is_array() ? "PROPERTY.ARRAY"
                                    : "PROPERTY",
        {{"NAME", property.name},
         {reference ? "" : "TYPE", type_text},
         {path != nullptr ? "REFERENCECLASS" : "", path != nullptr ? path->class_name : ""},
         {embedded ? "EmbeddedObject" : "", "instance"},
         {origin.empty() ? "" : "CLASSORIGIN", origin}});
    write_value(out, property.value);
}

}  // namespace

std::string type_attribute_of(CMPIType type) {
    const CMPIType element = without_array(type);
    const bool textual = element == CMPI_null || element == CMPI_instance || element == CMPI_ptr;
    return textual ? "string" : cim::type_name(element);
}

void write_namespace(XmlWriter &out, std::string_view name_space) {
    const XmlWriter::Scope path(out, "LOCALNAMESPACEPATH");
    while (!name_space.empty()) {
        const std::size_t end = std::min(name_space.find('/'), name_space.size());
        out.empty("NAMESPACE", {{"NAME", name_space.substr(0, end)}});
        name_space.remove_prefix(std::min(end + 1, name_space.size()));
    }
}

void write_instance_name(XmlWriter &out, const cim::ObjectPath &path) {
    const XmlWriter::Scope name(out, "INSTANCENAME", {{"CLASSNAME", path.class_name}});
    for (const cim::NamedValue &key : path.keys) {
        const XmlWriter::Scope binding(out, "KEYBINDING", {{"NAME", key.name}});
        if (const auto *reference = key.value.as_path()) {
            write_reference(out, *reference);
        } else {
            const std::string text = key.value.is_null() ? "" : scalar_text(key.value);
            out.leaf("KEYVALUE", text, {{"VALUETYPE", kind_of_key(key.value)}});
        }
    }
}

void write_instance_path(XmlWriter &out, const cim::ObjectPath &path, std::string_view host) {
    const XmlWriter::Scope whole(out, "INSTANCEPATH");
    {
        const XmlWriter::Scope place(out, "NAMESPACEPATH");
        out.leaf("HOST", path.host.empty() ? host : path.host);
        write_namespace(out, path.name_space);
    }
    write_instance_name(out, path);
}

void write_value(XmlWriter &out, const cim::Value &value) {
    if (value.is_null()) {
        return;
    }
    if (value.as_array() != nullptr) {
        write_array(out, value);
    } else if (const auto *path = value.as_path()) {
        write_reference(out, *path);
    } else {
        out.leaf("VALUE", scalar_text(value));
    }
}

void write_instance(XmlWriter &out, const cim::Instance &instance, const InstanceForm &form) {
    const XmlWriter::Scope whole(out, "INSTANCE", {{"CLASSNAME", instance.path.class_name}});
    for (const cim::NamedValue &property : instance.properties) {
        if (!form.wanted || form.wanted(property.name)) {
            write_property(out, property, form);
        }
    }
}

}  // namespace velkhost::cimxml
