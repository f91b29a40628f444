#pragma once

// Status codes. 1 to 17 are the CIM status codes of the same names (DSP0200, 5.2.6); 50 and above
// are CMPI's own.
using CMPIrc = enum _CMPIrc : unsigned int {
    CMPI_RC_OK = 0,
    CMPI_RC_ERR_FAILED = 1,
    CMPI_RC_ERR_ACCESS_DENIED = 2,
    CMPI_RC_ERR_INVALID_NAMESPACE = 3,
    CMPI_RC_ERR_INVALID_PARAMETER = 4,
    CMPI_RC_ERR_INVALID_CLASS = 5,
    CMPI_RC_ERR_NOT_FOUND = 6,  // also what getters of sfcb-kind brokers say of absent items
    CMPI_RC_ERR_NOT_SUPPORTED = 7,
    CMPI_RC_ERR_CLASS_HAS_CHILDREN = 8,
    CMPI_RC_ERR_CLASS_HAS_INSTANCES = 9,
    CMPI_RC_ERR_INVALID_SUPERCLASS = 10,
    CMPI_RC_ERR_ALREADY_EXISTS = 11,
    CMPI_RC_ERR_NO_SUCH_PROPERTY = 12,  // what getters of other brokers say of absent items
    CMPI_RC_ERR_TYPE_MISMATCH = 13,
    CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED = 14,
    CMPI_RC_ERR_INVALID_QUERY = 15,
    CMPI_RC_ERR_METHOD_NOT_AVAILABLE = 16,  // the class has the method, the provider has not
    CMPI_RC_ERR_METHOD_NOT_FOUND = 17,      // the class has no such method

    // Answers of a cleanup to "may the library be unloaded?"
    CMPI_RC_DO_NOT_UNLOAD = 50,  // not now, ask again
    CMPI_RC_NEVER_UNLOAD = 51,   // no, and do not ask again

    CMPI_RC_ERR_INVALID_HANDLE = 60,
    CMPI_RC_ERR_INVALID_DATA_TYPE = 61,

    CMPI_RC_ERROR_SYSTEM = 100,
    CMPI_RC_ERROR = 200
};
