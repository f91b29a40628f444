#include <exception>
#include <new>
#include <span>

#include "host/unzip/archive.h"
#include "host/unzip/failure.h"
#include "host/unzip/folder.h"
#include "host/unzip/plan.h"
#include "host/unzip/unzipfile.h"

namespace velkhost::unzip {
namespace {

void write_file(const Archive &archive, const PlannedEntry &entry, const Folder &directory) {
    const std::span<const std::string> parts(entry.name.parts);
    const Folder folder = directory.inside(parts.first(parts.size() - 1));
    NewFile file(folder);
    archive.read(entry.index, [&file](std::span<const char> bytes) { file.write(bytes); });
    file.complete(parts.back());
}

void unpack(const char *path, const char *directory_path) {
    const Archive archive(path);
    const auto plan = make_plan(archive);
    const Folder directory = Folder::at(directory_path);
    for (const PlannedEntry &entry : plan) {
        if (entry.name.folder) {
            static_cast<void>(directory.inside(entry.name.parts));
        } else {
            write_file(archive, entry, directory);
        }
    }
}

bool is_missing(const char *path) {
    return path == nullptr || *path == '\0';
}

}  // namespace
}  // namespace velkhost::unzip

int Minizip(const char *archive, const char *directory) noexcept {
    using velkhost::unzip::is_missing;
    if (is_missing(archive) || is_missing(directory)) {
        return kMinizipBadArgument;
    }
    try {
        velkhost::unzip::unpack(archive, directory);
        return kMinizipDone;
    } catch (const velkhost::unzip::Failure &failure) {
        return failure.result();
    } catch (const std::exception &) {  // of the standard library, which here only allocates
        return kMinizipNoMemory;
    }
}
