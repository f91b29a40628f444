// From class declarations to CLASS elements (DSP0201, 5.2.4).
#pragma once

#include "host/broker/repository.h"
#include "host/cimxml/xml_writer.h"

#include <functional>
#include <string>
#include <string_view>

namespace velkhost::cimxml {

// How a class is to be shown.
struct ClassForm {
    bool local_only = true;  // without what it inherits unchanged
    bool qualifiers = true;
    bool class_origin = false;
    std::function<bool(std::string_view)> wanted;  // properties; empty: all
};

// The class that a member of that name was first declared in.
std::string class_origin(const broker::Repository &repository, std::string_view name_space,
                         const broker::MergedClass &declared, std::string_view member);

// CLASS.
void write_class(XmlWriter &out, const broker::Repository &repository, std::string_view name_space,
                 const broker::MergedClass &declared, const ClassForm &form);

}  // namespace velkhost::cimxml
