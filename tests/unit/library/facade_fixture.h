// What the two families have in common whose services take the whole unpacked folder.
#pragma once

#include "installers/facade_update.h"
#include "tests/unit/library/adapter_families.h"

namespace velktest {

class FacadeTest : public AdapterTest {
  protected:
    // The result of a function of the library's, called in a request.
    template <class Call>
    int result_of(Call call) {
        int result = -1;
        in_request([&](const CMPIContext *context) { result = call(context); });
        return result;
    }

    // Of a package, up to its payload's first line.
    static std::string way_to_payload_log(const char *enter_line) {
        return entry(enter_line) + entry("tmpDestinationPath = file:///pkgs/adapter.zip\n") +
               entry("Effective path: //pkgs/adapter.zip\n") + entry("minizip successfully.\n") +
               entry("before install the payload.\n") + no_session_log();
    }

    // Of a payload, from the service's path to its answer.
    static std::string call_log(const std::string &service, const std::string &folder, int value) {
        return entry("Create " + service + " successfully.\n") + entry("To install package...") +
               folder + "\n" +
               entry("Invoking InstallFromURI Method and updating flash image. Please wait...\n") +
               entry("CBInvokeMethod Retcode:" + std::to_string(value) + "\n");
    }
};

}  // namespace velktest
