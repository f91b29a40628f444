// Asking the host to re-configure the in-band network.
#pragma once

#include "velk/api.h"

// Unless the mapping's stamp is less than 15 minutes old, or always when `force` is 1, puts up a
// flag file and waits up to 130 seconds for the host's own component to take it away. Returns 0, or
// -1 when the flag could not be put up or was not taken; it is then deleted.
VELK_API int cfgnetwork(int force);
