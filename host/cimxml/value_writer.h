// From values, paths and instances to elements of CIM-XML (DSP0201).
#pragma once

#include "host/broker/repository.h"
#include "host/cim/instance.h"
#include "host/cimxml/xml_writer.h"

#include <functional>
#include <string>
#include <string_view>

namespace velkhost::cimxml {

// As TYPE and PARAMTYPE have it, for arrays the type of an element. What has no type of its own
// there, an embedded instance among them, is a string.
std::string type_attribute_of(CMPIType type);

// NAMESPACE elements in a LOCALNAMESPACEPATH.
void write_namespace(XmlWriter &out, std::string_view name_space);

// INSTANCENAME.
void write_instance_name(XmlWriter &out, const cim::ObjectPath &path);

// INSTANCEPATH; `host` is that of paths without one.
void write_instance_path(XmlWriter &out, const cim::ObjectPath &path, std::string_view host);

// VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY; nothing for null.
void write_value(XmlWriter &out, const cim::Value &value);

// How an instance is to be shown.
struct InstanceForm {
    std::function<bool(std::string_view)> wanted;         // empty: every property
    std::function<std::string(std::string_view)> origin;  // empty: no class origins
};

// INSTANCE.
void write_instance(XmlWriter &out, const cim::Instance &instance, const InstanceForm &form = {});

}  // namespace velkhost::cimxml
