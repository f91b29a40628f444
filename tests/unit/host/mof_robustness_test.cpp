// Sources that nobody wrote on purpose: damaged, huge, malicious. The compiler answers, in bounded
// time and space, and the sanitizers have nothing to say.
#include "mof_testing.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <random>

namespace velkhost::mof::testing {
namespace {

constexpr std::size_t kMegabyte = 1U << 20U;

std::string project_source(const std::string &name) {
    std::ifstream file{std::filesystem::path{VELK_MOF_DIR} / name, std::ios::binary};
    return {std::istreambuf_iterator<char>{file}, {}};
}

std::string repeated(std::string_view piece, std::size_t count) {
    std::string text;
    text.reserve(piece.size() * count);
    for (; count > 0; --count) {
        text += piece;
    }
    return text;
}

struct Sound {
    std::string text;
    CompileOptions options;
};

// The project's sources, each for itself: what another file declares is given as known.
std::array<Sound, 4> sound_sources() {
    const CompileOptions base_known{
        "velk/cimv2", {"CIM_Service", "CIM_SoftwareInstallationService", "CIM_ConcreteJob"}};
    std::array<Sound, 4> sources = {{{project_source("cim_qualifiers.mof"), {}},
                                     {project_source("cim_base.mof"), {}},
                                     {project_source("velk_cimv2.mof"), base_known},
                                     {project_source("zeb_cimv2.mof"), base_known}}};
    for (Sound &source : sources) {
        const std::size_t include = source.text.find("#pragma include");
        if (include != std::string::npos) {
            source.text.replace(include, 2, "//");
        }
    }
    return sources;
}

// Small damages of the kinds that editors, transfers and authors do.
class Damage {
  public:
    explicit Damage(unsigned seed) : random_(seed) {}

    std::string apply_to(std::string text) {
        for (std::size_t count = 1 + pick(6); count > 0; --count) {
            once(text);
        }
        return text;
    }

  private:
    std::size_t pick(std::size_t below) { return random_() % below; }

    void once(std::string &text) {
        static constexpr std::array<std::string_view, 22> kPieces = {
            "{",  "}",  "[",     "]",    "(",     ")",       ";",  ",", "\"", "'", "\\",
            "/*", "*/", "class", "REF ", "-0x1F", "1.5e+99", "\n", ":", "#",  "=", "\xF0\x9F"};
        if (text.empty()) {
            return;
        }
        const std::size_t at = pick(text.size());
        const std::size_t length = std::min(text.size() - at, pick(200));
        switch (pick(6)) {
            case 0:
                text[at] = static_cast<char>(random_());
                break;
            case 1:
                text.erase(at, length);
                break;
            case 2:
                text.insert(at, kPieces[pick(kPieces.size())]);
                break;
            case 3:
                text.insert(at, text.substr(pick(text.size()), length));
                break;
            case 4:
                text.resize(at + 1);
                break;
            default:
                std::reverse(text.begin() + static_cast<std::ptrdiff_t>(at),
                             text.begin() + static_cast<std::ptrdiff_t>(at + length));
        }
    }

