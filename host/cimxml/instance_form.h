// What operations that return instances have in common.
#pragma once

#include "host/cimxml/operations.h"
#include "host/cimxml/value_writer.h"

namespace velkhost::cimxml {

// As IncludeClassOrigin and PropertyList ask for it.
InstanceForm instance_form(const Call &call, const Parameters &in, const cim::Instance &instance);

// The instance's name: the path that its provider made it with, and its key properties.
cim::ObjectPath path_of(const Call &call, const cim::Instance &instance);

}  // namespace velkhost::cimxml
