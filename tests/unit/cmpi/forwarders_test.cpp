// Every short form calls its slot, with its arguments in their order, and hands back the result.
// The tables are fakes with one slot filled by a recorder; any other slot is null and would crash.

#include <cmpi/cmpimacs.h>
#include <gtest/gtest.h>

#include <bit>
#include <cstdint>
#include <cstring>
#include <tuple>
#include <type_traits>
#include <utility>

namespace {

// A value of any type that differs per number; pointers are made up and never followed.
template <class T>
T sample(unsigned number) {
    if constexpr (std::is_pointer_v<T>) {
        return std::bit_cast<T>(std::uintptr_t{0x1000} * number);
    } else if constexpr (std::is_same_v<T, CMPIStatus>) {
        return {static_cast<CMPIrc>(number), sample<CMPIString *>(number + 1)};
    } else if constexpr (std::is_same_v<T, CMPIData>) {
        CMPIData data{};
        data.type = sample<CMPIType>(number);
        data.state = sample<CMPIValueState>(number + 1);
        data.value.uint64 = number + 2;
        return data;
    } else {
        return static_cast<T>(number);
    }
}

template <class T>
bool same(const T &left, const T &right) {
    if constexpr (std::is_same_v<T, CMPIStatus>) {
        return left.rc == right.rc && left.msg == right.msg;
    } else if constexpr (std::is_same_v<T, CMPIData>) {
        return left.type == right.type && left.state == right.state &&
               left.value.uint64 == right.value.uint64;
    } else {
        return left == right;
    }
}

constexpr unsigned kResult = 90;

// Stands in a slot and keeps what it was called with.
template <class Function>
struct Recorder;

template <class Result, class... Args>
struct Recorder<Result (*)(Args...)> {
    static inline std::tuple<Args...> seen{};
    static inline int calls = 0;

    static Result record(Args... args) {
        seen = {args...};
        ++calls;
        return sample<Result>(kResult);
    }
};

template <class Member>
struct SlotOf;

template <class Table, class Function>
struct SlotOf<Function Table::*> {
    using TableType = Table;
    using FunctionType = Function;
};

// The object that a short form is called on, with the fake table where its kind has it.
template <class Object, class Table>
Object object_with(Table &table) {
    Object object{};
    if constexpr (std::is_same_v<Table, CMPIBrokerFT>) {
        object.bft = &table;
    } else if constexpr (std::is_same_v<Table, CMPIBrokerEncFT>) {
        object.eft = &table;
    } else {
        object.ft = &table;
    }
    return object;
}

template <auto Slot, class Result, class Object, class... Args, std::size_t... I>
void expect_call(Result (*form)(Object *, Args...), std::index_sequence<I...>) {
    using Function = typename SlotOf<decltype(Slot)>::FunctionType;
    using Fake = Recorder<Function>;
    typename SlotOf<decltype(Slot)>::TableType table{};
    table.*Slot = &Fake::record;
    auto object = object_with<std::remove_const_t<Object>>(table);
    Fake::calls = 0;

    const Result result = form(&object, sample<Args>(I + 1)...);

    EXPECT_EQ(Fake::calls, 1);
    EXPECT_TRUE(Fake::seen == std::make_tuple(&object, sample<Args>(I + 1)...));
    EXPECT_TRUE(same(result, sample<Result>(kResult)));
}

template <auto Slot, class Result, class Object, class... Args>
void expect_forwards(Result (*form)(Object *, Args...)) {
    expect_call<Slot>(form, std::index_sequence_for<Args...>{});
}

}  // namespace

TEST(CmpiForwarders, ContextFormsCallTheirSlots) {
    expect_forwards<&CMPIContextFT::getEntry>(&CMGetContextEntry);
    expect_forwards<&CMPIContextFT::getEntryAt>(&CMGetContextEntryAt);
    expect_forwards<&CMPIContextFT::getEntryCount>(&CMGetContextEntryCount);
    expect_forwards<&CMPIContextFT::addEntry>(&CMAddContextEntry);
}

TEST(CmpiForwarders, ResultFormsCallTheirSlots) {
    expect_forwards<&CMPIResultFT::returnData>(&CMReturnData);
    expect_forwards<&CMPIResultFT::returnInstance>(&CMReturnInstance);
    expect_forwards<&CMPIResultFT::returnObjectPath>(&CMReturnObjectPath);
    expect_forwards<&CMPIResultFT::returnDone>(&CMReturnDone);
    expect_forwards<&CMPIResultFT::returnError>(&CMReturnError);
}

