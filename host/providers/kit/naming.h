// The keys by which CIM tells instances of this host apart, in the order of the schema.
#pragma once

#include "host/providers/kit/data.h"

#include <string>
#include <vector>

namespace velkhost::providers {

// Name of the system that hosts everything here.
std::string host_name();

// Keys of a CIM_Service.
std::vector<Property> service_keys(const char *system_class, const std::string &system_name,
                                   const char *class_name, const char *name);

// Keys of a CIM_LogicalDevice of this host.
std::vector<Property> device_keys(const char *system_class, const char *class_name,
                                  const std::string &device_id);

// Keys of a CIM_PhysicalElement.
std::vector<Property> physical_keys(const char *class_name, const std::string &tag);

}  // namespace velkhost::providers
