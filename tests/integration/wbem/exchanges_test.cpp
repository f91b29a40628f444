// Stored exchanges, replayed against a host with the default scenario. A folder is one host.
#include "tests/integration/wbem/exchange.h"
#include "tests/integration/wbem/wbem_fixture.h"
#include "tests/unit/host/cimxml_client.h"

#include <algorithm>

namespace velkhost::testing {
namespace {

namespace fs = std::filesystem;

class WbemExchanges : public WbemTest, public ::testing::WithParamInterface<const char *> {
  protected:
    static std::vector<fs::path> files(const std::string &folder) {
        std::vector<fs::path> found;
        for (const auto &entry : fs::directory_iterator(fs::path(VELK_EXCHANGES_DIR) / folder)) {
            found.push_back(entry.path());
        }
        std::sort(found.begin(), found.end());
        return found;
    }
};

TEST_P(WbemExchanges, AnswersAreAsStored) {
    serve();
    const auto all = files(GetParam());
    ASSERT_GE(all.size(), 6U);
    for (const fs::path &file : all) {
        cimxml::testing::Client client(port());
        for (const Exchange &exchange : read_exchanges(file)) {
            client.send(exchange.request);
            const std::string answer = client.receive();
            EXPECT_TRUE(matches(exchange.answer, answer)) << file << "\n" << answer;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Folders, WbemExchanges,
                         ::testing::Values("associations", "classes", "http", "instances",
                                           "messages", "methods"));

TEST(WbemExchange, MatchingGoesByLinesAndStars) {
    EXPECT_TRUE(matches("a*c\nb\n", "abc\r\nb\n"));
    EXPECT_TRUE(matches("a*\n", "a\n"));
    EXPECT_FALSE(matches("a*c\n", "ac d\n"));
    EXPECT_FALSE(matches("aba*aba\n", "aba\n"));
    EXPECT_FALSE(matches("a\n", "a\nb\n"));
    EXPECT_FALSE(matches("a\nb\n", "a\n"));
}

}  // namespace
}  // namespace velkhost::testing
