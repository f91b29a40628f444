#include "host/unzip/plan.h"

#include <algorithm>
#include <string>
#include <unordered_map>

#include "host/unzip/failure.h"
#include "host/unzip/limits.h"

namespace velkhost::unzip {
namespace {

// The places that entries take. A file has its place for itself; folders may be named many times.
class Places {
  public:
    void take(const EntryName &name) {
        std::string path;
        for (std::size_t i = 0; i < name.parts.size(); ++i) {
            path += '/' + name.parts[i];
            take_one(path, name.folder || i + 1 < name.parts.size());
        }
    }

  private:
    void take_one(const std::string &path, bool folder) {
        const auto [place, added] = is_folder_.try_emplace(path, folder);
        if (!added && !(folder && place->second)) {
            throw Failure(kMinizipNameTwice);
        }
    }

    std::unordered_map<std::string, bool> is_folder_;
};

void check_kind(const Entry &entry, bool folder) {
    if (!entry.regular) {
        throw Failure(kMinizipNotAFile);
    }
    if (entry.encrypted) {
        throw Failure(kMinizipEncrypted);
    }
    if (entry.method != ZIP_CM_STORE && entry.method != ZIP_CM_DEFLATE) {
        throw Failure(kMinizipUnknownMethod);
    }
    if (folder && entry.size != 0) {
        throw Failure(kMinizipDamaged);
    }
}

// Sums up the unpacked sizes.
class Budget {
  public:
    explicit Budget(std::uint64_t archive_size)
        : left_(std::min(kMaxTotalSize, std::max(kSizeBelowRatio, archive_size * kMaxRatio))) {}

    void spend(std::uint64_t size) {
        if (size > left_) {
            throw Failure(kMinizipTooMuch);
        }
        left_ -= size;
    }

  private:
    std::uint64_t left_;
};

}  // namespace

std::vector<PlannedEntry> make_plan(const Archive &archive) {
    std::vector<PlannedEntry> plan;
    Places places;
    Budget budget(archive.file_size());
    for (std::uint64_t index = 0; index < archive.count(); ++index) {
        const Entry entry = archive.entry(index);
        EntryName name = read_entry_name(entry.name);
        check_kind(entry, name.folder);
        places.take(name);
        budget.spend(entry.size);
        plan.push_back({index, std::move(name)});
    }
    return plan;
}

}  // namespace velkhost::unzip
