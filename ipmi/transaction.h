// The controller's flash transaction, one function per operation, in the order of their codes.
//
// They return 0 or -2. A completion code other than 0 counts as done: 0 is returned and nothing is
// taken from the response. A handle of -1 stands for no transaction; operations on one return -2 at
// once.
#pragma once

#include "velk/api.h"

VELK_API int create_ipmi_transaction(int *handle);   // *handle must be -1; takes the new handle
VELK_API int destroy_ipmi_transaction(int *handle);  // sets *handle back to -1
VELK_API int open_ipmi_transaction(int handle, const char *name, int flag);
VELK_API int close_ipmi_transaction(int handle);
VELK_API int begin_opt_update(int handle);
VELK_API int cancel_ipmi_transaction(int handle);

// *secure becomes 1 when the controller's flash subsystem is in secure mode, else 0.
VELK_API int get_secure_mode(int *secure);

// *type becomes 1 for a first-generation controller, 2 for a second-generation one, 0 for one that
// knows no sessions. Returns 0, or -1 when the query failed or was not completed.
VELK_API int get_bmc_type(int *type);

namespace velk {

inline constexpr int kNoTransaction = -1;

enum ControllerType : int { kUnsupported = 0, kFirstGeneration = 1, kSecondGeneration = 2 };

}  // namespace velk
