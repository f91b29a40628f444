#pragma once

// Versions of the interface. A user of the headers may ask for an older one with CMPI_VERSION;
// preprocessor symbols, because that choice is made before the first declaration.

#define CMPIVersion100 100
#define CMPIVersion200 200
#define CMPICurrentVersion CMPIVersion200

#ifndef CMPI_VERSION
#define CMPI_VERSION CMPICurrentVersion
#endif

#if CMPI_VERSION != CMPIVersion100 && CMPI_VERSION != CMPIVersion200
#error "CMPI_VERSION: these headers know 100 and 200"
#endif

#define CMPI_VER_100
#if CMPI_VERSION >= CMPIVersion200
#define CMPI_VER_200
#endif
