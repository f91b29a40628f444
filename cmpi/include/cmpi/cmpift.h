#pragma once

// Objects and function tables of the Common Manageability Programming Interface, version 2.0.
// What the 2.1 edition appended is absent: it lies past the end of a 2.0 broker's tables.

// IWYU pragma: begin_exports
#include "cmpi/cmpidt.h"
#include "cmpi/cmpios.h"
#include "cmpi/detail/broker_tables.h"
#include "cmpi/detail/error_table.h"
#include "cmpi/detail/object_tables.h"
#include "cmpi/detail/objects.h"
#include "cmpi/detail/provider_tables.h"
#include "cmpi/detail/query_tables.h"
// IWYU pragma: end_exports