    std::mt19937 random_;
};

void expect_sane(const CompileResult &result) {
    EXPECT_LE(result.errors.size(), ErrorList::kMaxErrors);
    EXPECT_TRUE(result.ok() || result.units.empty());
    for (const Diagnostic &error : result.errors) {
        EXPECT_GE(error.line, 1U);
        EXPECT_GE(error.column, 1U);
        EXPECT_TRUE(error.text.starts_with("expected ")) << error.text;
        EXPECT_LT(error.text.size(), 300U) << error.text;
    }
}

TEST(MofRobustness, DamagedProjectSourcesAreAnswered) {
    const auto sources = sound_sources();
    for (const Sound &sound : sources) {
        const CompileResult result = compile_text(sound.text, "t.mof", sound.options);
        ASSERT_TRUE(result.ok()) << result.error_text();
    }
    int refused = 0;
    for (unsigned seed = 0; seed < 4000; ++seed) {
        const Sound &sound = sources[seed % sources.size()];
        const std::string damaged = Damage{seed}.apply_to(sound.text);
        const CompileResult result = compile_text(damaged, "t.mof", sound.options);
        expect_sane(result);
        refused += result.ok() ? 0 : 1;
    }
    EXPECT_GT(refused, 2000);
}

TEST(MofRobustness, EveryPrefixOfAProjectSourceIsAnswered) {
    const Sound source = sound_sources().back();
    for (std::size_t length = 0; length < source.text.size(); ++length) {
        const std::string_view prefix = std::string_view{source.text}.substr(0, length);
        expect_sane(compile_text(prefix, "t.mof", source.options));
    }
}

TEST(MofRobustness, RandomBytesAreAnswered) {
    std::mt19937 random{1};  // NOLINT(cert-msc51-cpp): a failure must be repeatable
    for (int round = 0; round < 200; ++round) {
        std::string text(500, '\0');
        for (char &byte : text) {
            // Mostly ASCII, so that not every text ends at the check of its encoding.
            byte = static_cast<char>(random() % (round % 4 == 0 ? 256 : 128));
        }
        expect_sane(compile_text(text, "t.mof"));
    }
}

// Each would take minutes or the whole stack if anything were quadratic or recursive.
TEST(MofRobustness, LargeSourcesTakeTimeInProportion) {
    const std::array<std::string, 20> sources = {
        std::string(kMegabyte, 'x'),
        std::string(kMegabyte, '@'),
        std::string(kMegabyte, '{'),
        std::string(kMegabyte, '}'),
        std::string(kMegabyte, '['),
        std::string(kMegabyte, '"'),
        std::string(kMegabyte, '1'),
        std::string(kMegabyte, '\n'),
        std::string(kMegabyte, '\0'),
        std::string(kMegabyte, '\xFF'),
        repeated("\\x", kMegabyte / 2),
        repeated("/*", kMegabyte / 2),
        repeated("@ ", kMegabyte / 2),
        "class T { string A = " + repeated("\"a\" ", kMegabyte / 4),
        "class T { uint8 A[] = {" + repeated("1,", kMegabyte / 2),
        "class T { string A = \"" + repeated("\\x41", kMegabyte / 4),
        "[" + repeated("A,", kMegabyte / 2),
        "class T { " + repeated("strin A; ", kMegabyte / 9),
        "class T { uint8 M(" + repeated("uint8 A, ", kMegabyte / 9),
        repeated("#pragma locale (\"a\") ", kMegabyte / 21),
    };
    for (const std::string &source : sources) {
        const auto start = std::chrono::steady_clock::now();
        expect_sane(compile_text(source, "t.mof"));
        const auto taken = std::chrono::steady_clock::now() - start;
        EXPECT_LT(taken, std::chrono::seconds{20}) << source.substr(0, 40);
    }
}

TEST(MofRobustness, ManySoundDeclarationsCompile) {
    constexpr int kCount = 20000;
    std::string text = "class C0 {};";
    for (int number = 1; number <= kCount; ++number) {
        const std::string name = std::to_string(number);
        text.append("#pragma namespace (\"n").append(name).append("\") class T {};\n");
        text.append("#pragma namespace (\"root/cimv2\")\n");
        text.append("class C").append(name).append(" : C0 { string A; };\n");
    }
    const CompileResult result = compile_text(text, "t.mof");
    ASSERT_TRUE(result.ok()) << result.error_text();
    EXPECT_EQ(result.units.size(), kCount + 1U);
    EXPECT_EQ(result.units.front().classes.size(), kCount + 1U);
}

class MofHostileFiles : public SourceFolder {};

TEST_F(MofHostileFiles, IncludesCannotMultiplyTheWork) {
    // 15 levels, each including the next one five times: 5^14 readings if each counted.
    for (int level = 0; level < 14; ++level) {
        write("f" + std::to_string(level) + ".mof",
              repeated("#pragma include (\"f" + std::to_string(level + 1) + ".mof\")\n", 5));
    }
    write("f14.mof", "class T {};");
    const CompileResult result = compile_file(path("f0.mof"));
    ASSERT_TRUE(result.ok()) << result.error_text();
    EXPECT_EQ(result.units.front().classes.size(), 1U);
}

TEST_F(MofHostileFiles, NamespacesCannotMultiplyTheWorkWithoutEnd) {
    write("big.mof", std::string(kMegabyte, ' '));
    std::string text;
    for (int number = 0; number < 200; ++number) {
        text += "#pragma namespace (\"n" + std::to_string(number) +
                "\")\n#pragma include (\"big.mof\")\n";
    }
    const CompileResult result = compile_file(write("main.mof", text));
    ASSERT_FALSE(result.ok());
    EXPECT_EQ(result.errors.front().text,
              "expected a file to include, found too much text in all included files at " +
                  quoted("big.mof"));
}

TEST_F(MofHostileFiles, EndlessNameIsNotLookedUp) {
    const auto main =
        write("a.mof", "#pragma include (\"" + repeated("../", kMegabyte / 3) + "\")");
    EXPECT_EQ(compile_file(main).error_text(),
              at("a.mof", "1:18: expected a file to include, found a name of 1048575 bytes"));
}

TEST_F(MofHostileFiles, DeviceIsNoSource) {
    EXPECT_EQ(compile_file("/dev/zero").error_text(),
              "/dev/zero:1:1: expected a readable file, found no regular file\n");
}

TEST_F(MofHostileFiles, HugeFileIsRefusedUnread) {
    write("huge.mof", "");
    std::filesystem::resize_file(path("huge.mof"), std::uintmax_t{1} << 32U);
    EXPECT_EQ(compile_file(path("huge.mof")).error_text(),
              at("huge.mof", "1:1: expected a readable file, found one of 4294967296 bytes"));
}

}  // namespace
}  // namespace velkhost::mof::testing
