#include "host/shim/complain.h"

#include <unistd.h>

#include <algorithm>
#include <array>
#include <span>

namespace velkhost::shim {

void complain(std::initializer_list<std::string_view> parts) {
    std::array<char, 512> line{};
    std::span<char> room = std::span(line).first(line.size() - 1);  // the last one: the line end
    const auto append = [&room](std::string_view part) {
        const std::string_view fitting = part.substr(0, room.size());
        std::ranges::copy(fitting, room.begin());
        room = room.subspan(fitting.size());
    };
    append("velkshim: ");
    std::ranges::for_each(parts, append);
    char *const end = room.data();
    *end = '\n';
    const auto length = static_cast<std::size_t>(end + 1 - line.data());
    [[maybe_unused]] const ssize_t written = write(STDERR_FILENO, line.data(), length);
}

}  // namespace velkhost::shim
