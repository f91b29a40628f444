// A program that knows nothing of the shim: pauses, writes a file at a fixed path, tells its host.
#include <sys/utsname.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <thread>

namespace {

const char *setting(const char *name, const char *otherwise) {
    const char *const value = std::getenv(name);
    return value == nullptr ? otherwise : value;
}

}  // namespace

int main() {
    std::printf("start %lld\n", static_cast<long long>(std::time(nullptr)));
    const int pause = std::atoi(setting("VELKSHIM_TEST_PAUSE", "7200"));
    std::thread([pause] { sleep(static_cast<unsigned>(pause)); }).join();
    const auto end = static_cast<long long>(std::time(nullptr));
    FILE *const file = std::fopen(setting("VELKSHIM_TEST_FILE", "/tmp/sfcb/preloaded"), "w");
    if (file == nullptr) {
        return 1;
    }
    std::fprintf(file, "written at %lld", end);
    std::fclose(file);
    utsname name{};
    uname(&name);
    std::printf("end %lld\nnode %s\n", end, name.nodename);
    return 0;
}
