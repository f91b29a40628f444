#include "host/mof/compiler.h"

#include "host/mof/compilation.h"

namespace velkhost::mof {

std::string CompileResult::error_text() const {
    std::string text;
    for (const Diagnostic &error : errors) {
        text += error.to_string() + "\n";
    }
    return text;
}

CompileResult compile_file(const std::filesystem::path &path, const CompileOptions &options) {
    Compilation compilation{options};
    compilation.read_file(path);
    return compilation.finish();
}

CompileResult compile_text(std::string_view text, const std::filesystem::path &name,
                           const CompileOptions &options) {
    Compilation compilation{options};
    compilation.read_text(text, name);
    return compilation.finish();
}

}  // namespace velkhost::mof
