// TAVU_SoftwareInstallationService: has done its work when it returns.
#include "host/providers/kit/export.h"
#include "host/providers/kit/folder_service.h"

namespace velkhost::providers {
namespace {

// A return value of the service's own.
constexpr std::uint32_t kNotApplicable = 13;

class TavuService final : public FolderService {
  public:
    TavuService()
        : FolderService({.family = scenario::AdapterFamily::kLsi,
                         .class_name = "TAVU_SoftwareInstallationService",
                         .name = "TAVUSoftwareInstallationService",
                         .element_name = "Storage controller firmware update",
                         .system_class = "TAVU Provider",
                         .not_applicable = kNotApplicable}) {}

  protected:
    MethodResult install(const Args &in) override {
        std::string subject;
        const std::uint32_t obstacle = examine(in.text("URI"), subject);
        pass("install", subject);
        return obstacle == 0 ? plain_result(next_answer(subject)) : MethodResult{obstacle, {}};
    }
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(TAVU_SoftwareInstallationServiceProvider,
                         velkhost::providers::TavuService);
