// In which order the payloads of one adapter are installed.
#include "tests/unit/library/applicability_fixture.h"

namespace velktest {
namespace {

using Orders = std::vector<int>;

struct OrderCase {
    const char *name;
    Orders orders;         // of the payloads a, b, c, ... of the file
    const char *expected;  // how they come out
};

void PrintTo(const OrderCase &row, std::ostream *out) {
    *out << row.name;
}

// Payloads a, b, c, ... with these orders; a negative one stands for none.
std::string config_of(const Orders &orders) {
    std::vector<ConfigPayload> payloads;
    char name = 'a';
    for (const int order : orders) {
        payloads.push_back({std::string(1, name), {"ABCD"}, std::nullopt});
        if (order >= 0) {
            payloads.back().order = order;
        }
        ++name;
    }
    return payload_config(payloads);
}

class ApplicabilityOrder : public ApplicabilityTest {
  protected:
    // The names of what is to be installed, one letter each.
    std::string parsed(const Orders &orders) {
        write_config(config_of(orders));
        EXPECT_EQ(parse(), 1);
        std::string names;
        for (int i = 0; i < package().payloadnum; ++i) {
            names += package().PayloadDeviceIDArray[i].PayloadPath;
        }
        return names;
    }
};

class ApplicabilityOrderOf : public ApplicabilityOrder,
                             public ::testing::WithParamInterface<OrderCase> {};

TEST_P(ApplicabilityOrderOf, Payloads) {
    add_adapter("ABCD", "dev");
    EXPECT_EQ(parsed(GetParam().orders), GetParam().expected);
}

// Each place changes with the last later entry that stands behind a greater or equal one. That
// sorts what files usually hold, and leaves other orders as they come out.
INSTANTIATE_TEST_SUITE_P(
    Each, ApplicabilityOrderOf,
    ::testing::Values(OrderCase{"ThreeOneTwo", {3, 1, 2}, "bca"},
                      OrderCase{"ZeroFirstIsNotSorted", {0, 2, 1}, "abc"},
                      OrderCase{"NoneFirstIsNotSorted", {-1, 2, 1}, "abc"},
                      OrderCase{"ZeroLaterIsSorted", {2, 0}, "ba"}, OrderCase{"Single", {5}, "a"},
                      OrderCase{"Ascending", {1, 2, 3}, "abc"},
                      OrderCase{"PairDescending", {2, 1}, "ba"},
                      OrderCase{"PairOfEqualsChanges", {2, 2}, "ba"},
                      OrderCase{"ThreeEqualsTurn", {1, 1, 1}, "cab"},
                      OrderCase{"TwoThreeOne", {2, 3, 1}, "cab"},
                      OrderCase{"OneThreeTwoComesOutUnsorted", {1, 3, 2}, "cab"},
                      OrderCase{"FourDescending", {4, 3, 2, 1}, "dcba"},
                      OrderCase{"FiveDescending", {5, 4, 3, 2, 1}, "edcba"},
                      OrderCase{"TenDescending", {10, 9, 8, 7, 6, 5, 4, 3, 2, 1}, "jihgfedcba"}),
    [](const auto &about) { return std::string(about.param.name); });

TEST_F(ApplicabilityOrder, ScanStopsAfterTheTenthMatch) {
    add_adapter("ABCD", "dev");
    EXPECT_EQ(parsed(Orders(12, 0)), "abcdefghij");
    EXPECT_EQ(occurrences(log(), "found dfn match\n"), 10);
}

TEST_F(ApplicabilityOrder, PayloadsOfOtherAdaptersDoNotCountForTheTen) {
    add_adapter("ABCD", "dev");
    std::vector<ConfigPayload> payloads(30, {"other", {"WXYZ"}, 1});
    payloads.push_back({"fw", {"WXYZ", "ABCD"}, 1});
    write_config(payload_config(payloads));
    EXPECT_EQ(parse(), 1);
    EXPECT_THAT(to_install(), ::testing::ElementsAre("fw for dev"));
}

TEST_F(ApplicabilityOrder, EachAdapterHasItsOwn) {
    add_adapter("one", "d1");
    add_adapter("two", "d2");
    write_config(payload_config({{"a", {"one", "two"}, 3}, {"b", {"one"}, 1}, {"c", {"two"}, 2}}));
    EXPECT_EQ(parse(), 1);
    EXPECT_THAT(to_install(),
                ::testing::ElementsAre("b for d1", "a for d1", "c for d2", "a for d2"));
}

}  // namespace
}  // namespace velktest
