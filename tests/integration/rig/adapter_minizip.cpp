// A Minizip for archives that are texts: the name of a payload, and the model that it applies to.
#include <filesystem>
#include <fstream>
#include <string>

namespace fs = std::filesystem;

// NOLINTNEXTLINE(misc-use-internal-linkage): found by its name
extern "C" [[gnu::visibility("default")]] int Minizip(const char *archive, const char *directory);

extern "C" int Minizip(const char *archive, const char *directory) {
    std::ifstream in(archive);
    std::string name;
    std::string dfn;
    if (!std::getline(in, name) || !std::getline(in, dfn)) {
        return 1;
    }
    const fs::path image = fs::path(directory) / "image";
    std::error_code error;
    fs::create_directories(image, error);
    std::ofstream(image / (name + ".bin")) << "image";
    std::ofstream configuration(image / "payload.xml");
    configuration << "<updateConfiguration>\n<payload order=\"1\">image/" << name
                  << ".bin</payload>\n<applicability type=\"DFN\">" << dfn
                  << "</applicability>\n</payload>\n</updateConfiguration>\n";
    return configuration.good() ? 0 : 1;
}
