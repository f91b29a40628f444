#include "catalog/classification.h"

#include <array>
#include <string_view>

#include "installers/ESW_update.h"
#include "installers/Emulex_update.h"
#include "installers/Qlogic_update.h"
#include "installers/Vmware_ESXi_update.h"
#include "installers/brocade_update.h"
#include "installers/facade_update.h"
#include "velk/bounded_text.h"
#include "velk/debug_log.h"

namespace velk {
namespace {

using Test = bool (*)(const PackageRecord &package, std::string_view keyword);

bool category_is(const PackageRecord &package, std::string_view keyword) {
    return view(package.category) == keyword;
}

bool name_contains(const PackageRecord &package, std::string_view keyword) {
    return view(package.Name).find(keyword) != std::string_view::npos;
}

bool name_begins(const PackageRecord &package, std::string_view keyword) {
    return view(package.Name).starts_with(keyword);
}

bool name_begins_and_is_fibre(const PackageRecord &package, std::string_view keyword) {
    return name_begins(package, keyword) && category_is(package, "Fibre");
}

struct Rule {
    Test test;
    std::string_view keyword;
    Installer installer;
};

// The first rule that fits decides. Categories come before names, so that a disk or RAID package
// of an adapter maker goes to the LSI service.
// clang-format off
constexpr std::array kRules = {
    Rule{category_is,              "UEFI",            installESWPkg},
    Rule{category_is,              "RXC",             installESWPkg},
    Rule{category_is,              "FPGA",            installESWPkg},
    Rule{category_is,              "Diagnostics",     installESWPkg},
    Rule{category_is,              "RXC2",            installESWPkg},
    Rule{category_is,              "Hard Disk Drive", installLSIPkg},
    Rule{category_is,              "SAS",             installLSIPkg},
    Rule{category_is,              "Kestroval",       installLSIPkg},
    Rule{name_contains,            "Broadcom",        installBroadcomPkg},
    Rule{name_begins,              "VMware",          installVMPkg},
    Rule{name_begins_and_is_fibre, "Emulex",          installElxFCPkg},
    Rule{name_begins,              "Emulex",          installElxCNAPkg},
    Rule{name_begins,              "QLogic",          installQlgPkg},
    Rule{name_begins,              "Qlogic",          installQlgPkg},
    Rule{name_contains,            "FC3172",          installQlgPkg},
    Rule{name_contains,            "FC5172",          installQlgPkg},
    Rule{name_begins,              "Brocade",         installBrocadePkg},
};
// clang-format on

}  // namespace
}  // namespace velk

void getPkgProviderName(int idx) {
    if (!velk::is_package_index(idx)) {
        return;
    }
    velk::PackageRecord &package = pkgInstance[idx];
    package.installer = nullptr;
    for (const velk::Rule &rule : velk::kRules) {
        if (rule.test(package, rule.keyword)) {
            package.installer = rule.installer;
            return;
        }
    }
}

int DeployUpdate(int idx, const CMPIContext *context) {
    velk::log_entry("Begin to Deploy.\n");
    getPkgProviderName(idx);
    if (!velk::is_package_index(idx) || pkgInstance[idx].installer == nullptr) {
        return -1;
    }
    return pkgInstance[idx].installer(idx, context);
}