TEST(CmpiForwarders, StringFormsCallTheirSlots) {
    expect_forwards<&CMPIStringFT::getCharPtr>(&CMGetCharsPtr);
}

TEST(CmpiForwarders, ArrayFormsCallTheirSlots) {
    expect_forwards<&CMPIArrayFT::getSize>(&CMGetArrayCount);
    expect_forwards<&CMPIArrayFT::getSimpleType>(&CMGetArrayType);
    expect_forwards<&CMPIArrayFT::getElementAt>(&CMGetArrayElementAt);
    expect_forwards<&CMPIArrayFT::setElementAt>(&CMSetArrayElementAt);
}

TEST(CmpiForwarders, EnumerationFormsCallTheirSlots) {
    expect_forwards<&CMPIEnumerationFT::getNext>(&CMGetNext);
    expect_forwards<&CMPIEnumerationFT::hasNext>(&CMHasNext);
    expect_forwards<&CMPIEnumerationFT::toArray>(&CMToArray);
}

TEST(CmpiForwarders, ArgsFormsCallTheirSlots) {
    expect_forwards<&CMPIArgsFT::addArg>(&CMAddArg);
    expect_forwards<&CMPIArgsFT::getArg>(&CMGetArg);
    expect_forwards<&CMPIArgsFT::getArgAt>(&CMGetArgAt);
    expect_forwards<&CMPIArgsFT::getArgCount>(&CMGetArgCount);
}

TEST(CmpiForwarders, DateTimeFormsCallTheirSlots) {
    expect_forwards<&CMPIDateTimeFT::getBinaryFormat>(&CMGetBinaryFormat);
    expect_forwards<&CMPIDateTimeFT::getStringFormat>(&CMGetStringFormat);
    expect_forwards<&CMPIDateTimeFT::isInterval>(&CMIsInterval);
}

TEST(CmpiForwarders, InstanceFormsCallTheirSlots) {
    expect_forwards<&CMPIInstanceFT::getProperty>(&CMGetProperty);
    expect_forwards<&CMPIInstanceFT::getPropertyAt>(&CMGetPropertyAt);
    expect_forwards<&CMPIInstanceFT::getPropertyCount>(&CMGetPropertyCount);
    expect_forwards<&CMPIInstanceFT::setProperty>(&CMSetProperty);
    expect_forwards<&CMPIInstanceFT::getObjectPath>(&CMGetObjectPath);
    expect_forwards<&CMPIInstanceFT::setPropertyFilter>(&CMSetPropertyFilter);
    expect_forwards<&CMPIInstanceFT::setObjectPath>(&CMSetObjectPath);
    expect_forwards<&CMPIInstanceFT::setPropertyWithOrigin>(&CMSetPropertyWithOrigin);
}

TEST(CmpiForwarders, ObjectPathFormsCallTheirSlots) {
    expect_forwards<&CMPIObjectPathFT::setNameSpace>(&CMSetNameSpace);
    expect_forwards<&CMPIObjectPathFT::getNameSpace>(&CMGetNameSpace);
    expect_forwards<&CMPIObjectPathFT::setHostname>(&CMSetHostname);
    expect_forwards<&CMPIObjectPathFT::getHostname>(&CMGetHostname);
    expect_forwards<&CMPIObjectPathFT::setClassName>(&CMSetClassName);
    expect_forwards<&CMPIObjectPathFT::getClassName>(&CMGetClassName);
    expect_forwards<&CMPIObjectPathFT::addKey>(&CMAddKey);
    expect_forwards<&CMPIObjectPathFT::getKey>(&CMGetKey);
    expect_forwards<&CMPIObjectPathFT::getKeyAt>(&CMGetKeyAt);
    expect_forwards<&CMPIObjectPathFT::getKeyCount>(&CMGetKeyCount);
    expect_forwards<&CMPIObjectPathFT::setNameSpaceFromObjectPath>(&CMSetNameSpaceFromObjectPath);
    expect_forwards<&CMPIObjectPathFT::setHostAndNameSpaceFromObjectPath>(
        &CMSetHostAndNameSpaceFromObjectPath);
    expect_forwards<&CMPIObjectPathFT::getClassQualifier>(&CMGetClassQualifier);
    expect_forwards<&CMPIObjectPathFT::getPropertyQualifier>(&CMGetPropertyQualifier);
    expect_forwards<&CMPIObjectPathFT::getMethodQualifier>(&CMGetMethodQualifier);
    expect_forwards<&CMPIObjectPathFT::getParameterQualifier>(&CMGetParameterQualifier);
    expect_forwards<&CMPIObjectPathFT::toString>(&CMObjectPathToString);
}

