#include "catalog/descriptor.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/file_io.h"
#include "velk/package_table.h"
#include "velk/status_report.h"

namespace velk {
namespace {

// A line read at the level of the file and one read inside a property, with terminators.
constexpr std::size_t kFileLineSize = 20480;
constexpr std::size_t kPropertyLineSize = 1024;

constexpr std::string_view kFileScheme = "file:/";

// One descriptor while it is read. `line` holds the line that was read last, or what was made of
// it; the header comparisons always look at it.
struct Descriptor {
    LineReader &reader;
    PackageRecord &package;
    std::span<char> line;

    [[nodiscard]] bool next_property_line() const {
        if (!reader.next(line.first(kPropertyLineSize))) {
            return false;
        }
        trimXMLString(line.data());
        return true;
    }

    // The value on the next line; empty where the file ends.
    [[nodiscard]] std::string_view next_value() const {
        if (!next_property_line()) {
            copy(line, {});
        }
        getXmlTagData(line.data());
        return view(line);
    }
};

template <auto Field>
void read_field(Descriptor &descriptor) {
    copy(descriptor.package.*Field, descriptor.next_value());
}

void read_payload(Descriptor &descriptor) {
    append(descriptor.package.TFTPPayloadPkgURIs, descriptor.next_value());
}

// Each array is stored from the first entry on, while `prereqnum` goes on counting: a second array
// overwrites values of the first, and both count.
void read_prerequisites(Descriptor &descriptor) {
    if (!descriptor.next_property_line() || view(descriptor.line) != "<VALUE.ARRAY>") {
        return;
    }
    for (auto &entry : descriptor.package.preReq) {
        if (!descriptor.next_property_line()) {
            return;
        }
        log_format("%s\n", descriptor.line.data());
        if (view(descriptor.line) == "</VALUE.ARRAY>") {
            return;
        }
        getXmlTagData(descriptor.line.data());
        copy(entry, view(descriptor.line));
        ++descriptor.package.prereqnum;
    }
}

struct Property {
    std::string_view header;
    void (*read)(Descriptor &descriptor);
};

// clang-format off
constexpr std::array kProperties = {
    Property{R"(<PROPERTY NAME="Name" TYPE="string">)",               read_field<&PackageRecord::Name>},
    Property{R"(<PROPERTY NAME="type" TYPE="uint16">)",               read_field<&PackageRecord::type>},
    Property{R"(<PROPERTY NAME="category" TYPE="string">)",           read_field<&PackageRecord::category>},
    Property{R"(<PROPERTY.ARRAY NAME="preReq" TYPE="string">)",       read_prerequisites},
    Property{R"(<PROPERTY.ARRAY NAME="coReq" TYPE="string">)",        read_prerequisites},
    Property{R"(<PROPERTY NAME="payload" TYPE="string">)",            read_payload},
    Property{R"(<PROPERTY NAME="identificationCode" TYPE="string">)", read_field<&PackageRecord::identificationCode>},
    Property{R"(<PROPERTY NAME="supersedes" TYPE="string">)",         read_field<&PackageRecord::supersedes>},
};

struct CategoryOrder {
    std::string_view category;
    std::int32_t flag;
};

constexpr std::array kSystemFirmwareOrder = {
    CategoryOrder{"RXC",         order_flag::kController},
    CategoryOrder{"RXC2",        order_flag::kController},
    CategoryOrder{"UEFI",        order_flag::kUefi},
    CategoryOrder{"FPGA",        order_flag::kFpga},
    CategoryOrder{"Diagnostics", order_flag::kDiagnostics},
};
// clang-format on

std::int32_t derive_order_flag(const PackageRecord &package) {
    if (view(package.type) != "1") {
        return order_flag::kUnsupportedType;
    }
    const auto *row = std::find_if(kSystemFirmwareOrder.begin(), kSystemFirmwareOrder.end(),
                                   [&](const CategoryOrder &candidate) {
                                       return candidate.category == view(package.category);
                                   });
    return row == kSystemFirmwareOrder.end() ? order_flag::kDiagnostics : row->flag;
}

void read_properties(LineReader &reader, PackageRecord &package) {
    char line[kFileLineSize];
    Descriptor descriptor{reader, package, line};
    while (reader.next(line)) {
        trimXMLString(line);
        for (const Property &property : kProperties) {
            if (view(line) == property.header) {
                property.read(descriptor);
            }
        }
    }
}

void log_package(const PackageRecord &package) {
    log_value("Package Name:", view(package.Name));
    log_value("Package Type:", view(package.type));
    log_value("Package payload URI:", view(package.TFTPPayloadPkgURIs));
    log_value("Package identificationCode:", view(package.identificationCode));
    log_value("Package supersedes:", view(package.supersedes));
    log_value("Package OrderFlag:", package.OrderFlag);
    log_entry("preReq package:");
    for (int i = 0; i < std::min(package.prereqnum, kMaxPrerequisites); ++i) {
        debug(package.preReq[i]);
        debug(" ");
    }
    debug("\n");
    log_value("Package manufacturer:", view(package.manufacturer));
    log_value("Package category:", view(package.category));
}

// The descriptor's path, with the scheme and its first slash dropped, or null where the location
// is not a local one.
const char *local_path(const PackageRecord &package) {
    const std::string_view location = view(package.LocalPkgURI);
    return location.starts_with(kFileScheme) ? package.LocalPkgURI + kFileScheme.size() : nullptr;
}

void reject_descriptor(int index) {
    update_Pkg_Install_status(index, status_code::kDescriptorUnreadable,
                              "Pakcage XML can't be opened.");
    pkgInstance[index].OrderFlag = order_flag::kDescriptorUnreadable;
}

}  // namespace
}  // namespace velk

void getPkgAssociation(int idx) {
    using namespace velk;
    log_entry("Enter getPkgAssociation.\n");
    if (!is_package_index(idx)) {
        return;
    }
    PackageRecord &package = pkgInstance[idx];
    const char *path = local_path(package);
    if (path == nullptr) {
        reject_descriptor(idx);
        return;
    }
    log_value("Open file ", path);
    LineReader reader(path);
    if (!reader.is_open()) {
        reject_descriptor(idx);
        return;
    }
    read_properties(reader, package);
    package.OrderFlag = derive_order_flag(package);
    const std::string_view code = view(package.identificationCode);
    copy(package.manufacturer, code.substr(0, code.find('_')));
    log_package(package);
    log_entry("Complete getPkgAssociation.\n");
}
