// The CMPI side of an association's provider: function table and factories.
#pragma once

#include "host/providers/kit/association.h"
#include "host/providers/kit/export.h"

namespace velkhost::providers {

CMPIAssociationMIFT association_table(const char *name);

}  // namespace velkhost::providers

// Exports `Class` (derived from Association) as the provider `NAME`, for the association's
// instances and for traversal.
// NOLINTBEGIN(cppcoreguidelines-macro-usage,bugprone-macro-parentheses)
#define VELKHOST_EXPORT_ASSOCIATION(NAME, Class)              \
    VELKHOST_EXPORT_FACTORY(NAME, Class, Instance, instance); \
    VELKHOST_EXPORT_FACTORY(NAME, Class, Association, association)
// NOLINTEND(cppcoreguidelines-macro-usage,bugprone-macro-parentheses)