TEST(CmpiForwarders, SelectExpFormsCallTheirSlots) {
    expect_forwards<&CMPISelectExpFT::evaluate>(&CMEvaluateSelExp);
    expect_forwards<&CMPISelectExpFT::getString>(&CMGetSelExpString);
    expect_forwards<&CMPISelectExpFT::getDOC>(&CMGetDoc);
    expect_forwards<&CMPISelectExpFT::getCOD>(&CMGetCod);
    expect_forwards<&CMPISelectExpFT::evaluateUsingAccessor>(&CMEvaluateSelExpUsingAccessor);
}

TEST(CmpiForwarders, SelectCondFormsCallTheirSlots) {
    expect_forwards<&CMPISelectCondFT::getCountAndType>(&CMGetSubCondCountAndType);
    expect_forwards<&CMPISelectCondFT::getSubCondAt>(&CMGetSubCondAt);
}

TEST(CmpiForwarders, SubCondFormsCallTheirSlots) {
    expect_forwards<&CMPISubCondFT::getCount>(&CMGetPredicateCount);
    expect_forwards<&CMPISubCondFT::getPredicateAt>(&CMGetPredicateAt);
    expect_forwards<&CMPISubCondFT::getPredicate>(&CMGetPredicate);
}

TEST(CmpiForwarders, PredicateFormsCallTheirSlots) {
    expect_forwards<&CMPIPredicateFT::getData>(&CMGetPredicateData);
    expect_forwards<&CMPIPredicateFT::evaluateUsingAccessor>(&CMEvaluatePredicateUsingAccessor);
}

TEST(CmpiForwarders, ErrorFormsCallTheirSlots) {
    expect_forwards<&CMPIErrorFT::getErrorType>(&CMGetErrorType);
    expect_forwards<&CMPIErrorFT::getOtherErrorType>(&CMGetOtherErrorType);
    expect_forwards<&CMPIErrorFT::getOwningEntity>(&CMGetOwningEntity);
    expect_forwards<&CMPIErrorFT::getMessageID>(&CMGetMessageID);
    expect_forwards<&CMPIErrorFT::getMessage>(&CMGetErrorMessage);
    expect_forwards<&CMPIErrorFT::getPerceivedSeverity>(&CMGetPerceivedSeverity);
    expect_forwards<&CMPIErrorFT::getProbableCause>(&CMGetProbableCause);
    expect_forwards<&CMPIErrorFT::getProbableCauseDescription>(&CMGetProbableCauseDescription);
    expect_forwards<&CMPIErrorFT::getRecommendedActions>(&CMGetRecommendedActions);
    expect_forwards<&CMPIErrorFT::getErrorSource>(&CMGetErrorSource);
    expect_forwards<&CMPIErrorFT::getErrorSourceFormat>(&CMGetErrorSourceFormat);
    expect_forwards<&CMPIErrorFT::getOtherErrorSourceFormat>(&CMGetOtherErrorSourceFormat);
    expect_forwards<&CMPIErrorFT::getCIMStatusCode>(&CMGetCIMStatusCode);
    expect_forwards<&CMPIErrorFT::getCIMStatusCodeDescription>(&CMGetCIMStatusCodeDescription);
    expect_forwards<&CMPIErrorFT::getMessageArguments>(&CMGetMessageArguments);
    expect_forwards<&CMPIErrorFT::setErrorType>(&CMSetErrorType);
    expect_forwards<&CMPIErrorFT::setOtherErrorType>(&CMSetOtherErrorType);
    expect_forwards<&CMPIErrorFT::setProbableCauseDescription>(&CMSetProbableCauseDescription);
    expect_forwards<&CMPIErrorFT::setRecommendedActions>(&CMSetRecommendedActions);
    expect_forwards<&CMPIErrorFT::setErrorSource>(&CMSetErrorSource);
    expect_forwards<&CMPIErrorFT::setErrorSourceFormat>(&CMSetErrorSourceFormat);
    expect_forwards<&CMPIErrorFT::setOtherErrorSourceFormat>(&CMSetOtherErrorSourceFormat);
    expect_forwards<&CMPIErrorFT::setCIMStatusCodeDescription>(&CMSetCIMStatusCodeDescription);
    expect_forwards<&CMPIErrorFT::setMessageArguments>(&CMSetMessageArguments);
}

