#pragma once

// Data types of the Common Manageability Programming Interface, version 2.0: scalars, type codes,
// values, status codes and the names of all structs.

// IWYU pragma: begin_exports
#include "cmpi/cmpipl.h"
#include "cmpi/detail/enums.h"
#include "cmpi/detail/error_enums.h"
#include "cmpi/detail/forward.h"
#include "cmpi/detail/names.h"
#include "cmpi/detail/probable_cause.h"
#include "cmpi/detail/scalars.h"
#include "cmpi/detail/status_codes.h"
#include "cmpi/detail/type_codes.h"
#include "cmpi/detail/values.h"
#include "cmpi/detail/versions.h"
// IWYU pragma: end_exports
