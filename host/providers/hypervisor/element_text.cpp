#include "host/providers/hypervisor/element_text.h"

namespace velkhost::providers {
namespace {

std::string trimmed(std::string_view text) {
    constexpr std::string_view kBlanks = " \t\r\n";
    const auto begin = text.find_first_not_of(kBlanks);
    if (begin == std::string_view::npos) {
        return "";
    }
    return std::string(text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1));
}

}  // namespace

std::vector<std::string> texts_of(std::string_view xml, std::string_view element) {
    const std::string opening = "<" + std::string(element) + ">";
    const std::string closing = "</" + std::string(element) + ">";
    std::vector<std::string> texts;
    auto at = xml.find(opening);
    while (at != std::string_view::npos) {
        const auto begin = at + opening.size();
        const auto end = xml.find(closing, begin);
        if (end == std::string_view::npos) {
            break;
        }
        texts.push_back(trimmed(xml.substr(begin, end - begin)));
        at = xml.find(opening, end + closing.size());
    }
    return texts;
}

}  // namespace velkhost::providers
