// The MOF compiler: from the sources that provider developers write (DSP0004, annex A) to class
// declarations for the repository. It knows qualifier declarations, classes, and the pragmas
// `include` and `namespace`; other pragmas are passed over, instances are refused.
#pragma once

#include "host/cim/class_decl.h"
#include "host/mof/diagnostics.h"
#include "host/mof/qualifier_decl.h"

#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::mof {

struct CompileOptions {
    // The namespace of declarations in front of any `#pragma namespace`.
    std::string name_space = "root/cimv2";
    // Classes that the repository has already: good as superclasses, taken as names. They count
    // for every namespace of the compilation.
    std::vector<std::string> known_classes;
};

// What was declared for one namespace, in the order of declaration. Initialisers and qualifier
// values are texts: strings decoded to UTF-8, integers in decimal, booleans in lower case.
struct NamespaceUnit {
    std::string name_space;
    std::vector<cim::ClassDecl> classes;
    std::vector<QualifierDecl> qualifiers;
};

struct CompileResult {
    // One entry per namespace that has a declaration, in the order of their first mention. Empty
    // when there is an error: half a class is no class.
    std::vector<NamespaceUnit> units;
    // At most ErrorList::kMaxErrors.
    std::vector<Diagnostic> errors;

    [[nodiscard]] bool ok() const { return errors.empty(); }

    // All errors, a line each.
    [[nodiscard]] std::string error_text() const;
};

// Compiles a file with all that it includes. Includes are relative to the including file. An
// included file starts in the namespace of the pragma that includes it, and a `#pragma namespace`
// in it holds up to its own end. Including a file a second time in the same namespace has no
// effect, so that several files can share their base classes; including it while it is still
// being read is an error. Never throws, but for memory.
CompileResult compile_file(const std::filesystem::path &path, const CompileOptions &options = {});

// Compiles a text; `name` stands for the file in messages and is what includes are relative to.
CompileResult compile_text(std::string_view text, const std::filesystem::path &name,
                           const CompileOptions &options = {});

}  // namespace velkhost::mof
