// The session globals and the layout of the package table, which tools read as it stands.

#include "tests/support/session.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <type_traits>

#include "velk/package_table.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace {

using velk::DfnDevice;
using velk::PackageRecord;
using velk::PayloadDevice;

// Taken before main, when nothing of the library has run.
const std::string kStateAtLoad = velktest::session_image();

constexpr bool kIs64Bit = sizeof(void *) == 8;

struct Field {
    const char *name;
    std::size_t offset;
    std::size_t expected;
};

}  // namespace

TEST(Session, EverythingIsZeroAtLoad) {
    EXPECT_EQ(kStateAtLoad.find_first_not_of('\0'), std::string::npos);
}

TEST(Session, ResetRestoresTheStateAtLoad) {
    for (const auto global : velktest::session_globals()) {
        std::ranges::fill(global, '\x5A');
    }
    EXPECT_EQ(velktest::session_image().find_first_not_of('\x5A'), std::string::npos);
    EXPECT_EQ(totalstatus, 0x5A5A5A5A);

    velktest::reset_session();

    EXPECT_EQ(velktest::session_image(), kStateAtLoad);
}

TEST(Session, TotalStatusIsWhatWasSetLast) {
    for (const int value : {1, -7, 0}) {
        set_totalstatus(value);
        EXPECT_EQ(totalstatus, value);
    }
    velktest::reset_session();
}

TEST(Session, MutexCanBeTakenWithoutBeingSetUp) {
    EXPECT_EQ(pthread_mutex_trylock(&mutex), 0);
    EXPECT_EQ(pthread_mutex_unlock(&mutex), 0);
}

TEST(Session, GlobalsHaveTheirSizes) {
    EXPECT_EQ(sizeof pkgInstance, 20 * sizeof(PackageRecord));
    EXPECT_EQ(sizeof PkgSeq, 20 * sizeof(int));
    EXPECT_EQ(sizeof payload_result, 10 * 1028U);
    EXPECT_EQ(sizeof instanceID, 40U);
    EXPECT_EQ(sizeof update_file_location, 4100U);
    EXPECT_EQ(sizeof(int), 4U);
}

TEST(PackageRecord, FieldsLieWhereToolsLookForThem) {
    static_assert(std::is_standard_layout_v<PackageRecord>);
    // clang-format off
    const Field fields[] = {
        {"TFTPXMLPkgURIs",       offsetof(PackageRecord, TFTPXMLPkgURIs),       0},
        {"TFTPPayloadPkgURIs",   offsetof(PackageRecord, TFTPPayloadPkgURIs),   200},
        {"LocalPkgURI",          offsetof(PackageRecord, LocalPkgURI),          400},
        {"installResult",        offsetof(PackageRecord, installResult),        600},
        {"manufacturer",         offsetof(PackageRecord, manufacturer),         800},
        {"OrderFlag",            offsetof(PackageRecord, OrderFlag),            1000},
        {"prereqnum",            offsetof(PackageRecord, prereqnum),            1004},
        {"identificationCode",   offsetof(PackageRecord, identificationCode),   1008},
        {"type",                 offsetof(PackageRecord, type),                 1208},
        {"Name",                 offsetof(PackageRecord, Name),                 1408},
        {"preReq",               offsetof(PackageRecord, preReq),               1608},
        {"supersedes",           offsetof(PackageRecord, supersedes),           2608},
        {"category",             offsetof(PackageRecord, category),             2808},
        {"DFNDeviceIDArray",     offsetof(PackageRecord, DFNDeviceIDArray),     3008},
        {"dfnnumber",            offsetof(PackageRecord, dfnnumber),            23008},
        {"PayloadDeviceIDArray", offsetof(PackageRecord, PayloadDeviceIDArray), 23012},
        {"installer",            offsetof(PackageRecord, installer),            kIs64Bit ? 63016 : 63012},
        {"payloadnum",           offsetof(PackageRecord, payloadnum),           kIs64Bit ? 63024 : 63016},
        {"end",                  sizeof(PackageRecord),                         kIs64Bit ? 63032 : 63020},
    };
    // clang-format on
    for (const Field &field : fields) {
        EXPECT_EQ(field.offset, field.expected) << field.name;
    }
}

TEST(PackageRecord, DeviceAndPayloadEntriesAreTwoTextsEach) {
    EXPECT_EQ(offsetof(DfnDevice, DFN), 0U);
    EXPECT_EQ(offsetof(DfnDevice, DeviceID), 200U);
    EXPECT_EQ(sizeof(DfnDevice), 400U);
    EXPECT_EQ(offsetof(PayloadDevice, PayloadPath), 0U);
    EXPECT_EQ(offsetof(PayloadDevice, DeviceID), 200U);
    EXPECT_EQ(sizeof(PayloadDevice), 400U);
    EXPECT_EQ(offsetof(velk::PayloadResult, order), 0U);
    EXPECT_EQ(offsetof(velk::PayloadResult, payload), 4U);
}
