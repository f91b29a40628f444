#include "tests/integration/wbem/exchange.h"

#include <fstream>
#include <sstream>
#include <stdexcept>

namespace velkhost::testing {
namespace {

constexpr std::string_view kRequest = "======> request\n";
constexpr std::string_view kAnswer = "<====== answer\n";

std::string with_carriage_returns(std::string_view text) {
    std::string result;
    for (const char letter : text) {
        result += letter == '\n' ? "\r\n" : std::string(1, letter);
    }
    return result;
}

void replace(std::string &text, const std::string &what, const std::string &with) {
    if (const std::size_t place = text.find(what); place != std::string::npos) {
        text.replace(place, what.size(), with);
    }
}

std::string on_the_wire(const std::string &stored) {
    const std::size_t end = stored.find("\n\n");
    if (end == std::string::npos) {
        throw std::runtime_error("a request without an end of its head");
    }
    std::string head = stored.substr(0, end + 2);
    std::string body = stored.substr(end + 2);
    replace(head, "Content-Length: *\n", "Content-Length: " + std::to_string(body.size()) + "\n");
    const bool chunks = head.find("chunked") != std::string::npos;
    return with_carriage_returns(head) + (chunks ? with_carriage_returns(body) : body);
}

// "*" in `pattern` is any text; both are single lines.
bool line_matches(std::string_view pattern, std::string_view line) {
    const std::size_t star = pattern.find('*');
    if (star == std::string_view::npos) {
        return pattern == line;
    }
    const std::string_view start = pattern.substr(0, star);
    const std::string_view end = pattern.substr(star + 1);
    return line.size() >= start.size() + end.size() && line.starts_with(start) &&
           line.ends_with(end);
}

}  // namespace

std::vector<Exchange> read_exchanges(const std::filesystem::path &file) {
    std::ifstream in(file);
    std::stringstream text;
    text << in.rdbuf();
    const std::string all = text.str();
    std::vector<Exchange> exchanges;
    std::size_t at = 0;
    while (at < all.size()) {
        const std::size_t answer = all.find(kAnswer, at);
        if (!all.substr(at).starts_with(kRequest) || answer == std::string::npos) {
            throw std::runtime_error(file.string() + " is no exchange");
        }
        const std::size_t next = std::min(all.find(kRequest, answer), all.size());
        const std::size_t request = at + kRequest.size();
        exchanges.push_back({on_the_wire(all.substr(request, answer - request)),
                             all.substr(answer + kAnswer.size(), next - answer - kAnswer.size())});
        at = next;
    }
    return exchanges;
}

bool matches(const std::string &stored, const std::string &answer) {
    std::istringstream wanted(stored);
    std::istringstream given(answer);
    std::string pattern;
    std::string line;
    while (std::getline(wanted, pattern)) {
        if (!std::getline(given, line)) {
            return false;
        }
        if (line.ends_with('\r')) {
            line.pop_back();
        }
        if (!line_matches(pattern, line)) {
            return false;
        }
    }
    return !std::getline(given, line);
}

}  // namespace velkhost::testing
