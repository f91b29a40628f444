#include "host/jobs/callbacks.h"

#include <dlfcn.h>

#include <array>
#include <cstring>
#include <span>

namespace velkhost::jobs {
namespace {

// No value for a text that is empty or that fills its field to the end.
std::optional<std::string> field(std::span<const char> text) {
    const std::size_t length = strnlen(text.data(), text.size());
    if (length == 0 || length == text.size()) {
        return std::nullopt;
    }
    return std::string(text.data(), length);
}

std::string last_error(const std::string &otherwise) {
    const char *const text = dlerror();
    return text == nullptr ? otherwise : text;
}

// dlsym hands out functions as data pointers.
template <typename Function>
Function *find_function(void *library, const std::string &name) {
    return reinterpret_cast<Function *>(dlsym(library, name.c_str()));
}

}  // namespace

std::optional<Registration> Registration::read(const JobRegistration &record) {
    const auto provider_name = field(record.provider_name);
    const auto library_path = field(record.library_path);
    const auto status_function = field(record.status_function);
    const auto cleanup_function = field(record.cleanup_function);
    if (!provider_name || !library_path || !status_function || !cleanup_function) {
        return std::nullopt;
    }
    return Registration{*provider_name, *library_path, *status_function, *cleanup_function};
}

Callbacks::Callbacks(const Registration &registration)
    : library_(dlopen(registration.library_path.c_str(), RTLD_LAZY | RTLD_LOCAL)) {
    if (library_ == nullptr) {
        error_ = last_error("cannot open " + registration.library_path);
        return;
    }
    status_ = find_function<StatusFunction>(library_, registration.status_function);
    if (status_ == nullptr) {
        error_ = last_error("no function " + registration.status_function);
    }
    cleanup_ = find_function<CleanupFunction>(library_, registration.cleanup_function);
}

Callbacks::~Callbacks() {
    if (library_ != nullptr) {
        dlclose(library_);
    }
}

std::optional<Reading> Callbacks::status(const std::string &id, const Reading &known) const {
    if (status_ == nullptr) {
        return std::nullopt;
    }
    constexpr int kHighestState = 0xFFFF;  // uint16 in the class
    std::array<char, 4096> message{};      // the line of a status file is at most a quarter of it
    known.message.copy(message.data(), message.size() - 1);
    int state = known.state;
    const int result =
        status_(id.c_str(), &state, message.data(), static_cast<int>(message.size()));
    if (result != 0 || state < 0 || state > kHighestState) {
        return std::nullopt;
    }
    return Reading{state, std::string(message.data(), strnlen(message.data(), message.size()))};
}

void Callbacks::clean_up(const std::string &id) const {
    if (cleanup_ != nullptr) {
        cleanup_(id.c_str());
    }
}

}  // namespace velkhost::jobs
