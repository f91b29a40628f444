// From elements of CIM-XML (DSP0201, 5.2.2 and 5.2.3) to values and paths.
//
// Values come as text; what types they have is known to the classes. A value that is none of its
// type is CIM_ERR_INVALID_PARAMETER, an element that must not stand where it does is a
// MessageError of status 400.
#pragma once

#include "host/broker/repository.h"
#include "host/cim/instance.h"
#include "host/cimxml/xml.h"

#include <string>
#include <string_view>

namespace velkhost::cimxml {

// Throws MessageError: the message is not as DSP0201 has it.
[[noreturn]] void fail_not_valid(const std::string &why);

// The attribute's value; throws MessageError where it is missing.
const std::string &required_attribute(const XmlElement &element, std::string_view name);

// The only child element; throws MessageError when there is another number of them.
const XmlElement &only_child(const XmlElement &element);

// "root/cimv2" of a LOCALNAMESPACEPATH.
std::string read_namespace(const XmlElement &element);

// The text as a value of a scalar type other than references. `what` names it in errors.
cim::Value read_scalar(CMPIType type, std::string_view text, std::string_view what);

class ValueReader {
  public:
    // Classes of `repository` tell the types of keys; `name_space` is that of paths without one.
    ValueReader(const broker::Repository &repository, std::string name_space)
        : repository_(repository), name_space_(std::move(name_space)) {}

    // INSTANCENAME.
    [[nodiscard]] cim::ObjectPath instance_name(const XmlElement &element) const;

    // CLASSNAME.
    [[nodiscard]] cim::ObjectPath class_name(const XmlElement &element) const;

    // LOCALINSTANCEPATH, LOCALCLASSPATH, INSTANCEPATH, CLASSPATH, INSTANCENAME or CLASSNAME.
    [[nodiscard]] cim::ObjectPath path(const XmlElement &element) const;

    // PARAMVALUE; `declared` is the type of the method's parameter, CMPI_null where there is none
    // such. The message's own PARAMTYPE comes first, and a scalar for an array stays a scalar.
    [[nodiscard]] cim::Value parameter(const XmlElement &element, CMPIType declared) const;

  private:
    [[nodiscard]] cim::NamedValues keys(const XmlElement &element,
                                        const broker::MergedClass *declared) const;
    [[nodiscard]] cim::Value key_value(const XmlElement &element, CMPIType declared,
                                       std::string_view name) const;
    [[nodiscard]] cim::Value value(const XmlElement &element, CMPIType type,
                                   std::string_view what) const;
    [[nodiscard]] cim::Value array(const XmlElement &element, CMPIType type,
                                   std::string_view what) const;
    [[nodiscard]] cim::Value embedded(const XmlElement &element, std::string_view what) const;
    [[nodiscard]] cim::Instance instance(const XmlElement &element) const;

    const broker::Repository &repository_;
    const std::string name_space_;
};

}  // namespace velkhost::cimxml
