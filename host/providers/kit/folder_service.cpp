#include "host/providers/kit/folder_service.h"

#include "host/providers/kit/local_file.h"
#include "host/providers/kit/naming.h"
#include "host/providers/kit/package_folder.h"
#include "host/providers/kit/step_fault.h"
#include "host/scenario/adapter_family.h"
#include "host/scenario/scenario.h"

#include <algorithm>

namespace velkhost::providers {

FolderService::FolderService(FolderServiceTraits traits)
    : InstallationService(traits.class_name, traits.element_name), traits_(traits) {}

// These services stand for the controller, not for the host.
std::vector<Property> FolderService::keys() const {
    return service_keys(traits_.system_class, "Management Controller", class_name(), traits_.name);
}

std::uint32_t FolderService::examine(const std::string &place, std::string &subject) const {
    subject = place;
    const auto package = PackageFolder::open(place);
    if (!package) {
        return kUriNotAccessible;
    }
    const std::vector<std::string> files = package->payloads_for(traits_.family);
    for (const std::string &file : files) {
        subject += ' ' + file;
    }
    if (files.empty()) {
        return traits_.not_applicable;
    }
    return std::ranges::all_of(files, is_readable_file) ? 0 : kUriNotAccessible;
}

scenario::ServiceAnswer FolderService::next_answer(const std::string &subject) const {
    return scenario::Scenario::current()->adapter_service(traits_.family).next(subject);
}

void FolderService::pass(const char *step, const std::string &subject) const {
    pass_step(scenario::name_of(traits_.family) + '.' + step, subject);
}

}  // namespace velkhost::providers
