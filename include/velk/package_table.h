// The package table: one record per package of the current request, in process-wide memory of
// fixed size. Every stage of an install reads and writes it by index; nothing is freed between
// requests, and a stage overwrites only what it owns.
#pragma once

#include <cmpi/cmpidt.h>

#include <cstddef>
#include <cstdint>

#include "velk/api.h"

namespace velk {

inline constexpr int kMaxPackages = 20;
inline constexpr int kMaxPrerequisites = 5;
inline constexpr int kMaxDevices = 50;
inline constexpr int kMaxPayloads = 100;
inline constexpr std::size_t kFieldSize = 200;

// Installs one package, `index` into `pkgInstance`; what the result means is the installer's own
// affair, the package's outcome is the status that it reports.
using Installer = int (*)(int index, const CMPIContext *context);

// What `PackageRecord::OrderFlag` holds: the lower, the earlier; from 999 on a reason to pass the
// package by.
namespace order_flag {
inline constexpr std::int32_t kUefi = 250;
inline constexpr std::int32_t kDiagnostics = 300;
inline constexpr std::int32_t kController = 350;
inline constexpr std::int32_t kFpga = 400;
inline constexpr std::int32_t kInitial = 450;
inline constexpr std::int32_t kPrerequisiteMissing = 999;
inline constexpr std::int32_t kRejected = 1000;
inline constexpr std::int32_t kUnsupportedType = 1001;
inline constexpr std::int32_t kDescriptorUnreadable = 1002;
}  // namespace order_flag

// An adapter found on the host: the identifier that payloads are matched on, and its CIM device id.
struct DfnDevice {
    char DFN[kFieldSize];
    char DeviceID[kFieldSize];
};

// A payload file to install and the device that it is for.
struct PayloadDevice {
    char PayloadPath[kFieldSize];
    char DeviceID[kFieldSize];
};

// One update package. Text fields hold terminated strings. The layout is part of the library's
// interface: tools read the table as it stands.
struct PackageRecord {
    char TFTPXMLPkgURIs[kFieldSize];      // descriptor, an element of the request's list
    char TFTPPayloadPkgURIs[kFieldSize];  // its directory, then with the payload's name appended
    char LocalPkgURI[kFieldSize];         // where the file fetched last can be read
    char installResult[kFieldSize];       // "<package id>: <code>: <message>"
    char manufacturer[kFieldSize];        // identificationCode up to its first "_"
    std::int32_t OrderFlag;
    std::int32_t prereqnum;
    char identificationCode[kFieldSize];
    char type[kFieldSize];  // "1" marks system firmware
    char Name[kFieldSize];
    char preReq[kMaxPrerequisites][kFieldSize];  // prerequisites and co-requisites alike
    char supersedes[kFieldSize];
    char category[kFieldSize];
    DfnDevice DFNDeviceIDArray[kMaxDevices];
    std::int32_t dfnnumber;
    PayloadDevice PayloadDeviceIDArray[kMaxPayloads];
    Installer installer;  // null when no installer fits
    std::int32_t payloadnum;
};

// Scratch of the payload applicability scan: the payloads that one adapter takes.
struct PayloadResult {
    std::int32_t order;
    char payload[1024];
};

}  // namespace velk

VELK_API velk::PackageRecord pkgInstance[velk::kMaxPackages];
VELK_API int pkgnum;                      // records in use, set when a list has been read
VELK_API int PkgSeq[velk::kMaxPackages];  // entry i: index of the i-th package to install
VELK_API velk::PayloadResult payload_result[10];

namespace velk {

// `pkgnum` as a loop bound: whatever a tool wrote there, the table is not left.
inline int package_count() {
    if (pkgnum < 0) {
        return 0;
    }
    return pkgnum < kMaxPackages ? pkgnum : kMaxPackages;
}

inline bool is_package_index(int index) {
    return index >= 0 && index < kMaxPackages;
}

}  // namespace velk
