#include "host/scenario/adapter_reader.h"

#include "host/scenario/adapter_family.h"
#include "host/scenario/service_reader.h"

#include <algorithm>
#include <utility>

namespace velkhost::scenario {
namespace {

std::string known_families() {
    std::string out;
    for (const FamilyTraits &traits : kFamilyTraits) {
        out += (out.empty() ? "" : ", ") + std::string(traits.name);
    }
    return out;
}

const FamilyTraits &read_family(TableReader &in) {
    const auto name = in.text("family");
    const auto *const found =
        name ? std::ranges::find(kFamilyTraits, *name, &FamilyTraits::name) : kFamilyTraits.end();
    if (found == kFamilyTraits.end()) {
        in.fail("family", std::string(name ? "is unknown" : "is missing") + "; known are " +
                              known_families());
    }
    return *found;
}

// The port ids under `key`, which only some families know.
std::vector<std::string> read_ports(TableReader &in, const char *key, bool known) {
    std::vector<std::string> ports;
    if (known) {
        assign(ports, in.texts(key));
    }
    for (const std::string &id : ports) {
        if (id.empty()) {
            in.fail(key, "must not hold an empty id");
        }
        if (std::ranges::count(ports, id) > 1) {
            in.fail(key, "names \"" + id + "\" twice");
        }
    }
    return ports;
}

Adapter read_adapter(TableReader &in) {
    const FamilyTraits &traits = read_family(in);
    Adapter out;
    out.family = traits.family;
    assign(out.name, in.text("name"));
    out.dfn = in.text("dfn");
    out.serial = in.text("serial");
    assign(out.firmware, in.text("firmware"));
    out.nic_ports = read_ports(in, "nic_ports", traits.has_nic_ports);
    out.fc_ports = read_ports(in, "fc_ports", traits.has_fc_ports);
    if (traits.family == AdapterFamily::kBrocade) {
        out.port_name = in.text("port_name");
    }
    if (traits.family == AdapterFamily::kEmulexCna) {
        assign(out.connectors, in.flag("connectors"));
        assign(out.card, in.flag("card"));
    }
    in.finish();
    return out;
}

bool share_a_port(const Adapter &a, const Adapter &b) {
    const auto share = [](const auto &ports, const auto &others) {
        return std::ranges::any_of(
            ports, [&](const auto &id) { return std::ranges::find(others, id) != others.end(); });
    };
    return a.family == b.family &&
           (share(a.nic_ports, b.nic_ports) || share(a.fc_ports, b.fc_ports));
}

// Ports are found again by their ids, so that no two of a family have the same.
void check_ports(TableReader &in, const std::vector<Adapter> &known, const Adapter &adapter) {
    for (const Adapter &other : known) {
        if (share_a_port(other, adapter)) {
            in.fail("family", "has an adapter with one of these ports already");
        }
    }
}

}  // namespace

void read_adapters(TableReader &root, Description &out) {
    if (auto tables = root.tables("adapter")) {
        for (TableReader &table : *tables) {
            Adapter adapter = read_adapter(table);
            check_ports(table, out.adapters, adapter);
            out.adapters.push_back(std::move(adapter));
        }
    }
    for (const FamilyTraits &traits : kFamilyTraits) {
        if (auto table = root.table(traits.name)) {
            out.adapter_answers.at(static_cast<std::size_t>(traits.family)) =
                read_service(*std::move(table), traits.service);
        }
    }
}

}  // namespace velkhost::scenario
