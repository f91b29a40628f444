// The parameters of an intrinsic method (DSP0200, 5.3), by name.
#pragma once

#include "host/broker/broker.h"
#include "host/cimxml/xml.h"

#include <functional>
#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::cimxml {

class Parameters {
  public:
    // Throws CimError (CIM_ERR_INVALID_PARAMETER) when the call has others than these or one twice.
    // Keeps pointers into `call`.
    Parameters(const XmlElement &call, std::initializer_list<std::string_view> known);

    // The element that holds the value; nullptr where the parameter is missing or null.
    [[nodiscard]] const XmlElement *find(std::string_view name) const;
    // Throws CimError in its place.
    [[nodiscard]] const XmlElement &require(std::string_view name) const;

    [[nodiscard]] bool flag(std::string_view name, bool otherwise) const;
    // The class that it names; empty where it is missing.
    [[nodiscard]] std::string class_name(std::string_view name) const;
    [[nodiscard]] std::string text(std::string_view name) const;
    [[nodiscard]] broker::PropertyList property_list() const;

  private:
    struct Parameter {
        std::string name;
        const XmlElement *value = nullptr;
    };
    std::vector<Parameter> parameters_;
};

// Whether a property is in the list; an empty function where there is no list.
std::function<bool(std::string_view)> membership(const broker::PropertyList &list);

}  // namespace velkhost::cimxml
