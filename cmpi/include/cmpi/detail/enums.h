#pragma once

// Small enumerations of queries, log and trace. All are unsigned and four bytes wide.

// Operator of a comparison.
using CMPIPredOp = enum _CMPIPredOp : unsigned int {
    CMPI_PredOp_Equals = 1,
    CMPI_PredOp_NotEquals = 2,
    CMPI_PredOp_LessThan = 3,
    CMPI_PredOp_GreaterThanOrEquals = 4,
    CMPI_PredOp_GreaterThan = 5,
    CMPI_PredOp_LessThanOrEquals = 6,
    CMPI_PredOp_Isa = 7,
    CMPI_PredOp_NotIsa = 8,
    CMPI_PredOp_Like = 9,
    CMPI_PredOp_NotLike = 10,
    CMPI_PredOp_Not_Null = 11,
    CMPI_PredOp_Null = 12,
    CMPI_PredOp_And = 13,
    CMPI_PredOp_Or = 14
};

// Normal form of a condition: disjunction of conjunctions, or conjunction of disjunctions.
using CMPISelectCondType = enum _CMPISelectCondType : unsigned int {
    CMPI_COND_DOC = 0,
    CMPI_COND_COD = 1
};

// Severity of a log entry. The odd name of the last one is the standard's.
using CMPISeverity = enum _CMPISeverity : unsigned int {
    CMPI_SEV_ERROR = 1,
    CMPI_SEV_INFO = 2,
    CMPI_SEV_WARNING = 3,
    CMPI_DEV_DEBUG = 4
};

// Verbosity of a trace entry.
using CMPILevel = enum _CMPILevel : unsigned int {
    CMPI_LEV_INFO = 1,
    CMPI_LEV_WARNING = 2,
    CMPI_LEV_VERBOSE = 3
};
