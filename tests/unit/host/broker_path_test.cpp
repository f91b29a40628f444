// Object paths and instances.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

class BrokerPath : public BrokerTest {
  protected:
    CMPIStatus status{};
};

TEST_F(BrokerPath, UnknownAndEmptyClassesGiveAPath) {
    EXPECT_NE(make().newObjectPath(cmpi, "no/such", "No_Such", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_NE(make().newObjectPath(cmpi, kNamespace, "", &status), nullptr);
    EXPECT_NE(make().newObjectPath(cmpi, nullptr, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(BrokerPath, HostAndNamespaceThatAreNotSetAreStringsWithoutText) {
    const CMPIObjectPath *path = make().newObjectPath(cmpi, nullptr, "Test_Base", nullptr);
    const CMPIString *host = path->ft->getHostname(path, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    ASSERT_NE(host, nullptr);
    EXPECT_EQ(host->hdl, nullptr);
    const CMPIString *name_space = path->ft->getNameSpace(path, &status);
    ASSERT_NE(name_space, nullptr);
    EXPECT_EQ(name_space->hdl, nullptr);
}

TEST_F(BrokerPath, PartsAreSetAndRead) {
    CMPIObjectPath *path = new_path("Test_Base");
    path->ft->setHostname(path, "esx1");
    path->ft->setNameSpace(path, "root/cimv2");
    path->ft->setClassName(path, "Test_Link");
    EXPECT_EQ(text(path->ft->getHostname(path, nullptr)), "esx1");
    EXPECT_EQ(text(path->ft->getNameSpace(path, nullptr)), "root/cimv2");
    EXPECT_EQ(text(path->ft->getClassName(path, nullptr)), "Test_Link");
    EXPECT_EQ(text(path->ft->toString(path, nullptr)), "//esx1/root/cimv2:Test_Link");
}

TEST_F(BrokerPath, CopiesFromAnotherPathLeaveTheClass) {
    CMPIObjectPath *source = new_path("Test_Base");
    source->ft->setHostname(source, "esx1");
    CMPIObjectPath *path = make().newObjectPath(cmpi, "other", "Test_Link", nullptr);
    EXPECT_EQ(path->ft->setNameSpaceFromObjectPath(path, source).rc, CMPI_RC_OK);
    EXPECT_EQ(text(path->ft->getNameSpace(path, nullptr)), kNamespace);
    EXPECT_EQ(text(path->ft->getHostname(path, nullptr)), "(null)");
    path->ft->setHostAndNameSpaceFromObjectPath(path, source);
    EXPECT_EQ(text(path->ft->getHostname(path, nullptr)), "esx1");
    EXPECT_EQ(text(path->ft->getClassName(path, nullptr)), "Test_Link");
}

TEST_F(BrokerPath, KeysComeBackWithGoodState) {
    CMPIObjectPath *path = new_path("Test_Base");
    path->ft->addKey(path, "Name", chars("x"), CMPI_chars);
    EXPECT_EQ(path->ft->getKey(path, "Name", nullptr).state, CMPI_goodValue);
}

TEST_F(BrokerPath, PropertyQualifiersComeFromTheRepository) {
    const CMPIObjectPath *path = new_path("Test_Service");
    const CMPIData key = path->ft->getPropertyQualifier(path, "Name", "key", &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(key.type, CMPI_boolean);
    EXPECT_EQ(key.value.boolean, 1);
    EXPECT_EQ(path->ft->getPropertyQualifier(path, "Numbers", "Values", nullptr).type,
              CMPI_stringA);
    path->ft->getPropertyQualifier(path, "Name", "Nope", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(BrokerPath, ClassPathIsAFollowsSuperclassesWithoutRegardToCase) {
    const CMPIObjectPath *path = new_path("test_service");
    EXPECT_EQ(make().classPathIsA(cmpi, path, "TEST_BASE", &status), 1);
    EXPECT_EQ(make().classPathIsA(cmpi, path, "Test_Service", &status), 1);
    EXPECT_EQ(make().classPathIsA(cmpi, path, "Test_Link", &status), 0);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

// -- Instances --

using BrokerInstance = BrokerPath;

TEST_F(BrokerInstance, UnknownClassGivesAnInstance) {
    const CMPIObjectPath *path = make().newObjectPath(cmpi, "no/such", "No_Such", nullptr);
    const CMPIInstance *instance = make().newInstance(cmpi, path, &status);
    ASSERT_NE(instance, nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 0U);
}

TEST_F(BrokerInstance, StartsWithTheClassesDefaultsAndThePathsKeys) {
    CMPIObjectPath *path = new_path("Test_Service");
    path->ft->addKey(path, "Name", chars("x"), CMPI_chars);
    const CMPIInstance *instance = make().newInstance(cmpi, path, nullptr);
    EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 5U);
    EXPECT_EQ(instance->ft->getProperty(instance, "Mode", nullptr).value.uint16, 7);
    EXPECT_EQ(text(instance->ft->getProperty(instance, "Name", nullptr)), "x");
}

TEST_F(BrokerInstance, PathTakesTheKeysOfTheClassFromTheProperties) {
    CMPIInstance *instance = make().newInstance(cmpi, new_path("Test_Service"), nullptr);
    instance->ft->setProperty(instance, "Name", chars("late"), CMPI_chars);
    const CMPIObjectPath *path = instance->ft->getObjectPath(instance, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(text(path->ft->toString(path, nullptr)), "test/cimv2:Test_Service.Name=\"late\"");
}

TEST_F(BrokerInstance, PathOfAnUnknownClassWithoutKeysIsNullWithInvalidClass) {
    CMPIInstance *instance = make().newInstance(cmpi, new_path("No_Such"), nullptr);
    instance->ft->setProperty(instance, "Name", chars("x"), CMPI_chars);
    EXPECT_EQ(instance->ft->getObjectPath(instance, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
}

TEST_F(BrokerInstance, PathOfAnUnknownClassWithKeysIsKnown) {
    CMPIObjectPath *path = new_path("No_Such");
    path->ft->addKey(path, "Id", chars("7"), CMPI_chars);
    const CMPIInstance *instance = make().newInstance(cmpi, path, nullptr);
    const CMPIObjectPath *found = instance->ft->getObjectPath(instance, &status);
    ASSERT_NE(found, nullptr);
    EXPECT_EQ(text(found->ft->getKey(found, "id", nullptr)), "7");
}

TEST_F(BrokerInstance, SetObjectPathReplacesThePath) {
    CMPIInstance *instance = make().newInstance(cmpi, new_path("Test_Service"), nullptr);
    CMPIObjectPath *path = new_path("Test_Base");
    path->ft->addKey(path, "Name", chars("new"), CMPI_chars);
    EXPECT_EQ(instance->ft->setObjectPath(instance, path).rc, CMPI_RC_OK);
    const CMPIObjectPath *found = instance->ft->getObjectPath(instance, nullptr);
    EXPECT_EQ(text(found->ft->toString(found, nullptr)), "test/cimv2:Test_Base.Name=\"new\"");
}

TEST_F(BrokerInstance, FilterDropsWhatIsInNeitherListAndIgnoresLaterSets) {
    CMPIInstance *instance = make().newInstance(cmpi, new_path("Test_Service"), nullptr);
    const char *properties[] = {"count", nullptr};
    const char *keys[] = {"Name", nullptr};
    EXPECT_EQ(instance->ft->setPropertyFilter(instance, properties, keys).rc, CMPI_RC_OK);
    EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 2U);
    EXPECT_EQ(instance->ft->setProperty(instance, "Caption", chars("x"), CMPI_chars).rc,
              CMPI_RC_OK);
    instance->ft->getProperty(instance, "Caption", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(instance->ft->setProperty(instance, "Name", chars("x"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(text(instance->ft->getProperty(instance, "Name", nullptr)), "x");
}

TEST_F(BrokerInstance, WithoutAFilterListEverythingStays) {
    CMPIInstance *instance = make().newInstance(cmpi, new_path("Test_Service"), nullptr);
    instance->ft->setPropertyFilter(instance, nullptr, nullptr);
    EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 5U);
}

TEST_F(BrokerInstance, CloneIsIndependent) {
    CMPIInstance *instance = make().newInstance(cmpi, new_path("Test_Service"), nullptr);
    CMPIInstance *copy = instance->ft->clone(instance, &status);
    instance->ft->setProperty(instance, "Name", chars("changed"), CMPI_chars);
    EXPECT_EQ(copy->ft->getProperty(copy, "Name", nullptr).state, CMPI_nullValue);
    copy->ft->release(copy);
}

}  // namespace
}  // namespace velkhost::broker::testing
