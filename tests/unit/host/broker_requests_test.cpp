// Requests of clients: what reaches a provider and what comes back.
#include "broker_testing.h"

#include <thread>

namespace velkhost::broker::testing {
namespace {

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

class BrokerRequests : public BrokerTest {
  protected:
    void serve(const char *class_name) {
        broker.register_provider(kNamespace, class_name, provider.all());
    }
    // Answers enumerations with one object of the class that was asked for.
    ScriptedProvider::Operation one_instance() {
        return [this](const auto *, const CMPIResult *result, const CMPIObjectPath *path) {
            return result->ft->returnInstance(result, make().newInstance(cmpi, path, nullptr));
        };
    }
};

// -- Methods --

TEST_F(BrokerRequests, MethodReturnsValueAndOutputArguments) {
    provider.invoke = [](const auto *, const CMPIResult *result, const auto *, const char *method,
                         const CMPIArgs *in, CMPIArgs *out) {
        EXPECT_STREQ(method, "Run");
        CMPIStatus status{};
        const CMPIData speed = in->ft->getArg(in, "speed", &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        EXPECT_EQ(speed.type, CMPI_uint16);
        CMPIValue twice{};
        twice.uint16 = static_cast<CMPIUint16>(speed.value.uint16 * 2);
        out->ft->addArg(out, "Twice", &twice, CMPI_uint16);
        CMPIValue value{};
        value.uint32 = 4096;
        result->ft->returnData(result, &value, CMPI_uint32);
        return result->ft->returnDone(result);
    };
    serve("Test_Service");
    const MethodReply reply =
        broker.invoke_method(path_of("Test_Service"), "Run", {{"Speed", cim::Value::uint16(21)}});
    EXPECT_EQ(reply.status, Status{});
    EXPECT_EQ(reply.return_value, cim::Value::uint32(4096));
    EXPECT_EQ(reply.out, (cim::NamedValues{{"Twice", cim::Value::uint16(42)}}));
    EXPECT_TRUE(reply.return_done);
}

TEST_F(BrokerRequests, MethodWithoutReturnDoneIsSeen) {
    provider.invoke = [](const auto *, const auto *, const auto *, const char *, const auto *,
                         auto *) { return ok(); };
    serve("Test_Service");
    const MethodReply reply = broker.invoke_method(path_of("Test_Service"), "Run");
    EXPECT_EQ(reply.status, Status{});
    EXPECT_EQ(reply.return_value, std::nullopt);
    EXPECT_FALSE(reply.return_done);
}

TEST_F(BrokerRequests, ReturnedTextKeepsTheTypeItWasGivenWith) {
    provider.invoke = [](const auto *, const CMPIResult *result, const auto *, const char *,
                         const auto *,
                         auto *) { return result->ft->returnData(result, chars("x"), CMPI_chars); };
    serve("Test_Service");
    const MethodReply reply = broker.invoke_method(path_of("Test_Service"), "Run");
    EXPECT_EQ(reply.return_value, (cim::Value{CMPI_chars, std::string("x")}));
}

TEST_F(BrokerRequests, FailedMethodGivesCodeAndMessageAlone) {
    provider.invoke = [this](const auto *, const CMPIResult *result, const auto *, const char *,
                             const auto *, auto *) {
        CMPIValue value{};
        result->ft->returnData(result, &value, CMPI_uint32);
        return CMPIStatus{CMPI_RC_ERR_METHOD_NOT_FOUND,
                          make().newString(cmpi, "InValid Method Name", nullptr)};
    };
    serve("Test_Service");
    const MethodReply reply = broker.invoke_method(path_of("Test_Service"), "Nope");
    EXPECT_EQ(reply.status, (Status{CMPI_RC_ERR_METHOD_NOT_FOUND, "InValid Method Name"}));
    EXPECT_EQ(reply.return_value, std::nullopt);
}

TEST_F(BrokerRequests, MethodReachesTheProviderWhateverTheNamespace) {
    std::string seen;
    provider.invoke = [&seen](const auto *, const auto *, const CMPIObjectPath *path, const char *,
                              const auto *, auto *) {
        seen = text(path->ft->getNameSpace(path, nullptr));
        return ok();
    };
    serve("Test_Service");
    EXPECT_EQ(broker.invoke_method({"", "no/such", "Test_Service", {}}, "Run").status, Status{});
    EXPECT_EQ(seen, "no/such");
}

TEST_F(BrokerRequests, MethodOfASubclassReachesTheProviderOfItsSuperclass) {
    provider.invoke = [](const auto *, const auto *, const auto *, const char *, const auto *,
                         auto *) { return ok(); };
    serve("Test_Base");
    EXPECT_EQ(broker.invoke_method(path_of("Test_Service"), "Run").status, Status{});
}

TEST_F(BrokerRequests, MethodWithoutAProviderFails) {
    EXPECT_EQ(broker.invoke_method(path_of("Test_Service"), "Run").status.code, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(broker.invoke_method(path_of("No_Such"), "Run").status.code,
              CMPI_RC_ERR_INVALID_CLASS);
}

TEST_F(BrokerRequests, ArgumentsOfEveryFormArrive) {
    provider.invoke = [](const auto *, const auto *, const auto *, const char *, const CMPIArgs *in,
                         CMPIArgs *out) {
        for (CMPICount i = 0; i < in->ft->getArgCount(in, nullptr); ++i) {
            CMPIString *name = nullptr;
            const CMPIData data = in->ft->getArgAt(in, i, &name, nullptr);
            const bool null = (data.state & CMPI_nullValue) != 0;
            out->ft->addArg(out, text(name).c_str(), null ? nullptr : &data.value, data.type);
        }
        return ok();
    };
    serve("Test_Service");
    const cim::ObjectPath path = path_of("Test_Base", {{"Name", cim::Value::string("x")}});
    const cim::NamedValues given{
        {"Text", cim::Value::string("text")},
        {"Null", cim::Value::null(CMPI_string)},
        {"Signed", cim::Value::sint32(-5)},
        {"Real", cim::Value::real64(1.5)},
        {"Flag", cim::Value::boolean(true)},
        {"Time", cim::Value::date_time("20260102030405.000000+000")},
        {"Path", cim::Value::reference(path)},
        {"Inner", cim::Value::instance({path, {{"Name", cim::Value::string("x")}}})},
        {"List",
         cim::Value::array(CMPI_string, {cim::Value::string("a"), cim::Value::null(CMPI_string)})},
        {"Empty", cim::Value::array(CMPI_instance, {})}};
    EXPECT_EQ(broker.invoke_method(path_of("Test_Service"), "Echo", given).out, given);
}

TEST_F(BrokerRequests, RequestCanRunOnAThreadOfItsOwn) {
    std::thread::id seen;
    provider.invoke = [&seen](const auto *, const auto *, const auto *, const char *, const auto *,
                              auto *) {
        seen = std::this_thread::get_id();
        return ok();
    };
    serve("Test_Service");
    broker.invoke_method(path_of("Test_Service"), "Run");
    EXPECT_EQ(seen, std::this_thread::get_id());
    broker.invoke_method(path_of("Test_Service"), "Run", {},
                         {.principal = "root", .flags = 0, .thread = RequestThread::kFresh});
    EXPECT_NE(seen, std::this_thread::get_id());
}

// -- Enumerations --

TEST_F(BrokerRequests, EnumerationOfASuperclassIncludesRegisteredSubclasses) {
    provider.enumerate = one_instance();
    serve("Test_Service");
    const InstancesReply reply = broker.enumerate_instances(path_of("Test_Base"));
    ASSERT_EQ(reply.instances.size(), 1U);
    EXPECT_EQ(reply.instances[0].path.class_name, "Test_Service");
}

TEST_F(BrokerRequests, EnumerationAsksClassAndSubclassProviders) {
    provider.enumerate = one_instance();
    serve("Test_Base");
    ScriptedProvider other;
    other.enumerate = one_instance();
    broker.register_provider(kNamespace, "Test_Service", other.instances());
    EXPECT_EQ(broker.enumerate_instances(path_of("test_base")).instances.size(), 2U);
    EXPECT_EQ(broker.enumerate_instances(path_of("Test_Service")).instances.size(), 1U);
    broker.shutdown();  // while the other provider is there
}

TEST_F(BrokerRequests, EnumerationOfUnknownClassOrNamespaceIsRefused) {
    EXPECT_EQ(broker.enumerate_instance_names(path_of("No_Such")).status,
              (Status{CMPI_RC_ERR_INVALID_CLASS, "Class not found"}));
    EXPECT_EQ(broker.enumerate_instances({"", "no/such", "Test_Base", {}}).status,
              (Status{CMPI_RC_ERR_INVALID_NAMESPACE, "Invalid namespace"}));
}

TEST_F(BrokerRequests, EnumerationWithoutAProviderIsEmpty) {
    const InstancesReply reply = broker.enumerate_instances(path_of("Test_Service"));
    EXPECT_EQ(reply.status, Status{});
    EXPECT_TRUE(reply.instances.empty());
}

TEST_F(BrokerRequests, ResultsOfAFailedEnumerationAreDropped) {
    provider.enumerate = [this](const auto *, const CMPIResult *result,
                                const CMPIObjectPath *path) {
        result->ft->returnInstance(result, make().newInstance(cmpi, path, nullptr));
        return CMPIStatus{CMPI_RC_ERR_FAILED, nullptr};
    };
    serve("Test_Service");
    const InstancesReply reply = broker.enumerate_instances(path_of("Test_Service"));
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(reply.instances.empty());
}

TEST_F(BrokerRequests, ReturningNothingIsRefusedByTheResult) {
    provider.enumerate = [](const auto *, const CMPIResult *result, const auto *) {
        EXPECT_EQ(result->ft->returnInstance(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
        EXPECT_EQ(result->ft->returnObjectPath(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
        CMPIStatus status{};
        EXPECT_EQ(result->ft->clone(result, &status), nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
        return result->ft->returnDone(result);
    };
    serve("Test_Service");
    EXPECT_EQ(broker.enumerate_instances(path_of("Test_Service")).status, Status{});
}

// -- Single instances --

TEST_F(BrokerRequests, GetInstanceReturnsIt) {
    provider.get = one_instance();
    serve("Test_Service");
    const cim::ObjectPath path = path_of("Test_Service", {{"Name", cim::Value::string("x")}});
    const InstanceReply reply = broker.get_instance(path);
    ASSERT_TRUE(reply.instance);
    EXPECT_EQ(reply.instance->path, path);
    EXPECT_EQ(*reply.instance->properties.find("Mode"), cim::Value::uint16(7));
}

TEST_F(BrokerRequests, InstanceOfAClassWithoutAProviderIsNotFound) {
    EXPECT_EQ(broker.get_instance(path_of("Test_Service")).status,
              (Status{CMPI_RC_ERR_NOT_FOUND, "The requested object could not be found"}));
}

TEST_F(BrokerRequests, WritesToAClassWithoutAProviderAreNotSupported) {
    const cim::Instance instance{path_of("Test_Service"), {}};
    EXPECT_EQ(broker.create_instance(instance).status.code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker.modify_instance(instance).code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker.delete_instance(instance.path).code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker.exec_query(instance.path, "SELECT * FROM Test_Service").status.code,
              CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(BrokerRequests, WritesReachTheProvider) {
    provider.create = [](const auto *, const CMPIResult *result, const CMPIObjectPath *path,
                         const auto *) { return result->ft->returnObjectPath(result, path); };
    provider.modify = [](const auto *, const auto *, const auto *, const CMPIInstance *instance) {
        EXPECT_EQ(text(instance->ft->getProperty(instance, "Caption", nullptr)), "c");
        return ok();
    };
    provider.remove = [](const auto *, const auto *, const auto *) { return ok(); };
    provider.query = one_instance();
    serve("Test_Service");
    const cim::Instance instance{path_of("Test_Service", {{"Name", cim::Value::string("x")}}),
                                 {{"Caption", cim::Value::string("c")}}};
    EXPECT_EQ(broker.create_instance(instance).path, instance.path);
    EXPECT_EQ(broker.modify_instance(instance), Status{});
    EXPECT_EQ(broker.delete_instance(instance.path), Status{});
    EXPECT_EQ(broker.exec_query(path_of("Test_Service"), "SELECT *").instances.size(), 1U);
}

// -- Associations --

TEST_F(BrokerRequests, AssociationRequestsReachEachProviderOnce) {
    int calls = 0;
    const auto answer = [&](const CMPIResult *result, const CMPIObjectPath *path, const char *,
                            const char *) {
        ++calls;
        result->ft->returnObjectPath(result, path);
        return result->ft->returnInstance(result, make().newInstance(cmpi, path, nullptr));
    };
    provider.associators = answer;
    provider.references = answer;
    serve("Test_Link");
    const cim::ObjectPath source = path_of("Test_Service", {{"Name", cim::Value::string("x")}});
    EXPECT_EQ(broker.associators(source).instances.size(), 1U);
    EXPECT_EQ(broker.associator_names(source).paths, std::vector{source});
    EXPECT_EQ(broker.references(source).instances.size(), 1U);
    EXPECT_EQ(broker.reference_names(source).paths.size(), 1U);
    EXPECT_EQ(calls, 4);
    AssociationFilter other;
    other.association_class = "Test_Base";
    EXPECT_EQ(broker.associators(source, other).status.code, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(BrokerRequests, PropertyListsReachTheProviderNullTerminated) {
    std::vector<std::string> seen;
    CMPIInstanceMIFT table = *provider.instances().instance->ft;
    static std::vector<std::string> *log = nullptr;
    log = &seen;
    table.enumerateInstances = [](CMPIInstanceMI *, const CMPIContext *, const CMPIResult *,
                                  const CMPIObjectPath *, const char **names) {
        for (; names != nullptr && *names != nullptr; ++names) {
            log->emplace_back(*names);
        }
        return ok();
    };
    CMPIInstanceMI mi{nullptr, &table};
    ManagementInterfaces interfaces;
    interfaces.instance = &mi;
    broker.register_provider(kNamespace, "Test_Service", interfaces);
    broker.enumerate_instances(path_of("Test_Service"), {{"Name", "Count"}});
    broker.enumerate_instances(path_of("Test_Service"));
    EXPECT_EQ(seen, (std::vector<std::string>{"Name", "Count"}));
    table.cleanup = [](CMPIInstanceMI *, const CMPIContext *, CMPIBoolean) { return ok(); };
    broker.shutdown();
}

}  // namespace
}  // namespace velkhost::broker::testing
