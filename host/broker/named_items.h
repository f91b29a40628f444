// Keys, arguments and properties are read and added in one way.
#pragma once

#include "host/broker/convert.h"

namespace velkhost::broker {

// The item of that name; absent: rc 6, type 0, state notFound.
CMPIData item_by_name(const Tag &owner, const cim::NamedValues &items, const char *name,
                      CMPIStatus *status);

// The item at `index`, its name through `name` unless that is null. Out of range is answered like
// an absent name; at exactly the count a real broker reads on, which is a finding.
CMPIData item_at(const Tag &owner, const cim::NamedValues &items, CMPICount index,
                 CMPIString **name, CMPIStatus *status);

// Adds or replaces. A null char pointer is stored as a string without text but of good state. rc 4
// without a name, 61 for a type code that cannot be stored.
CMPIrc add_item(cim::NamedValues &items, const char *name, const CMPIValue *value, CMPIType type);

}  // namespace velkhost::broker
