// What all families share: the course of a package's install and what it leaves behind.
#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;
using Texts = std::vector<std::string>;

constexpr const char *kSuccess = "50: Package installation successfully.";
constexpr const char *kConfigFile = "/var/tmp/ZEB/Pakro/Package/image/payload.xml";

class AdapterFrame : public AdapterTest, public ::testing::WithParamInterface<AdapterFamily> {
  protected:
    static const AdapterFamily &family() { return GetParam(); }

    int run(int index = 0) { return install(family().install, index); }

    VendorClass &service() { return vendor(family().service); }

    // "adapter: ..." of the record, "" for a package that nothing was reported of.
    static std::string state() { return package().installResult; }

    static Texts report_if_any(const char *report) {
        return report == nullptr ? Texts{} : Texts{report};
    }
};

TEST_P(AdapterFrame, PayloadIsInstalledFromTheUnpackedFiles) {
    family().furnish(*this);
    bool was_unpacked = false;
    int flag = 0;
    service().on_call = [&] {
        was_unpacked = std::filesystem::exists(at(kConfigFile));
        flag = ga_is_thread_running;
    };
    EXPECT_EQ(run(), 0);
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
    EXPECT_EQ(state(), std::string("adapter: ") + kSuccess);
    EXPECT_TRUE(was_unpacked);
    EXPECT_EQ(flag, 1) << "whether or not a session was opened";
    EXPECT_EQ(ga_is_thread_running, 0);
    EXPECT_FALSE(is_unpacked());
    EXPECT_THAT(unzip().calls, ElementsAre("//pkgs/adapter.zip to /var/tmp/ZEB/Pakro/Package/"));
    EXPECT_EQ(logged(family().unpacked_line), 1);
}

TEST_P(AdapterFrame, WithoutAdaptersNothingIsUnpacked) {
    EXPECT_EQ(run(), family().no_adapter_result);
    if (family().no_adapter_report == nullptr) {
        EXPECT_EQ(unzip().calls.size(), 1U) << "adapters are the vendor's affair";
        return;
    }
    EXPECT_THAT(reports(), ElementsAre(family().no_adapter_report));
    EXPECT_THAT(unzip().calls, IsEmpty());
    EXPECT_EQ(logged("SMM"), 0);
    EXPECT_EQ(package().dfnnumber, 0);
}

TEST_P(AdapterFrame, FailedUnpackingEndsTheInstallOrIsOverlooked) {
    family().furnish(*this);
    unzip().result = -5;
    EXPECT_EQ(run(), 0);
    EXPECT_EQ(logged(family().unpacked_line), 0);
    EXPECT_EQ(logged("Minizip() failed: -5\n"), family().must_unpack ? 1 : 0);
    if (family().must_unpack) {
        EXPECT_EQ(state(), "");
        EXPECT_TRUE(log().ends_with("Minizip() failed: -5\n")) << "and nothing after it";
        EXPECT_TRUE(is_unpacked()) << "what came out of it stays";
        EXPECT_THAT(service().targets, IsEmpty());
    } else {
        EXPECT_THAT(reports(), ElementsAre(kSuccess)) << "the files that came out of it will do";
    }
}

TEST_P(AdapterFrame, WithoutAnUnzipLibraryItFailsLikeAnyUnpacking) {
    family().furnish(*this);
    unzip().place = UnzipDouble::Place::kNowhere;
    run();
    EXPECT_EQ(reports(), family().must_unpack ? Texts{} : report_if_any(family().matching));
    EXPECT_EQ(logged("Minizip() failed: -1\n"), family().must_unpack ? 1 : 0);
}

TEST_P(AdapterFrame, PackageOfAPathWithoutASlashCannotBeUnpacked) {
    family().furnish(*this);
    set_field(package().LocalPkgURI, "adapter.zip");
    run();
    EXPECT_EQ(reports(), family().must_unpack ? Texts{} : report_if_any(family().matching));
    EXPECT_EQ(logged("Effective path"), 0);
    EXPECT_THAT(unzip().calls, IsEmpty());
}

TEST_P(AdapterFrame, ArchiveWithoutAConfigurationMatchesNothing) {
    family().furnish(*this);
    unzip().files.erase("image/payload.xml");
    const bool ends = family().matching == nullptr;
    set_field(package().installResult, "as before");
    EXPECT_EQ(run(), 0);
    EXPECT_EQ(reports(), report_if_any(family().matching));
    EXPECT_EQ(is_unpacked(), ends) << "the unpacked files stay where the install ends at once";
    EXPECT_EQ(state() == "as before", ends);
    EXPECT_EQ(logged("SMM : start_update_option_firmware enter ."), ends ? 0 : 1);
    EXPECT_EQ(logged("parsePayloadDeviceIDArray() failed.\n"), family().must_unpack ? 1 : 0);
}

TEST_P(AdapterFrame, PayloadsForOtherAdaptersAreNotInstalled) {
    family().furnish(*this);
    offer({{"other.bin", {"DFN-B"}, 1}});
    package().payloadnum = 3;
    EXPECT_EQ(run(), 0);
    EXPECT_THAT(reports(), ElementsAre(family().nothing_report));
    EXPECT_EQ(logged("SMM : start_update_option_firmware enter ."), 1);
    EXPECT_FALSE(is_unpacked());
    if (family().no_adapter_report != nullptr) {
        EXPECT_THAT(service().targets, IsEmpty());
        EXPECT_EQ(package().payloadnum, 0);
    }
}

