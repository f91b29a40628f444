// Registration files: what is read, and what is wrong with them.
#include "host/broker/registration.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace velkhost::broker {
namespace {

std::string error_of(const std::string &text) {
    return parse_registration(text, "reg").error;
}

constexpr char kComplete[] =
    "[Test_Service]\n"
    "   provider: Test_Provider\n"
    "   location: testprovider\n"
    "   type: instance Method\n"
    "   namespace: test/cimv2 root/cimv2\n"
    "#\n";

TEST(BrokerRegistration, ReadsASection) {
    const RegistrationFile file = parse_registration(kComplete, "reg");
    EXPECT_EQ(file.error, "");
    ASSERT_EQ(file.entries.size(), 1U);
    const Registration &entry = file.entries[0];
    EXPECT_EQ(entry.class_name, "Test_Service");
    EXPECT_EQ(entry.provider, "Test_Provider");
    EXPECT_EQ(entry.location, "testprovider");
    EXPECT_TRUE(entry.kinds.has(ProviderKind::kInstance));
    EXPECT_TRUE(entry.kinds.has(ProviderKind::kMethod));
    EXPECT_FALSE(entry.kinds.has(ProviderKind::kAssociation));
    EXPECT_EQ(entry.namespaces, (std::vector<std::string>{"test/cimv2", "root/cimv2"}));
    EXPECT_FALSE(entry.never_unload);
}

TEST(BrokerRegistration, ReadsOptionalEntriesAndSeveralSections) {
    const RegistrationFile file =
        parse_registration(std::string(kComplete) +
                               "[ Other ]\r\n\tprovider:P\r\n\tlocation:l\r\n"
                               "# a comment\r\n\ttype:association indication property\r\n"
                               "\tnamespace:n\r\n\tunload: never\r\n\tgroup: g\r\n"
                               "\tuser: u\r\n\tparameters: a b: c",
                           "reg");
    EXPECT_EQ(file.error, "");
    ASSERT_EQ(file.entries.size(), 2U);
    const Registration &entry = file.entries[1];
    EXPECT_EQ(entry.class_name, "Other");
    EXPECT_TRUE(entry.never_unload);
    EXPECT_EQ(entry.group, "g");
    EXPECT_EQ(entry.user, "u");
    EXPECT_EQ(entry.parameters, "a b: c");
    EXPECT_TRUE(entry.kinds.has(ProviderKind::kIndication));
}

TEST(BrokerRegistration, EmptyFileRegistersNothing) {
    EXPECT_EQ(error_of(""), "");
    EXPECT_EQ(error_of("# nothing\n\n"), "");
    EXPECT_TRUE(parse_registration("", "reg").entries.empty());
}

TEST(BrokerRegistration, ErrorsNameFileAndLine) {
    EXPECT_EQ(error_of("provider: P\n"), "reg:1: an entry stands in front of the first [Class]");
    EXPECT_EQ(error_of("\n[C\n"), "reg:2: a class name stands in brackets: [Class]");
    EXPECT_EQ(error_of("[]\n"), "reg:1: a class name stands in brackets: [Class]");
    EXPECT_EQ(error_of("["), "reg:1: a class name stands in brackets: [Class]");
    EXPECT_EQ(error_of("[C]\nprovider\n"),
              "reg:2: expected [Class] or \"key: value\", found \"provider\"");
    EXPECT_EQ(error_of("[C]\nprovider:\n"), "reg:2: \"provider\" has no value");
    EXPECT_EQ(error_of("[C]\nuser: a\nuser: b\n"), "reg:3: \"user\" stands twice in this section");
    EXPECT_EQ(error_of("[C]\ncolour: red\n"), "reg:2: unknown key \"colour\"");
    EXPECT_EQ(error_of("[C]\ntype: instance metod\n"), "reg:2: unknown provider type \"metod\"");
    EXPECT_EQ(error_of("[C]\nunload: sometimes\n"), "reg:2: unload can only be \"never\"");
}

TEST(BrokerRegistration, EveryRequiredEntryIsMissed) {
    const std::string lines[] = {"provider: P\n", "location: l\n", "type: method\n",
                                 "namespace: n\n"};
    const char *const keys[] = {"provider", "location", "type", "namespace"};
    for (std::size_t left_out = 0; left_out < 4; ++left_out) {
        std::string text = "\n[C]\n";
        for (std::size_t i = 0; i < 4; ++i) {
            text += i == left_out ? "" : lines[i];
        }
        EXPECT_EQ(error_of(text), std::string("reg:2: [C] has no \"") + keys[left_out] + '"');
    }
}

TEST(BrokerRegistration, NothingIsRegisteredFromAFileWithAnError) {
    const RegistrationFile file = parse_registration(std::string(kComplete) + "[Other]\n", "reg");
    EXPECT_NE(file.error, "");
    EXPECT_TRUE(file.entries.empty());
}

TEST(BrokerRegistration, UnreadableFileIsNamed) {
    const RegistrationFile file = read_registration("/no/such/file");
    EXPECT_EQ(file.error.find("/no/such/file: cannot be read: "), 0U) << file.error;
}

}  // namespace
}  // namespace velkhost::broker
