#pragma once

// Platform. Other header sets insist on one symbol that names it; here there is only Linux with a
// GNU-compatible compiler, so the symbol is supplied rather than demanded.

#if !defined(__linux__) || !defined(__GNUC__)
#error "These CMPI declarations are for Linux and a GNU-compatible compiler"
#endif

#ifndef CMPI_PLATFORM_LINUX_GENERIC_GNU
#define CMPI_PLATFORM_LINUX_GENERIC_GNU
#endif

// Symbols that a broker looks up in a provider's library: visible, and with C linkage.
#define CMPI_EXPORT __attribute__((visibility("default")))
#define CMPI_EXTERN_C extern "C" CMPI_EXPORT
