// How the library marks the names of its C interface.
#pragma once

// On the declaration of every exported function and session global: C linkage, default visibility.
// Everything else is hidden by the compiler's default.
#define VELK_API extern "C" __attribute__((visibility("default")))