TEST_P(AdapterFrame, RemovalThatFailsHalfWayChangesNoStatus) {
    family().furnish(*this);
    fail_step(std::string("unlink:") + kConfigFile, EACCES);
    EXPECT_EQ(run(), family().returns_removal ? -2 : 0);
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
    EXPECT_TRUE(std::filesystem::exists(at(kConfigFile)));
    EXPECT_EQ(ga_is_thread_running, 0);
    EXPECT_EQ(logged("util_remove_file() failed.\n"), family().returns_removal ? 1 : 0);
    EXPECT_EQ(logged("util_remove_file successfully.\n"), 0);
    EXPECT_EQ(logged("util_remove_file() successfully.\n"), 0);
}

TEST_P(AdapterFrame, RemovalOfNothingIsToldByItsResult) {
    family().furnish(*this);
    service().on_call = [&] { std::filesystem::remove_all(at(kUnpackFolder)); };
    EXPECT_EQ(run(), family().returns_removal ? 1 : 0);
    EXPECT_THAT(reports(), ElementsAre(kSuccess));
}

TEST_P(AdapterFrame, RemovalIsToldOnceItIsDone) {
    family().furnish(*this);
    run();
    const bool tells = family().removed_line != nullptr;
    EXPECT_EQ(logged(tells ? family().removed_line : "util_remove_file"), tells ? 1 : 0);
}

TEST_P(AdapterFrame, FailedPayloadLeavesNothingBehind) {
    family().furnish(*this);
    family().end_with(*this, 2);
    EXPECT_EQ(run(), 0) << "the result is not the payload's";
    ASSERT_EQ(reports().size(), 1U);
    EXPECT_FALSE(reports()[0].starts_with("50:"));
    EXPECT_FALSE(is_unpacked());
    EXPECT_EQ(ga_is_thread_running, 0);
}

TEST_P(AdapterFrame, OtherPackagesAreLeftAlone) {
    family().furnish(*this);
    const std::string first = record_image(0);
    EXPECT_EQ(run(1), 0);
    EXPECT_EQ(record_image(0), first);
    EXPECT_STREQ(package(1).installResult, "second: 50: Package installation successfully.");
    EXPECT_THAT(unzip().calls, ElementsAre("//pkgs/second.zip to /var/tmp/ZEB/Pakro/Package/"));
}

TEST_P(AdapterFrame, SecondPackageDoesNotSeeTheFirst) {
    family().furnish(*this);
    EXPECT_EQ(run(0), 0);
    service().targets.clear();
    unzip().files.clear();
    offer({{"second.bin", {kDfn}, 1}});
    EXPECT_EQ(run(1), 0);
    EXPECT_STREQ(package(0).installResult, "adapter: 50: Package installation successfully.");
    EXPECT_STREQ(package(1).installResult, "second: 50: Package installation successfully.");
    const auto calls = up_calls();
    const auto installs = [&](const std::string &file) {
        return std::ranges::count_if(calls, [&](const std::string &call) {
            return call.find("Package/" + file + "\"") != std::string::npos;
        });
    };
    const bool takes_all = family().no_adapter_report == nullptr;
    EXPECT_EQ(installs(kPayload), takes_all ? 0 : 1);
    EXPECT_EQ(installs("second.bin"), takes_all ? 0 : 1);
    EXPECT_EQ(installs(""), takes_all ? 2 : 0) << "the vendor is given the folder";
}

TEST_P(AdapterFrame, IndexOutsideOfTheTableDoesNothing) {
    family().furnish(*this);
    const std::string before = session_image();
    for (const int index : {-1, velk::kMaxPackages}) {
        run(index);
    }
    EXPECT_EQ(session_image(), before);
    EXPECT_THAT(up_calls(), IsEmpty());
    EXPECT_THAT(unzip().calls, IsEmpty());
}

TEST_P(AdapterFrame, ProviderThatAnswersNothingIsNoSuccess) {
    family().furnish(*this);
    for (const char *step : {"broker.enumerateInstances", "broker.invokeMethod"}) {
        const bool enumerates = family().no_adapter_report != nullptr;
        broker().set_fault_hook([=](std::string_view asked, std::string_view) {
            const bool strikes = asked == step || (!enumerates && asked == "broker.invokeMethod");
            return strikes ? std::optional(velkhost::broker::Fault{6, ""}) : std::nullopt;
        });
        run();
    }
    ASSERT_EQ(reports().size(), 2U);
    for (const std::string &report : reports()) {
        EXPECT_FALSE(report.starts_with("50:")) << report;
    }
    EXPECT_FALSE(is_unpacked());
}

INSTANTIATE_TEST_SUITE_P(Each, AdapterFrame,
                         ::testing::ValuesIn(adapter_families().begin(), adapter_families().end()),
                         family_name);

}  // namespace
}  // namespace velktest
