#pragma once

// Filling a status. A null status is left alone; without a broker there is no message.

#include "cmpi/detail/broker_tables.h"

inline void CMSetStatusWithString(CMPIStatus *status, CMPIrc code, CMPIString *message) {
    if (status == nullptr) {
        return;
    }
    status->rc = code;
    status->msg = message;
}

inline void CMSetStatus(CMPIStatus *status, CMPIrc code) {
    CMSetStatusWithString(status, code, nullptr);
}

inline void CMSetStatusWithChars(const CMPIBroker *broker, CMPIStatus *status, CMPIrc code,
                                 const char *message) {
    if (status == nullptr) {
        return;
    }
    CMPIString *text =
        broker == nullptr ? nullptr : broker->eft->newString(broker, message, nullptr);
    CMSetStatusWithString(status, code, text);
}

// The three below return from the enclosing function, which is why they are macros.
// NOLINTBEGIN(cppcoreguidelines-macro-usage)
#define CMReturn(code)                      \
    do {                                    \
        return CMPIStatus{(code), nullptr}; \
    } while (false)

#define CMReturnWithString(code, message)     \
    do {                                      \
        return CMPIStatus{(code), (message)}; \
    } while (false)

#define CMReturnWithChars(broker, code, message)                          \
    do {                                                                  \
        CMPIStatus cmpi_status_{};                                        \
        CMSetStatusWithChars((broker), &cmpi_status_, (code), (message)); \
        return cmpi_status_;                                              \
    } while (false)
// NOLINTEND(cppcoreguidelines-macro-usage)
