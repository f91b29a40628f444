// Function tables that all objects of a kind share, and those of the broker itself. They end where
// version 2.0 ends.
#pragma once

#include <cmpi/cmpift.h>

namespace velkhost::broker {

extern const CMPIContextFT kContextTable;
extern const CMPIResultFT kResultTable;
extern const CMPIStringFT kStringTable;
extern const CMPIArrayFT kArrayTable;
extern const CMPIEnumerationFT kEnumerationTable;
extern const CMPIInstanceFT kInstanceTable;
extern const CMPIObjectPathFT kObjectPathTable;
extern const CMPIArgsFT kArgsTable;
extern const CMPIDateTimeFT kDateTimeTable;
extern const CMPISelectExpFT kSelectExpTable;
extern const CMPISelectCondFT kSelectCondTable;
extern const CMPISubCondFT kSubCondTable;
extern const CMPIPredicateFT kPredicateTable;

extern const CMPIBrokerFT kBrokerTable;         // up-calls
extern const CMPIBrokerEncFT kFactoryTable;     // factories and services
extern const CMPIBrokerExtFT kOsServicesTable;  // threads, mutexes, conditions

}  // namespace velkhost::broker
