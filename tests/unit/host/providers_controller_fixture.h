// Requests to the management controller's installation service and its jobs.
#pragma once

#include "providers_fixture.h"

#include <string>
#include <vector>

namespace velkhost::providers::testing {

class ControllerProvider : public ProviderTest {
  protected:
    ControllerProvider() { play(""); }

    static cim::ObjectPath service() {
        cim::ObjectPath path = path_of("ZEB_SoftwareInstallationService");
        path.keys = {{"SystemCreationClassName", cim::Value::string("ZEB_ManagementController")},
                     {"SystemName", cim::Value::string("ManagementController")},
                     {"CreationClassName", cim::Value::string("ZEB_SoftwareInstallationService")},
                     {"Name", cim::Value::string("RXCSoftwareInstallatiIonService")}};
        return path;
    }

    static cim::NamedValues arguments(const std::string &uri, std::uint8_t operation = 0,
                                      std::uint8_t reboot = 1) {
        return {{"URI", cim::Value::string(uri)},
                {"Update_Operation", cim::Value::uint8(operation)},
                {"reboot_option", cim::Value::uint8(reboot)}};
    }

    broker::MethodReply install(const cim::NamedValues &in) {
        return broker_.invoke_method(service(), "InstallFromURI", in);
    }

    // The path of the job that the install must have started.
    cim::ObjectPath start(const std::string &uri, std::uint8_t reboot = 1) {
        const broker::MethodReply reply = install(arguments(uri, 0, reboot));
        EXPECT_TRUE(reply.status.ok()) << reply.status.message;
        EXPECT_EQ(reply.return_value, cim::Value::uint32(4096));
        const cim::Value *job = reply.out.find("Job");
        if (job == nullptr || job->as_path() == nullptr) {
            ADD_FAILURE() << "no job";
            return {};
        }
        return *job->as_path();
    }

    // JobStatus of the next reads.
    std::vector<std::string> reads(const cim::ObjectPath &job, int count) {
        std::vector<std::string> out;
        for (int read = 0; read < count; ++read) {
            const broker::InstanceReply reply = broker_.get_instance(job);
            out.push_back(reply.instance ? text(reply.instance->properties, "JobStatus")
                                         : "(absent)");
        }
        return out;
    }
};

}  // namespace velkhost::providers::testing
