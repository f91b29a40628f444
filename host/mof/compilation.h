// One run of the compiler: the files being read, the namespaces being filled.
#pragma once

#include "host/cim/names.h"
#include "host/mof/compiler.h"
#include "host/mof/token_stream.h"
#include "host/mof/unit.h"

#include <deque>
#include <filesystem>
#include <map>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace velkhost::mof {

class Compilation {
  public:
    explicit Compilation(const CompileOptions &options);

    void read_file(const std::filesystem::path &path);
    void read_text(std::string_view text, const std::filesystem::path &name);

    // What was gathered; ends the compilation.
    CompileResult finish();

  private:
    static constexpr std::size_t kMaxIncludeDepth = 16;
    // Over all files together: includes must not multiply a small source into a large one.
    static constexpr std::uintmax_t kMaxTotalBytes = 32U << 20U;

    // A file being read. Its unit changes with its namespace pragmas.
    struct OpenFile {
        std::filesystem::path path;
        std::filesystem::path identity;  // the same for all spellings of a path
        Unit *unit;
    };

    Unit &unit_for(std::string_view name_space);
    std::string_view keep_name(const std::filesystem::path &path);
    void read_open_file(OpenFile file, std::string_view text);
    void read_declaration(TokenStream &in);
    void read_pragma(TokenStream &in);
    void enter_namespace(const Token &name, TokenStream &in);
    void include(const Token &name, TokenStream &in);
    [[nodiscard]] std::string refusal(const std::filesystem::path &identity) const;

    const CompileOptions &options_;
    ErrorList errors_;
    std::set<std::string> file_names_;  // what positions point into
    std::deque<Unit> units_;
    std::map<std::string, Unit *, cim::NameLess> units_by_name_;
    std::vector<OpenFile> open_;
    std::set<std::pair<std::filesystem::path, const Unit *>> included_;
    std::uintmax_t total_bytes_ = 0;
};

}  // namespace velkhost::mof
