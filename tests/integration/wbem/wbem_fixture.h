// velkhost serve as a process in a place of the test's own, and the client wbemcli.
#pragma once

#include "tests/integration/velkhost/fixture.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::testing {

class WbemTest : public VelkhostTest {
  protected:
    // Starts a host on a port of its own, with the default scenario unless the arguments name one.
    void serve(std::vector<std::string> arguments = {});

    // Tells it to end; how it ended.
    Finished stop(int signal = 15);

    // Stops a host that still runs, which must go well.
    void TearDown() override;

    [[nodiscard]] std::uint16_t port() const { return port_; }

    // "http://127.0.0.1:PORT/velk/cimv2" and the like.
    [[nodiscard]] std::string place(const std::string &name_space = "velk/cimv2") const;

    // Runs wbemcli to its end.
    Finished wbemcli(const std::vector<std::string> &arguments);

    // What it printed; a failure of the test when the exit code is not 0.
    std::string ask(const std::vector<std::string> &arguments);
    // What it complained of: "(6) CIM_ERR_NOT_FOUND: ..."; a failure when it did not.
    std::string complaint(const std::vector<std::string> &arguments);

    // The installation service, as an argument of wbemcli.
    std::string service();
    // InstallFromURI on it; `more` is put behind the location.
    std::vector<std::string> install_call(const std::string &location,
                                          const std::string &more = "");
    // A property of the job as a client reads it: "7", "\"text\"".
    std::string job_property(const std::string &id, const std::string &name);

    static constexpr const char *kService = ":PAKRO_VMpkgInstallationService";

    std::optional<Process> host_;

  private:
    std::uint16_t port_ = 0;
};

}  // namespace velkhost::testing
