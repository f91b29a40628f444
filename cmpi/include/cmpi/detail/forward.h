#pragma once

// Names of all structs of the interface.

// -- What a broker offers --
using CMPIBroker = struct _CMPIBroker;
using CMPIBrokerFT = struct _CMPIBrokerFT;
using CMPIBrokerEncFT = struct _CMPIBrokerEncFT;
using CMPIBrokerExtFT = struct _CMPIBrokerExtFT;
using CMPIBrokerMemFT = struct _CMPIBrokerMemFT;

// -- Encapsulated objects and their tables --
using CMPIContext = struct _CMPIContext;
using CMPIContextFT = struct _CMPIContextFT;
using CMPIResult = struct _CMPIResult;
using CMPIResultFT = struct _CMPIResultFT;
using CMPIString = struct _CMPIString;
using CMPIStringFT = struct _CMPIStringFT;
using CMPIArray = struct _CMPIArray;
using CMPIArrayFT = struct _CMPIArrayFT;
using CMPIEnumeration = struct _CMPIEnumeration;
using CMPIEnumerationFT = struct _CMPIEnumerationFT;
using CMPIInstance = struct _CMPIInstance;
using CMPIInstanceFT = struct _CMPIInstanceFT;
using CMPIObjectPath = struct _CMPIObjectPath;
using CMPIObjectPathFT = struct _CMPIObjectPathFT;
using CMPIArgs = struct _CMPIArgs;
using CMPIArgsFT = struct _CMPIArgsFT;
using CMPIDateTime = struct _CMPIDateTime;
using CMPIDateTimeFT = struct _CMPIDateTimeFT;
using CMPISelectExp = struct _CMPISelectExp;
using CMPISelectExpFT = struct _CMPISelectExpFT;
using CMPISelectCond = struct _CMPISelectCond;
using CMPISelectCondFT = struct _CMPISelectCondFT;
using CMPISubCond = struct _CMPISubCond;
using CMPISubCondFT = struct _CMPISubCondFT;
using CMPIPredicate = struct _CMPIPredicate;
using CMPIPredicateFT = struct _CMPIPredicateFT;
using CMPIError = struct _CMPIError;
using CMPIErrorFT = struct _CMPIErrorFT;

// -- What a provider offers --
using CMPIInstanceMI = struct _CMPIInstanceMI;
using CMPIInstanceMIFT = struct _CMPIInstanceMIFT;
using CMPIAssociationMI = struct _CMPIAssociationMI;
using CMPIAssociationMIFT = struct _CMPIAssociationMIFT;
using CMPIMethodMI = struct _CMPIMethodMI;
using CMPIMethodMIFT = struct _CMPIMethodMIFT;
using CMPIPropertyMI = struct _CMPIPropertyMI;
using CMPIPropertyMIFT = struct _CMPIPropertyMIFT;
using CMPIIndicationMI = struct _CMPIIndicationMI;
using CMPIIndicationMIFT = struct _CMPIIndicationMIFT;

// -- Values --
using CMPIValue = union _CMPIValue;
using CMPIData = struct _CMPIData;
