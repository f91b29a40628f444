#include "host/mof/compilation.h"

#include "host/cim/names.h"
#include "host/mof/class_reader.h"
#include "host/mof/qualifiers.h"
#include "host/mof/source.h"

#include <algorithm>
#include <system_error>

namespace velkhost::mof {
namespace {

namespace fs = std::filesystem;

fs::path identity_of(const fs::path &path) {
    std::error_code error;
    fs::path identity = fs::weakly_canonical(path, error);
    return error ? path.lexically_normal() : identity;
}

// Names of more than letters, digits and these would need escapes in every path that bears them.
bool is_namespace(std::string_view name) {
    constexpr std::string_view kAllowed =
        "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_-./";
    return !name.empty() && name.front() != '/' && name.back() != '/' &&
           name.find("//") == std::string_view::npos &&
           name.find_first_not_of(kAllowed) == std::string_view::npos;
}

}  // namespace

Compilation::Compilation(const CompileOptions &options) : options_(options) {}

void Compilation::read_file(const fs::path &path) {
    std::string problem;
    const auto text = load_source(path, problem);
    if (text) {
        read_text(*text, path);
    } else {
        errors_.add({keep_name(path)}, "expected a readable file, found " + problem);
    }
}

void Compilation::read_text(std::string_view text, const fs::path &name) {
    read_open_file({name, identity_of(name), &unit_for(options_.name_space)}, text);
}

CompileResult Compilation::finish() {
    CompileResult result;
    result.errors = errors_.all();
    for (Unit &unit : units_) {
        const bool filled = !unit.result.classes.empty() || !unit.result.qualifiers.empty();
        if (result.ok() && filled) {
            result.units.push_back(std::move(unit.result));
        }
    }
    return result;
}

Unit &Compilation::unit_for(std::string_view name_space) {
    Unit *&known = units_by_name_[std::string{name_space}];
    if (known == nullptr) {
        known = &units_.emplace_back();
        known->result.name_space = name_space;
        for (const std::string &name : options_.known_classes) {
            known->classes.declare(name, {});
        }
    }
    return *known;
}

std::string_view Compilation::keep_name(const fs::path &path) {
    return *file_names_.insert(path.string()).first;
}

void Compilation::read_open_file(OpenFile file, std::string_view text) {
    total_bytes_ += text.size();
    const std::string_view name = keep_name(file.path);
    const auto source = checked_text(text, name, errors_);
    if (!source) {
        return;
    }
    included_.emplace(file.identity, file.unit);
    open_.push_back(std::move(file));
    TokenStream in{*source, name, errors_};
    while (!in.at_end()) {
        try {
            read_declaration(in);
        } catch (const SyntaxError &) {
            in.skip_declaration();
        }
    }
    open_.pop_back();
}

void Compilation::read_declaration(TokenStream &in) {
    if (in.at('#')) {
        read_pragma(in);
        return;
    }
    Unit &unit = *open_.back().unit;
    if (in.at_word("qualifier")) {
        read_qualifier_declaration(in, unit);
        return;
    }
    auto qualifiers = read_qualifiers(in, unit);
    if (in.at_word("class")) {
        read_class(in, unit, std::move(qualifiers));
        return;
    }
    in.fail(in.at_word("instance")
                ? "a class or qualifier declaration (instances come from providers, not from MOF)"
                : "a class, a qualifier declaration or a pragma");
}

void Compilation::read_pragma(TokenStream &in) {
    in.expect('#', "before 'pragma'");
    in.expect_word("pragma", "after '#'");
    const Token kind = in.expect(TokenKind::kIdentifier, "the name of a pragma");
    in.expect('(', "after the name of a pragma");
    const Token argument = in.expect(TokenKind::kString, "a string");
    in.expect(')', "after the argument of a pragma");
    if (cim::same_name(kind.spelling, "namespace")) {
        enter_namespace(argument, in);
    } else if (cim::same_name(kind.spelling, "include")) {
        include(argument, in);
    }
}

void Compilation::enter_namespace(const Token &name, TokenStream &in) {
    if (is_namespace(name.text)) {
        open_.back().unit = &unit_for(name.text);
    } else if (!name.damaged) {
        in.report(name.position,
                  "expected the name of a namespace without a host, found " + describe(name));
    }
}

// Why a file may not be included here; empty when it may.
std::string Compilation::refusal(const fs::path &identity) const {
    const bool open = std::any_of(open_.begin(), open_.end(), [&identity](const OpenFile &each) {
        return each.identity == identity;
    });
    if (open) {
        return "a file that is still being read";
    }
    if (open_.size() >= kMaxIncludeDepth) {
        return "includes nested deeper than " + std::to_string(kMaxIncludeDepth);
    }
    return total_bytes_ > kMaxTotalBytes ? "too much text in all included files" : "";
}

void Compilation::include(const Token &name, TokenStream &in) {
    if (name.text.size() > kMaxPathBytes) {
        in.report(name.position, "expected a file to include, found a name of " +
                                     std::to_string(name.text.size()) + " bytes");
        return;
    }
    const fs::path path = (open_.back().path.parent_path() / name.text).lexically_normal();
    const fs::path identity = identity_of(path);
    Unit *const unit = open_.back().unit;
    std::string problem = refusal(identity);
    if (problem.empty() && included_.contains({identity, unit})) {
        return;
    }
    const auto text = problem.empty() ? load_source(path, problem) : std::nullopt;
    if (text) {
        read_open_file({path, identity, unit}, *text);
    } else {
        in.report(name.position, "expected a file to include, found " + problem + " at " +
                                     shown(path.string(), kMaxPathBytes));
    }
}

}  // namespace velkhost::mof
