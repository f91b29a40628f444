// Which slots a broker of the sfcb kind has, and the numbers in its tables.
#include "broker_testing.h"

#include <algorithm>

namespace velkhost::broker::testing {
namespace {

// One object of every kind, for the sake of its table.
class BrokerTables : public BrokerTest {
  protected:
    struct Tables {
        CMPIContextFT context;
        CMPIResultFT result;
        CMPIStringFT string;
        CMPIArrayFT array;
        CMPIEnumerationFT enumeration;
        CMPIInstanceFT instance;
        CMPIObjectPathFT path;
        CMPIArgsFT args;
        CMPIDateTimeFT date_time;
        CMPISelectExpFT select;
        CMPISelectCondFT condition;
        CMPISubCondFT row;
        CMPIPredicateFT predicate;
    };

    Tables tables() {
        Tables found{};
        provider.enumerate = [](const auto *, const auto *, const auto *) {
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        broker.register_provider(kNamespace, "Test_Service", provider.instances());
        provider.invoke = [&](const CMPIContext *context, const CMPIResult *result,
                              const CMPIObjectPath *path, const char *, const CMPIArgs *in,
                              CMPIArgs *) {
            const CMPIEnumeration *none = cmpi->bft->enumerateInstances(
                cmpi, context, new_path("Test_Service"), nullptr, nullptr);
            const CMPISelectExp *select = make().newSelectExp(
                cmpi, "SELECT * FROM Test_Service WHERE Count = 1", "WQL", nullptr, nullptr);
            const CMPISelectCond *condition = select->ft->getDOC(select, nullptr);
            const CMPISubCond *row = condition->ft->getSubCondAt(condition, 0, nullptr);
            found = {*context->ft,
                     *result->ft,
                     *make().newString(cmpi, "", nullptr)->ft,
                     *make().newArray(cmpi, 0, CMPI_uint8, nullptr)->ft,
                     *none->ft,
                     *make().newInstance(cmpi, path, nullptr)->ft,
                     *path->ft,
                     *in->ft,
                     *make().newDateTime(cmpi, nullptr)->ft,
                     *select->ft,
                     *condition->ft,
                     *row->ft,
                     *row->ft->getPredicateAt(row, 0, nullptr)->ft};
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        broker.register_provider(kNamespace, "Test_Service", provider.methods());
        EXPECT_EQ(broker.invoke_method(path_of("Test_Service"), "Look").status, Status{});
        return found;
    }
};

TEST_F(BrokerTables, BrokerVersionIsZero) {
    EXPECT_EQ(cmpi->bft->brokerVersion, 0U);
}

TEST_F(BrokerTables, BrokerHasItsNameAndNoMemoryTable) {
    EXPECT_STREQ(cmpi->bft->brokerName, "velkhost");
    EXPECT_EQ(cmpi->mft, nullptr);
}

TEST_F(BrokerTables, AnnouncesWhatSuchABrokerAnnounces) {
    const unsigned capabilities = cmpi->bft->brokerCapabilities;
    for (const unsigned mask :
         {CMPI_MB_InstanceManipulation, CMPI_MB_AssociationTraversal, CMPI_MB_QueryExecution,
          CMPI_MB_QueryNormalization, CMPI_MB_OSEncapsulationSupport}) {
        EXPECT_EQ(capabilities & mask, mask);
    }
    EXPECT_EQ(capabilities & CMPI_MB_Supports_MemEnhancements, 0U);
    EXPECT_NE(capabilities & CMPI_MB_Indications, static_cast<unsigned>(CMPI_MB_Indications));
}

TEST_F(BrokerTables, ObjectTablesHaveVersionOneAndOsServicesTwoHundred) {
    const Tables found = tables();
    for (const int version :
         {found.context.ftVersion, found.result.ftVersion, found.string.ftVersion,
          found.array.ftVersion, found.enumeration.ftVersion, found.instance.ftVersion,
          found.path.ftVersion, found.args.ftVersion, found.date_time.ftVersion,
          found.select.ftVersion, found.condition.ftVersion, found.row.ftVersion,
          found.predicate.ftVersion, cmpi->eft->ftVersion}) {
        EXPECT_EQ(version, 1);
    }
    EXPECT_EQ(cmpi->xft->ftVersion, 200);
}

TEST_F(BrokerTables, FactorySlotsThatSuchABrokerLacksAreEmpty) {
    EXPECT_EQ(make().newCMPIError, nullptr);
    EXPECT_EQ(make().openMessageFile, nullptr);
    EXPECT_EQ(make().closeMessageFile, nullptr);
    EXPECT_EQ(make().getMessage2, nullptr);
}

TEST_F(BrokerTables, OsServiceSlotsThatSuchABrokerLacksAreEmpty) {
    EXPECT_EQ(cmpi->xft->joinThread, nullptr);
    EXPECT_EQ(cmpi->xft->exitThread, nullptr);
    EXPECT_EQ(cmpi->xft->cancelThread, nullptr);
    EXPECT_EQ(cmpi->xft->threadSleep, nullptr);
    EXPECT_EQ(cmpi->xft->signalCondition, nullptr);
}

TEST_F(BrokerTables, ObjectSlotsThatSuchABrokerLacksAreEmpty) {
    const Tables found = tables();
    EXPECT_EQ(found.result.returnError, nullptr);
    EXPECT_EQ(found.instance.setPropertyWithOrigin, nullptr);
    EXPECT_EQ(found.path.getClassQualifier, nullptr);
    EXPECT_EQ(found.path.getMethodQualifier, nullptr);
    EXPECT_EQ(found.path.getParameterQualifier, nullptr);
}

// Every other slot is filled: the tables are walked as arrays of pointers.
template <class Table>
std::size_t empty_slots(const Table &table) {
    const auto *slots = reinterpret_cast<const void *const *>(&table);
    const std::size_t count = sizeof table / sizeof(void *);
    return static_cast<std::size_t>(std::count(slots + 1, slots + count, nullptr));
}

TEST_F(BrokerTables, NoOtherSlotIsEmpty) {
    const Tables found = tables();
    EXPECT_EQ(empty_slots(found.context), 0U);
    EXPECT_EQ(empty_slots(found.result), 1U);
    EXPECT_EQ(empty_slots(found.string), 0U);
    EXPECT_EQ(empty_slots(found.array), 0U);
    EXPECT_EQ(empty_slots(found.enumeration), 0U);
    EXPECT_EQ(empty_slots(found.instance), 1U);
    EXPECT_EQ(empty_slots(found.path), 3U);
    EXPECT_EQ(empty_slots(found.args), 0U);
    EXPECT_EQ(empty_slots(found.date_time), 0U);
    EXPECT_EQ(empty_slots(found.select), 0U);
    EXPECT_EQ(empty_slots(found.condition), 0U);
    EXPECT_EQ(empty_slots(found.row), 0U);
    EXPECT_EQ(empty_slots(found.predicate), 0U);
    EXPECT_EQ(empty_slots(*cmpi->eft), 4U);
    EXPECT_EQ(empty_slots(*cmpi->xft), 5U);
}

TEST_F(BrokerTables, MessageLogAndTraceServicesAnswerNotSupported) {
    EXPECT_EQ(make().logMessage(cmpi, 1, "id", "text", nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(make().trace(cmpi, 1, "component", "text", nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    CMPIStatus status{};
    const CMPIString *message = make().getMessage(cmpi, "id", "value is $0", &status, 0);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(text(message), "value is $0");
}

TEST_F(BrokerTables, SinglePropertyAndIndicationServicesAnswerNotSupported) {
    in_request([this](const CMPIContext *context) {
        const CMPIBrokerFT &calls = *cmpi->bft;
        const CMPIObjectPath *path = new_path("Test_Service");
        EXPECT_EQ(calls.setProperty(cmpi, context, path, "Caption", chars("x"), CMPI_chars).rc,
                  CMPI_RC_ERR_NOT_SUPPORTED);
        CMPIStatus status{};
        const CMPIData data = calls.getProperty(cmpi, context, path, "Caption", &status);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
        EXPECT_EQ(data.state, CMPI_nullValue);
        EXPECT_EQ(calls.deliverIndication(cmpi, context, kNamespace, nullptr).rc,
                  CMPI_RC_ERR_NOT_SUPPORTED);
    });
}

// -- Objects in general --

TEST_F(BrokerTables, TypeQuestionsTellObjectsApart) {
    const CMPIObjectPath *path = new_path("Test_Service");
    EXPECT_EQ(make().isOfType(cmpi, path, "CMPIObjectPath", nullptr), 1);
    EXPECT_EQ(make().isOfType(cmpi, path, "CMPIInstance", nullptr), 0);
    EXPECT_EQ(text(make().getType(cmpi, make().newArgs(cmpi, nullptr), nullptr)), "CMPIArgs");
}

TEST_F(BrokerTables, ToStringTakesPathsAndInstancesOnly) {
    CMPIObjectPath *path = new_path("Test_Service");
    path->ft->addKey(path, "Name", chars("a\"b"), CMPI_chars);
    EXPECT_EQ(text(make().toString(cmpi, path, nullptr)),
              "test/cimv2:Test_Service.Name=\"a\\\"b\"");
    const CMPIInstance *instance = make().newInstance(cmpi, new_path("Test_Base"), nullptr);
    EXPECT_EQ(text(make().toString(cmpi, instance, nullptr)),
              "instance of Test_Base { Name=NULL, Caption=NULL }");
    CMPIStatus status{};
    EXPECT_EQ(make().toString(cmpi, make().newArgs(cmpi, nullptr), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(BrokerTables, ObjectsOfOthersAndNullAreInvalidHandles) {
    CMPIStatus status{};
    const CMPIObjectPathFT &table = *new_path("Test_Service")->ft;
    EXPECT_EQ(table.getKeyCount(nullptr, &status), 0U);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    CMPIObjectPathFT foreign_table = table;
    CMPIObjectPath foreign{&foreign_table, &foreign_table};
    EXPECT_EQ(table.getKeyCount(&foreign, &status), 0U);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(table.release(&foreign).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

}  // namespace
}  // namespace velkhost::broker::testing
