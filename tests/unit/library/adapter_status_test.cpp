// What the result of an install is reported as, for each family.
#include <ostream>

#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

enum class End { kResult, kNoPath, kCallFails };

struct StatusCase {
    const char *family;
    const char *name;
    End end;
    int result;          // of the vendor's service
    const char *report;  // null: the package keeps its status
};

void PrintTo(const StatusCase &row, std::ostream *out) {
    *out << row.family << " " << row.name;
}

constexpr const char *kDone = "50: Package installation successfully.";
constexpr const char *kError = "57: Package installation error happened.";
constexpr const char *kMissing = "55: The path or file does not exist.";
constexpr const char *kElxNoPath =
    "54: Error when create input parameter and the installation failed.";
constexpr const char *kElxTarget = "58: Unsupported target type.";
constexpr const char *kNoPath =
    "54: Error when Create Input Parameter and the installation failed.";
constexpr const char *kTarget = "58: Unsupported Target Type.";

// clang-format off
constexpr StatusCase kCases[] = {
    {"EmulexFc",  "Succeeds",        End::kResult,    0,    kDone},
    {"EmulexFc",  "ReturnsOne",      End::kResult,    1,    kElxNoPath},
    {"EmulexFc",  "NoPath",          End::kNoPath,    0,    kElxNoPath},
    {"EmulexFc",  "Unsupported",     End::kResult,    4097, kElxTarget},
    {"EmulexFc",  "NotAccessible",   End::kResult,    4107, kMissing},
    {"EmulexFc",  "JobStarted",      End::kResult,    4096, kError},
    {"EmulexFc",  "ReturnsTwo",      End::kResult,    2,    kError},
    {"EmulexFc",  "ReturnsNegative", End::kResult,    -1,   kError},
    {"EmulexFc",  "Returns4098",     End::kResult,    4098, kError},
    {"EmulexFc",  "CallFails",       End::kCallFails, 0,    kError},

    {"EmulexCna", "Succeeds",        End::kResult,    0,    kDone},
    {"EmulexCna", "ReturnsOne",      End::kResult,    1,    kElxNoPath},
    {"EmulexCna", "NoPath",          End::kNoPath,    0,    kElxNoPath},
    {"EmulexCna", "Unsupported",     End::kResult,    4097, kElxTarget},
    {"EmulexCna", "NotAccessible",   End::kResult,    4107, kMissing},
    {"EmulexCna", "JobStarted",      End::kResult,    4096, kError},
    {"EmulexCna", "ReturnsTwo",      End::kResult,    2,    kError},
    {"EmulexCna", "ReturnsNegative", End::kResult,    -1,   kError},
    {"EmulexCna", "CallFails",       End::kCallFails, 0,    kError},

    {"QlogicNic", "JobCompletes",    End::kResult,    0,    kDone},
    {"QlogicNic", "JobFails",        End::kResult,    1,    kNoPath},
    {"QlogicNic", "NoPath",          End::kNoPath,    0,    kNoPath},
    {"QlogicNic", "CallFails",       End::kCallFails, 0,    kNoPath},

    {"QlogicFc",  "JobCompletes",    End::kResult,    0,    kDone},
    {"QlogicFc",  "JobFails",        End::kResult,    1,    kNoPath},
    {"QlogicFc",  "NoPath",          End::kNoPath,    0,    kNoPath},
    {"QlogicFc",  "CallFails",       End::kCallFails, 0,    kNoPath},

    {"Brocade",   "Succeeds",        End::kResult,    0,    kDone},
    {"Brocade",   "ReturnsOne",      End::kResult,    1,    kNoPath},
    {"Brocade",   "NoPath",          End::kNoPath,    0,    kNoPath},
    {"Brocade",   "Unsupported",     End::kResult,    4097, kTarget},
    {"Brocade",   "NotAccessible",   End::kResult,    4107, kMissing},
    {"Brocade",   "JobStarted",      End::kResult,    4096, kError},
    {"Brocade",   "ReturnsTwo",      End::kResult,    2,    kError},
    {"Brocade",   "ReturnsNegative", End::kResult,    -1,   kError},
    {"Brocade",   "CallFails",       End::kCallFails, 0,    kError},

    {"Broadcom",  "Succeeds",        End::kResult,    0,    kDone},
    {"Broadcom",  "NoPath",          End::kNoPath,    0,    nullptr},
    {"Broadcom",  "Unsupported",     End::kResult,    4097, kTarget},
    {"Broadcom",  "NotAccessible",   End::kResult,    4107, kMissing},
    {"Broadcom",  "EndsWithTwo",     End::kResult,    2,    kError},
    {"Broadcom",  "EndsWithTwelve",  End::kResult,    12,   kError},
    {"Broadcom",  "EndsNegative",    End::kResult,    -1,   kError},
    {"Broadcom",  "CallFails",       End::kCallFails, 0,    kError},

    {"Lsi",       "Succeeds",        End::kResult,    0,    kDone},
    {"Lsi",       "ReturnsOne",      End::kResult,    1,    kNoPath},
    {"Lsi",       "NoPath",          End::kNoPath,    0,    kNoPath},
    {"Lsi",       "LevelIsCurrent",  End::kResult,    12,   "55: Current firmware level is equal or better for one or more controllers."},
    {"Lsi",       "NotApplicable",   End::kResult,    13,   "55: Package is not applicable for the selected LSI Controllers."},
    {"Lsi",       "Unsupported",     End::kResult,    4097, kTarget},
    {"Lsi",       "NotAccessible",   End::kResult,    4107, kMissing},
    {"Lsi",       "JobStarted",      End::kResult,    4096, kError},
    {"Lsi",       "ReturnsEleven",   End::kResult,    11,   kError},
    {"Lsi",       "ReturnsNegative", End::kResult,    -1,   kError},
    {"Lsi",       "CallFails",       End::kCallFails, 0,    kError},
};
// clang-format on

class AdapterStatus : public AdapterTest, public ::testing::WithParamInterface<StatusCase> {
  protected:
    void prepare(const AdapterFamily &family) {
        family.furnish(*this);
        switch (GetParam().end) {
            case End::kResult:
                family.end_with(*this, GetParam().result);
                break;
            case End::kNoPath:
                fail_service("broker.newObjectPath", family.service, CMPI_RC_ERR_FAILED);
                break;
            case End::kCallFails:
                vendor(family.service).answers["InstallFromURI"] = {
                    {.value = 0, .outputs = {}, .code = CMPI_RC_ERR_FAILED, .message = "busy"}};
                break;
        }
    }
};

TEST_P(AdapterStatus, IsReported) {
    const AdapterFamily &family = adapter_family(GetParam().family);
    prepare(family);
    const bool is_told = GetParam().report != nullptr;
    set_field(package().installResult, "as before");
    EXPECT_EQ(install(family.install), 0);
    EXPECT_STREQ(package().installResult,
                 is_told ? (std::string("adapter: ") + GetParam().report).c_str() : "as before");
    EXPECT_EQ(reports().size(), is_told ? 1U : 0U);
    EXPECT_FALSE(is_unpacked());
}

INSTANTIATE_TEST_SUITE_P(Result, AdapterStatus, ::testing::ValuesIn(kCases), [](const auto &about) {
    return std::string(about.param.family) + "_" + about.param.name;
});

}  // namespace
}  // namespace velktest
