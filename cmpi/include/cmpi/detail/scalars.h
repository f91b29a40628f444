#pragma once

// Scalars of the interface. Their sizes are those of CIM (DSP0004, 5.2) on every Linux ABI; only
// the alignment of the 64-bit ones follows the ABI.

using CMPIBoolean = unsigned char;
using CMPIChar16 = unsigned short;

using CMPIUint8 = unsigned char;
using CMPIUint16 = unsigned short;
using CMPIUint32 = unsigned int;
using CMPIUint64 = unsigned long long;

using CMPISint8 = signed char;
using CMPISint16 = short;
using CMPISint32 = int;
using CMPISint64 = long long;

using CMPIReal32 = float;
using CMPIReal64 = double;

using CMPICount = unsigned int;
using CMPIFlags = unsigned int;
using CMPIType = unsigned short;
using CMPIValueState = unsigned short;

using CMPIMsgFileHandle = void *;  // an open message catalogue
using CMPIGcStat = void;           // a mark of CMPIBrokerMemFT, only ever behind a pointer
