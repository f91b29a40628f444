#pragma once

// Enumerations of CIM_Error's properties ErrorType, PerceivedSeverity and ErrorSourceFormat.

using CMPIErrorType = enum _CMPIErrorType : unsigned int {
    UnknownErrorType = 0,
    OtherErrorType = 1,
    CommunicationsError = 2,
    QualityOfServiceError = 3,
    SoftwareError = 4,
    HardwareError = 5,
    EnvironmentalError = 6,
    SecurityError = 7,
    Oversubscription_Error = 8,
    UnavailableResourceError = 9,
    UnsupportedOperationError = 10
};

using CMPIErrorSeverity = enum _CMPIErrorSeverity : unsigned int {
    ErrorSevUnknown = 0,
    ErrorSevLow = 2,
    ErrorSevMedium = 3,
    ErrorSevHigh = 4,
    ErrorSevFatal = 5
};

using CMPIErrorSrcFormat = enum _CMPIErrorSrcFormat : unsigned int {
    CMPIErrSrcUnknown = 0,
    CMPIErrSrcOther = 1,
    CIMObjectHandle = 2
};
