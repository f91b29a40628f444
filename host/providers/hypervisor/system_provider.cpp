// OMC_UnitaryComputerSystem: the systems that can be updated.
#include "host/providers/hypervisor/naming.h"
#include "host/providers/kit/export.h"

namespace velkhost::providers {
namespace {

class UnitaryComputerSystem final : public Provider {
  public:
    [[nodiscard]] const char *class_name() const override { return kSystemClass; }

    std::vector<Instance> instances() override {
        std::vector<Instance> out;
        for (const std::string &system : hypervisor_systems()) {
            out.push_back({system_keys(system), {}});
        }
        return out;
    }
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(OMC_UnitaryComputerSystemProvider,
                         velkhost::providers::UnitaryComputerSystem);
