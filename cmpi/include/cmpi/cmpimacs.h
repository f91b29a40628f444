#pragma once

// Conveniences over the function tables: short forms for the slots, status helpers, tests.

// IWYU pragma: begin_exports
#include "cmpi/cmpidt.h"
#include "cmpi/cmpift.h"
#include "cmpi/detail/broker_calls.h"
#include "cmpi/detail/error_calls.h"
#include "cmpi/detail/factory_calls.h"
#include "cmpi/detail/instance_calls.h"
#include "cmpi/detail/lifetime_calls.h"
#include "cmpi/detail/object_calls.h"
#include "cmpi/detail/query_calls.h"
#include "cmpi/detail/status_helpers.h"
#include "cmpi/detail/value_tests.h"
// IWYU pragma: end_exports
