#include <cstring>
#include <span>
#include <string_view>

#include "catalog/descriptor.h"
#include "velk/bounded_text.h"

namespace {

constexpr std::size_t kOpeningTag = std::string_view{"<VALUE>"}.size();
constexpr std::size_t kClosingTag = std::string_view{"</VALUE>"}.size();

// Keeps `length` characters from `begin` on. The result is never longer than the text was.
void keep(char *text, std::size_t begin, std::size_t length) {
    velk::copy({text, std::strlen(text) + 1}, {text + begin, length});
}

}  // namespace

void trimXMLString(char *text) {
    if (text == nullptr || *text == '\0' || *text == '<') {
        return;
    }
    const std::string_view line(text);
    const std::size_t begin = line.find('<');
    const std::size_t end = line.rfind('>');
    if (begin == std::string_view::npos || end == std::string_view::npos || end < begin) {
        keep(text, 0, 0);
        return;
    }
    keep(text, begin, end + 1 - begin);
}

void getXmlTagData(char *text) {
    if (text == nullptr) {
        return;
    }
    const std::size_t length = std::strlen(text);
    if (length < kOpeningTag + kClosingTag) {
        keep(text, 0, 0);
        return;
    }
    keep(text, kOpeningTag, length - kOpeningTag - kClosingTag);
}

void trimPackageID(char *text) {
    if (text == nullptr) {
        return;
    }
    const std::string_view whole(text);
    std::size_t begin = 0;
    std::size_t end = whole.size();
    for (std::size_t at = whole.size(); at-- > 1;) {
        if (whole[at] == '/') {
            begin = at + 1;
            break;
        }
        if (whole[at] == '.' && end == whole.size()) {
            end = at;
        }
    }
    keep(text, begin, end - begin);
}
