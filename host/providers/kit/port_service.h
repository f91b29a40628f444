// An installation service that writes one file to one port of an adapter. The vendors' services of
// that kind differ in names, in the options that they take, and in whether they start a job.
#pragma once

#include "host/providers/kit/installation_service.h"
#include "host/providers/kit/shared_while_used.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace velkhost::providers {

// What distinguishes such a service. All texts are literals.
struct PortServiceTraits {
    scenario::AdapterFamily family;
    const char *class_name;
    const char *name;  // the key
    const char *element_name;
    const char *system_class;  // of the service and of the ports
    const char *port_class;
    std::vector<std::string> scenario::Adapter::*ports;
    // InstallOptions that the service takes; empty: it has no such argument.
    std::vector<std::uint16_t> options = {};
    const char *job_class = nullptr;  // null: all is over when the call returns
};

class PortService : public InstallationService {
  public:
    explicit PortService(PortServiceTraits traits);

  protected:
    [[nodiscard]] std::vector<Property> keys() const override;
    MethodResult install(const Args &in) override;

  private:
    [[nodiscard]] bool takes_options(const Args &in) const;
    [[nodiscard]] bool has_port(const Path &target) const;
    MethodResult answer(const std::string &uri);

    PortServiceTraits traits_;
    std::shared_ptr<JobTable> jobs_ = shared_while_used<JobTable>();
};

}  // namespace velkhost::providers
