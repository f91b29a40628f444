#pragma once

// Texts and bit masks that requests and brokers use.

#include "cmpi/detail/scalars.h"

// Names of the context entries that the standard gives a meaning; each text is its symbol.
inline constexpr char CMPIInitNameSpace[] = "CMPIInitNameSpace";      // CMPI_string
inline constexpr char CMPIInvocationFlags[] = "CMPIInvocationFlags";  // CMPI_uint32
inline constexpr char CMPIPrincipal[] = "CMPIPrincipal";              // CMPI_string
inline constexpr char CMPIRole[] = "CMPIRole";                        // CMPI_string
inline constexpr char CMPIAcceptLanguage[] = "CMPIAcceptLanguage";    // CMPI_string
inline constexpr char CMPIContentLanguage[] = "CMPIContentLanguage";  // CMPI_string

// Bits of the entry CMPIInvocationFlags.
inline constexpr CMPIFlags CMPI_FLAG_LocalOnly = 1;
inline constexpr CMPIFlags CMPI_FLAG_DeepInheritance = 2;
inline constexpr CMPIFlags CMPI_FLAG_IncludeQualifiers = 4;
inline constexpr CMPIFlags CMPI_FLAG_IncludeClassOrigin = 8;

// CMPIBrokerFT::brokerCapabilities. A mask includes the bits of what it builds on, so test with
// (capabilities & mask) == mask.
inline constexpr unsigned int CMPI_MB_BasicRead = 0x0001;
inline constexpr unsigned int CMPI_MB_BasicWrite = 0x0003;
inline constexpr unsigned int CMPI_MB_InstanceManipulation = 0x0007;
inline constexpr unsigned int CMPI_MB_AssociationTraversal = 0x0009;
inline constexpr unsigned int CMPI_MB_QueryExecution = 0x0011;
inline constexpr unsigned int CMPI_MB_QueryNormalization = 0x0031;
inline constexpr unsigned int CMPI_MB_BasicQualifierSupport = 0x0047;
inline constexpr unsigned int CMPI_MB_Indications = 0x0081;
inline constexpr unsigned int CMPI_MB_OSEncapsulationSupport = 0x0100;
inline constexpr unsigned int CMPI_MB_Supports_MemEnhancements = 0x4000;
inline constexpr unsigned int CMPI_MB_Supports_Extended_Error = 0x8000;

// Older names of the first three.
inline constexpr unsigned int CMPI_MB_Class_0 = CMPI_MB_BasicRead;
inline constexpr unsigned int CMPI_MB_Class_1 = CMPI_MB_BasicWrite;
inline constexpr unsigned int CMPI_MB_Class_2 = CMPI_MB_InstanceManipulation;

// From before the standard; their values collide with the ones above.
inline constexpr unsigned int CMPI_MB_Supports_PropertyMI = 0x0100;
inline constexpr unsigned int CMPI_MB_Supports_IndicationMI = 0x0200;
inline constexpr unsigned int CMPI_MB_Supports_IndicationPolling = 0x0400;
inline constexpr unsigned int CMPI_MB_Supports_QueryNormalization = 0x0800;
inline constexpr unsigned int CMPI_MB_Supports_Qualifier = 0x1000;
inline constexpr unsigned int CMPI_MB_Supports_Schema = 0x3000;
