// Method calls of a client, answered by the library's own function tables.
#pragma once

#include <cmpi/cmpift.h>

#include "provider/provider.h"
#include "tests/support/broker_test.h"
#include "velk/cim.h"
#include "velk/request_state.h"

namespace velktest {

namespace cim = velkhost::cim;

class RequestTest : public BrokerTest {
  protected:
    RequestTest() {
        const CMPIBroker *used = ZEB_VMWarePackageInstallationBroker;
        velkhost::broker::ManagementInterfaces interfaces;
        interfaces.instance =
            ZEB_VMWarePackageInstallationProvider_Create_InstanceMI(used, nullptr, nullptr);
        interfaces.method =
            ZEB_VMWarePackageInstallationProvider_Create_MethodMI(used, nullptr, nullptr);
        for (const char *name : {kClass, kOtherClass}) {
            cim::ClassDecl declaration;
            declaration.name = name;
            EXPECT_EQ(broker().repository().add_class(kNamespace, declaration), "");
            broker().register_provider(kNamespace, name, interfaces);
        }
        clear_log();
    }

    static constexpr const char *kNamespace = "velk/cimv2";
    static constexpr const char *kClass = "PAKRO_VMpkgInstallationService";
    static constexpr const char *kOtherClass = "PAKRO_Other";

    static cim::ObjectPath path(const char *class_name = kClass) {
        return {"", kNamespace, class_name, {}};
    }

    velkhost::broker::MethodReply call(const std::string &method, const cim::NamedValues &in = {},
                                       const char *class_name = kClass) {
        return broker().invoke_method(path(class_name), method, in);
    }

    velkhost::broker::MethodReply install(const cim::NamedValues &in) {
        return call("InstallFromURI", in);
    }

    static cim::NamedValue uri(const std::string &text = "file:///pkgs/a.xml") {
        return {"URI", cim::Value::string(text)};
    }

    static cim::NamedValue options(const std::vector<std::uint16_t> &numbers) {
        cim::Value::Array elements;
        for (const std::uint16_t number : numbers) {
            elements.push_back(cim::Value::uint16(number));
        }
        return {"InstallOptions", cim::Value::array(CMPI_uint16, elements)};
    }
};

}  // namespace velktest
