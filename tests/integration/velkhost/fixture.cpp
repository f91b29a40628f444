#include "tests/integration/velkhost/fixture.h"

#include <cstdlib>
#include <fstream>

namespace velkhost::testing {

namespace fs = std::filesystem;

void VelkhostTest::SetUp() {
    // Short, as locations of more than 199 bytes are cut; apart from TMPDIR, which is the run's.
    std::string pattern = "/tmp/velktest-XXXXXX";
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    place_ = pattern;
    fs::create_directory(place_ / "tmp");
}

void VelkhostTest::TearDown() {
    fs::remove_all(place_);
}

fs::path VelkhostTest::write_file(const std::string &name, const std::string &text) {
    const fs::path path = place_ / name;
    std::ofstream(path) << text;
    return path;
}

fs::path VelkhostTest::packages() {
    const fs::path folder = place_ / "p";
    if (!fs::exists(folder)) {
        fs::copy(VELK_PACKAGES_DIR, folder, fs::copy_options::recursive);
    }
    return folder;
}

std::string VelkhostTest::package(const std::string &name) {
    return "file://" + (packages() / (name + ".xml")).string();
}

std::vector<std::string> VelkhostTest::example_request(const std::string &list) {
    std::vector<std::string> uris;
    std::ifstream lines(VELK_EXAMPLES_DIR "/" + list + ".list");
    for (std::string line; std::getline(lines, line);) {
        if (!line.empty() && line[0] != '#') {
            uris.push_back(package(fs::path(line).replace_extension().string()));
        }
    }
    return uris;
}

std::string VelkhostTest::endless_scenario() {
    return write_file("endless.toml",
                      "[[management_controller.answer]]\n"
                      "job = [{ status = \"0x00|Initialization\" }]\n")
        .string();
}

std::vector<std::string> VelkhostTest::command(const std::vector<std::string> &arguments) const {
    std::vector<std::string> result = {VELKHOST_PROGRAM};
    result.insert(result.end(), arguments.begin(), arguments.end());
    return result;
}

Process::Environment VelkhostTest::environment() const {
    return {{"TMPDIR", (place_ / "tmp").string()},
            {"LC_ALL", "C.UTF-8"},
            {"TERM", "xterm-256color"},
            {"NO_COLOR", ""}};
}

Finished VelkhostTest::velkhost(const std::vector<std::string> &arguments) {
    return Process::on_pipes(command(arguments), environment()).wait();
}

nlohmann::json VelkhostTest::velkhost_json(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"install", "--json"});
    const Finished finished = velkhost(arguments);
    EXPECT_EQ(finished.err, "");
    const auto document = nlohmann::json::parse(finished.out, nullptr, false);
    EXPECT_FALSE(document.is_discarded()) << finished.out;
    if (!document.is_discarded()) {
        EXPECT_EQ(document["exit_code"], finished.exit_code);
    }
    return document;
}

std::vector<fs::path> VelkhostTest::run_folders() const {
    std::vector<fs::path> folders;
    for (const auto &entry : fs::directory_iterator(place_ / "tmp")) {
        folders.push_back(entry.path());
    }
    return folders;
}

}  // namespace velkhost::testing
