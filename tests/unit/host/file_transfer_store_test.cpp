// The file store, and the ledger of what was brought there.
#include "host/providers/file_transfer/file_store.h"
#include "host/providers/file_transfer/transfer_ledger.h"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <cerrno>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <system_error>

namespace velkhost::providers {
namespace {

namespace fs = std::filesystem;

class TransferStore : public ::testing::Test {
  public:
    ~TransferStore() override { fs::remove_all(place_); }

  protected:
    TransferStore() {
        std::string name = (fs::temp_directory_path() / "velk-store-XXXXXX").string();
        place_ = ::mkdtemp(name.data());
    }
    [[nodiscard]] std::string folder() const { return (place_ / "store").string(); }
    static std::string content(const std::string &path) {
        std::ifstream in(path);
        return {std::istreambuf_iterator<char>(in), {}};
    }

    fs::path place_;
};

TEST_F(TransferStore, KeptFileStaysWithItsContent) {
    const FileStore store(folder(), std::nullopt);
    StoredFile file = store.create("a.xml");
    EXPECT_EQ(file.uri(), "file://" + folder() + "/a.xml");
    EXPECT_EQ(file.append(std::string_view("one ")), 0);
    EXPECT_EQ(file.append(std::string_view("two")), 0);
    EXPECT_EQ(file.keep(), 0);
    EXPECT_EQ(content(file.path()), "one two");
}

TEST_F(TransferStore, FileThatIsNotKeptGoesWithItsObject) {
    const FileStore store(folder(), std::nullopt);
    std::string path;
    {
        StoredFile file = store.create("a.xml");
        path = file.path();
        const StoredFile moved = std::move(file);
        EXPECT_TRUE(fs::exists(path));
    }
    EXPECT_FALSE(fs::exists(path));
}

TEST_F(TransferStore, FilesOfOneNameDoNotMeet) {
    const FileStore store(folder(), std::nullopt);
    StoredFile first = store.create("a.xml");
    StoredFile second = store.create("a.xml");
    EXPECT_EQ(second.path(), folder() + "/2-a.xml");
    EXPECT_EQ(first.keep(), 0);
    EXPECT_EQ(store.create("a.xml").path(), folder() + "/3-a.xml");
}

TEST_F(TransferStore, LinkInTheStoreIsNotFollowed) {
    fs::create_directories(folder());
    std::ofstream(place_ / "victim") << "mine";
    fs::create_symlink(place_ / "victim", fs::path(folder()) / "a.xml");
    const FileStore store(folder(), std::nullopt);
    EXPECT_EQ(store.create("a.xml").path(), folder() + "/2-a.xml");
    EXPECT_EQ(content(place_ / "victim"), "mine");
}

TEST_F(TransferStore, CapacityIsThatOfAllFiles) {
    const FileStore store(folder(), 10);
    StoredFile first = store.create("a");
    EXPECT_EQ(first.room(), 10U);
    EXPECT_EQ(first.append(std::string_view("1234567")), 0);
    StoredFile second = store.create("b");
    EXPECT_EQ(second.room(), 3U);
    EXPECT_EQ(second.append(std::string_view("1234")), ENOSPC);
    EXPECT_EQ(second.append(std::string_view("123")), 0);
    EXPECT_EQ(first.append(std::string_view("8")), ENOSPC);
    EXPECT_EQ(first.keep(), 0);
    fs::remove(first.path());
    EXPECT_EQ(second.room(), 7U);
}

TEST_F(TransferStore, FilledUpStoreHasNoRoom) {
    StoredFile file = FileStore(folder(), std::nullopt).create("a");
    EXPECT_GT(file.room(), 0U);
    file.fill_up();
    EXPECT_EQ(file.append(std::string_view("1")), ENOSPC);
    EXPECT_EQ(file.append({}), 0);
}

TEST_F(TransferStore, FolderThatCannotBeMadeIsAnError) {
    const FileStore store((place_ / "no/store").string(), std::nullopt);
    try {
        static_cast<void>(store.create("a"));
        FAIL();
    } catch (const std::system_error &error) {
        EXPECT_EQ(error.code(), std::errc::no_such_file_or_directory);
    }
}

TEST_F(TransferStore, LedgerDeletesWhatItKnowsOnce) {
    TransferLedger ledger({});
    StoredFile file = FileStore(folder(), std::nullopt).create("a");
    EXPECT_EQ(file.keep(), 0);
    EXPECT_EQ(ledger.remove(file.path()), TransferLedger::Outcome::kNotTransferred);
    ledger.add(file.path());
    EXPECT_EQ(ledger.remove(file.path()), TransferLedger::Outcome::kDeleted);
    EXPECT_FALSE(fs::exists(file.path()));
    EXPECT_EQ(ledger.remove(file.path()), TransferLedger::Outcome::kNotTransferred);
}

}  // namespace
}  // namespace velkhost::providers
