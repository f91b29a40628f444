// Which Emulex adapters this host has.
#include <algorithm>
#include <array>
#include <span>
#include <string_view>

#include "installers/Emulex_update.h"
#include "installers/adapter_service.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"

namespace velk::emulex {
namespace {

using adapter::text_or_empty;

constexpr const char *kNamespace = "root/emulex";

// The identifiers of the adapters that have been walked: the ports of one adapter share theirs.
class WalkedAdapters {
  public:
    // False for an identifier that is known already, and when the list is full.
    bool add(std::string_view text) {
        const Text<kIdentifierSize> identifier(text);
        const auto known = std::span(identifiers_).first(count_);
        const bool seen = std::any_of(known.rbegin(), known.rend(), [&](const auto &entry) {
            return view(entry.c_str()) == view(identifier.c_str());
        });
        if (seen || count_ == identifiers_.size()) {
            return false;
        }
        identifiers_[count_++] = identifier;
        return true;
    }

  private:
    static constexpr std::size_t kIdentifierSize = 256;

    std::array<Text<kIdentifierSize>, kMaxDevices> identifiers_;
    std::size_t count_ = 0;
};

void add_card(PackageRecord &package, const CMPIInstance *card, const CMPIInstance *port) {
    log_entry("ELXUCNA_Card instance found.\n");
    const adapter::TrimmedDfn dfn("elx", cim::text_of(cim::property(card, "PartNumber")));
    const char *device = text_or_empty(cim::text_of(cim::property(port, "DeviceID")));
    if (adapter::add_device(package, dfn.view(), device)) {
        log_format("DFN = %s, DeviceID = %s\n", dfn.view().data(), device);
    }
}

// The cards that contain the connector of a port.
void walk_connector(PackageRecord &package, const CMPIContext *context,
                    const CMPIInstance *connector, const CMPIInstance *port) {
    log_entry("ELXUCNA_PhysicalConnector instance found.\n");
    const auto cards = cim::Instances::associated(context, cim::path_of(connector), "CIM_Container",
                                                  "ELXUCNA_Card");
    if (!cards.is_valid()) {
        log_entry("Association to ELXUCNA_Card returned NULL.\n");
        return;
    }
    bool is_empty = true;
    for (const CMPIInstance *card : cards) {
        is_empty = false;
        add_card(package, card, port);
    }
    if (is_empty) {
        log_entry("Association to ELXUCNA_Card returned empty result.\n");
    }
}

void walk_adapter(PackageRecord &package, const CMPIContext *context, const CMPIInstance *port) {
    const auto connectors = cim::Instances::associated(context, cim::path_of(port), "CIM_Realizes",
                                                       "ELXUCNA_PhysicalConnector");
    if (!connectors.is_valid()) {
        log_entry("Association to ELXUCNA_PhysicalConnector returned NULL.\n");
        return;
    }
    for (const CMPIInstance *connector : connectors) {
        walk_connector(package, context, connector, port);
    }
}

void walk_ports(PackageRecord &package, const CMPIContext *context) {
    const auto ports =
        cim::Instances::of(context, cim::make_path(kNamespace, "ELXUCNA_EthernetPort"));
    if (!ports.is_valid()) {
        log_entry("enumerateInstances() returns NULL.\n");
        return;
    }
    log_entry("enumerateInstances() returns NOT NULL.\n");
    WalkedAdapters walked;
    for (const CMPIInstance *port : ports) {
        log_format("ELXUCNA_EthernetPort.InstanceID = %s\n",
                   text_or_empty(cim::text_of(cim::property(port, "InstanceID"))));
        const char *identifier =
            cim::text_of(cim::element(cim::property(port, "OtherIdentifyingInfo"), 0));
        log_format("ELXUCNA_EthernetPort.OtherIdentifyingInfo[0] = %s\n",
                   text_or_empty(identifier));
        if (identifier != nullptr && walked.add(identifier)) {
            walk_adapter(package, context, port);
        }
    }
}

void add_vital_product_data(PackageRecord &package, const CMPIInstance *data) {
    const char *dfn = cim::text_of(cim::property(data, "FieldV2"));
    const char *device = cim::text_of(cim::property(data, "InstanceID"));
    if (dfn != nullptr && device != nullptr && adapter::add_device(package, dfn, device)) {
        log_format("DFN = %s, DeviceID = %s\n", dfn, device);
    }
}

}  // namespace
}  // namespace velk::emulex

void get_elxfc_dfn_devid(int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("--> get_elxfc_dfn_devid.\n");
    if (!is_package_index(idx)) {
        return;
    }
    PackageRecord &package = pkgInstance[idx];
    package.dfnnumber = 0;
    const auto records =
        cim::Instances::of(context, cim::make_path(emulex::kNamespace, "ELXHBA_VitalProductData"));
    if (!records.is_valid()) {
        log_entry("enumerateInstances() returns NULL.\n");
        return;
    }
    for (const CMPIInstance *record : records) {
        emulex::add_vital_product_data(package, record);
    }
    log_entry("<-- get_elxfc_dfn_devid.\n");
}

void get_elxcna_dfn_devid(int idx, const CMPIContext *context) {
    using namespace velk;
    log_entry("--> get_elxcna_dfn_devid\n");
    if (!is_package_index(idx)) {
        return;
    }
    PackageRecord &package = pkgInstance[idx];
    package.dfnnumber = 0;
    emulex::walk_ports(package, context);
    log_untimed("\npkgInstance[pkg_idx].dfnnumber = ", package.dfnnumber);
    log_entry("<-- get_elxcna_dfn_devid\n");
}
