// The scanners of the payload configuration file.
#include <algorithm>
#include <cstdio>
#include <cstring>
#include <string_view>

#include "catalog/applicability.h"
#include "velk/bounded_text.h"

namespace {

constexpr std::size_t kSearched = 1024;

// The stretch of `text` before the first of `stops`; null and 0 when it is empty.
char *span_until(char *text, const char *stops, int *length) {
    const std::size_t size = std::strcspn(text, stops);
    *length = static_cast<int>(size);
    return size == 0 ? nullptr : text;
}

char *none(int *length) {
    *length = 0;
    return nullptr;
}

bool is_blank(char character) {
    return character == ' ' || character == '\t';
}

}  // namespace

char *removeBlanks(char *text) {
    return text + std::strspn(text, " ");
}

char *getProp(char *line, int *length) {
    auto *open = static_cast<char *>(std::memchr(line, '<', strnlen(line, kSearched)));
    return open == nullptr ? none(length) : span_until(removeBlanks(open + 1), " >", length);
}

char *getSubProp(char *line, int *length) {
    int tag_length = 0;
    char *tag = getProp(line, &tag_length);
    return tag == nullptr ? none(length)
                          : span_until(removeBlanks(tag + tag_length), "=> ", length);
}

char *getPropValue(char *line, int *length) {
    char *close = std::strchr(line, '>');
    return close == nullptr ? none(length) : span_until(close + 1, "<\r\n\b", length);
}

char *trimString(char *text) {
    std::printf("trimString: \"%s\"\n", text);
    std::string_view rest(text);
    while (!rest.empty() && is_blank(rest.back())) {
        rest.remove_suffix(1);
    }
    while (!rest.empty() && is_blank(rest.front())) {
        rest.remove_prefix(1);
    }
    velk::copy({text, std::strlen(text) + 1}, rest);
    std::printf("trimString: trimmed to \"%s\"\n", text);
    return text;
}
