#pragma once

// Operating-system types of CMPIBrokerExtFT. All but the key are opaque; macros, because other
// header sets have them as macros and users may test for them.

#include <ctime>

#include "cmpi/cmpipl.h"

#define CMPI_THREAD_TYPE void *
#define CMPI_THREAD_RETURN void *
#define CMPI_THREAD_CDECL
#define CMPI_THREAD_KEY_TYPE unsigned int
#define CMPI_MUTEX_TYPE void *
#define CMPI_COND_TYPE void *
