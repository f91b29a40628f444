// The longest request that there is, 20 packages of every kind: what each of them went through, and
// every call that the library made of other providers, in their order. Compared with the files in
// tests/data/everything, line by line.
#include "host/rig/rig.h"
#include "host/rig/text_file.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <fstream>
#include <sstream>

namespace velkhost::rig::testing {
namespace {

namespace fs = std::filesystem;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using Lines = std::vector<std::string>;

constexpr std::chrono::hours kDay(24);

Lines lines_of(const std::string &text) {
    Lines lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);) {
        lines.push_back(line);
    }
    return lines;
}

// The names of the request's descriptors, in its order.
Lines request() {
    Lines names = lines_of(read_text_file(VELK_EXAMPLES_DIR "/everything.list").value_or(""));
    std::erase_if(names, [](const std::string &line) { return line.starts_with('#'); });
    return names;
}

// Where two lists differ first; empty when nowhere. What came is left in a file.
std::string difference(const std::string &name, const Lines &came) {
    const Lines wanted =
        lines_of(read_text_file(VELK_EVERYTHING_DIR "/" + name + ".txt").value_or(""));
    const auto [one, other] = std::ranges::mismatch(wanted, came);
    if (one == wanted.end() && other == came.end()) {
        return "";
    }
    const fs::path file = fs::path(::testing::TempDir()) / ("everything-" + name + ".txt");
    std::ofstream out(file);
    for (const std::string &line : came) {
        out << line << '\n';
    }
    return "line " + std::to_string(one - wanted.begin() + 1) +
           "\nwanted: " + (one == wanted.end() ? "the end" : *one) +
           "\ncame:   " + (other == came.end() ? "the end" : *other) +
           "\nall of it: " + file.string();
}

class Everything : public ::testing::Test {
  protected:
    Everything() : packages_(RunFolder::make_temporary()) {
        fs::copy(VELK_PACKAGES_DIR, packages_.path(), fs::copy_options::recursive);
    }

    void install() {
        Lines uris;
        for (const std::string &name : request()) {
            uris.push_back("file://" + (packages_.path() / name).string());
        }
        EXPECT_EQ(rig_.install({.uris = uris}).return_value, 4096U);
        EXPECT_TRUE(rig_.wait_until_idle(kDay));
    }

    // Each report of a package, with its time, as the debug log has them: the status file is cut.
    Lines history() {
        Lines out;
        for (const std::string &line :
             lines_of(read_text_file(rig_.folder().inside("/tmp/velkdebug.txt")).value_or(""))) {
            if (is_report(line)) {
                const auto begin = line.rfind("] ") + 2;
                out.push_back(line.substr(begin - kTime, kTime) + line.substr(begin));
            }
        }
        return out;
    }

    // What the library asked of other providers, with the packages' folder named by one word.
    Lines calls() {
        Lines out;
        for (const broker::TraceEntry &entry : rig_.broker().trace().entries()) {
            if (entry.side == broker::TraceEntry::Side::kUpCall) {
                const std::string method = entry.method.empty() ? "" : "." + entry.method;
                out.push_back(entry.operation + " " + entry.name_space + ":" + entry.class_name +
                              method + "(" + in_short(entry.arguments) + ")");
            }
        }
        return out;
    }

    std::vector<int> codes() {
        std::vector<int> out;
        for (const PackageStatus &result : rig_.results()) {
            out.push_back(result.code.value_or(-1));
        }
        return out;
    }

    Rig rig_{{.scenario_file = VELK_SCENARIO_DIR "/everything.toml"}};

  private:
    static constexpr std::size_t kTime = std::string_view("[ 8: 0: 0] ").size();

    [[nodiscard]] bool is_report(const std::string &line) const {
        const auto mark = line.rfind("] ");
        return mark != std::string::npos && std::ranges::any_of(ids_, [&](const std::string &id) {
                   return line.compare(mark + 2, id.size() + 2, id + ": ") == 0;
               });
    }

    [[nodiscard]] std::string in_short(std::string text) const {
        const std::string folder = packages_.path().string();
        for (auto at = text.find(folder); at != std::string::npos; at = text.find(folder)) {
            text.replace(at, folder.size(), "PACKAGES");
        }
        return text;
    }

    static Lines ids() {
        Lines out;
        for (const std::string &name : request()) {
            out.push_back(fs::path(name).stem().string());
        }
        return out;
    }

    const Lines ids_ = ids();
    RunFolder packages_;
};

TEST_F(Everything, GoesThroughItsWholeHistoryAndEveryCall) {
    ASSERT_EQ(request().size(), 20U);
    install();
    EXPECT_EQ(difference("history", history()), "");
    EXPECT_EQ(difference("calls", calls()), "");
    EXPECT_THAT(codes(), ElementsAre(50, 50, 50, 50, 50, 55, 80, 50, 50, 50, 50, 50, 53, 57, 12, 50,
                                     50, 50, 50, 50));
    EXPECT_TRUE(rig_.shut_down());
    EXPECT_THAT(rig_.findings(), IsEmpty());
}

}  // namespace
}  // namespace velkhost::rig::testing
