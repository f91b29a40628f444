#include "tests/support/depot_files.h"

#include <gtest/gtest.h>
#include <zip.h>

#include <utility>

#include "tests/support/files.h"

namespace velktest {
namespace {

namespace fs = std::filesystem;

std::string element(const std::string &name, const std::string &text) {
    return "  <" + name + ">" + text + "</" + name + ">\n";
}

void write_archive(const fs::path &file, const std::map<std::string, std::string> &entries) {
    fs::remove(file);
    zip_t *archive = zip_open(file.c_str(), ZIP_CREATE, nullptr);
    ASSERT_NE(archive, nullptr);
    for (const auto &[name, text] : entries) {
        zip_source_t *source = zip_source_buffer(archive, text.data(), text.size(), 0);
        ASSERT_GE(zip_file_add(archive, name.c_str(), source, 0), 0);
    }
    ASSERT_EQ(zip_close(archive), 0);
}

}  // namespace

std::string vib_text(const std::string &name, const std::string &version, const std::string &place,
                     const std::string &size) {
    return "<vib>\n" + element("name", name) + element("version", version) +
           element("relative-path", place) + element("packed-size", size) + "</vib>\n";
}

DepotFiles::DepotFiles(fs::path folder, const std::string &version) : folder_(std::move(folder)) {
    files["index.xml"] = element("indexfile", "vendor-index.xml");
    files["vendor-index.xml"] = element("url", "metadata.zip");
    metadata["bulletin.xml"] = element("id", "update");
    add_vib("base", version);
}

void DepotFiles::add_vib(const std::string &name, const std::string &version, std::size_t size) {
    const std::string place = "vib20/" + name + "/" + name + ".vib";
    files[place] = "!<arch>\n" + std::string(size - 8, 'x');
    metadata["vibs/" + name + ".xml"] = vib_text(name, version, place, std::to_string(size));
}

std::string DepotFiles::write() const {
    fs::remove_all(folder_);
    fs::create_directories(folder_);
    for (const auto &[place, text] : files) {
        write_file(folder_ / place, text);
    }
    write_archive(archive(), metadata);
    return "file://" + archive().string();
}

}  // namespace velktest