TEST(CmpiForwarders, BrokerFormsCallTheirSlots) {
    expect_forwards<&CMPIBrokerFT::prepareAttachThread>(&CBPrepareAttachThread);
    expect_forwards<&CMPIBrokerFT::attachThread>(&CBAttachThread);
    expect_forwards<&CMPIBrokerFT::detachThread>(&CBDetachThread);
    expect_forwards<&CMPIBrokerFT::deliverIndication>(&CBDeliverIndication);
    expect_forwards<&CMPIBrokerFT::enumerateInstanceNames>(&CBEnumInstanceNames);
    expect_forwards<&CMPIBrokerFT::enumerateInstances>(&CBEnumInstances);
    expect_forwards<&CMPIBrokerFT::getInstance>(&CBGetInstance);
    expect_forwards<&CMPIBrokerFT::createInstance>(&CBCreateInstance);
    expect_forwards<&CMPIBrokerFT::modifyInstance>(&CBModifyInstance);
    expect_forwards<&CMPIBrokerFT::deleteInstance>(&CBDeleteInstance);
    expect_forwards<&CMPIBrokerFT::execQuery>(&CBExecQuery);
    expect_forwards<&CMPIBrokerFT::associators>(&CBAssociators);
    expect_forwards<&CMPIBrokerFT::associatorNames>(&CBAssociatorNames);
    expect_forwards<&CMPIBrokerFT::references>(&CBReferences);
    expect_forwards<&CMPIBrokerFT::referenceNames>(&CBReferenceNames);
    expect_forwards<&CMPIBrokerFT::invokeMethod>(&CBInvokeMethod);
    expect_forwards<&CMPIBrokerFT::setProperty>(&CBSetProperty);
    expect_forwards<&CMPIBrokerFT::getProperty>(&CBGetProperty);
}

TEST(CmpiForwarders, BrokerEncFormsCallTheirSlots) {
    expect_forwards<&CMPIBrokerEncFT::newInstance>(&CMNewInstance);
    expect_forwards<&CMPIBrokerEncFT::newObjectPath>(&CMNewObjectPath);
    expect_forwards<&CMPIBrokerEncFT::newArgs>(&CMNewArgs);
    expect_forwards<&CMPIBrokerEncFT::newString>(&CMNewString);
    expect_forwards<&CMPIBrokerEncFT::newArray>(&CMNewArray);
    expect_forwards<&CMPIBrokerEncFT::newDateTime>(&CMNewDateTime);
    expect_forwards<&CMPIBrokerEncFT::newDateTimeFromBinary>(&CMNewDateTimeFromBinary);
    expect_forwards<&CMPIBrokerEncFT::newDateTimeFromChars>(&CMNewDateTimeFromChars);
    expect_forwards<&CMPIBrokerEncFT::newSelectExp>(&CMNewSelectExp);
    expect_forwards<&CMPIBrokerEncFT::newCMPIError>(&CMNewCMPIError);
    expect_forwards<&CMPIBrokerEncFT::classPathIsA>(&CMClassPathIsA);
    expect_forwards<&CMPIBrokerEncFT::toString>(&CDToString);
    expect_forwards<&CMPIBrokerEncFT::isOfType>(&CDIsOfType);
    expect_forwards<&CMPIBrokerEncFT::getType>(&CDGetType);
    expect_forwards<&CMPIBrokerEncFT::logMessage>(&CMLogMessage);
    expect_forwards<&CMPIBrokerEncFT::trace>(&CMTraceMessage);
    expect_forwards<&CMPIBrokerEncFT::openMessageFile>(&CMOpenMessageFile);
    expect_forwards<&CMPIBrokerEncFT::closeMessageFile>(&CMCloseMessageFile);
}

TEST(CmpiForwarders, CharPtrIsAskedForWithoutAStatus) {
    using Fake = Recorder<decltype(CMPIStringFT::getCharPtr)>;
    CMPIStringFT table{};
    table.getCharPtr = &Fake::record;
    const CMPIString string{nullptr, &table};
    Fake::calls = 0;

    EXPECT_EQ(CMGetCharPtr(&string), sample<const char *>(kResult));
    EXPECT_EQ(Fake::calls, 1);
    EXPECT_TRUE(Fake::seen == std::make_tuple(&string, static_cast<CMPIStatus *>(nullptr)));
}

TEST(CmpiForwarders, BrokerDataMembersAreReadable) {
    CMPIBrokerFT table{};
    table.brokerVersion = 7;
    table.brokerName = "fake";
    const CMPIBroker broker{nullptr, &table, nullptr, nullptr, nullptr};

    EXPECT_EQ(CBBrokerVersion(&broker), 7U);
    EXPECT_STREQ(CBBrokerName(&broker), "fake");
}
