#include "host/providers/kit/reading.h"

#include "host/providers/kit/cim_error.h"

#include <cmpi/cmpimacs.h>

#include <algorithm>

#include <strings.h>

namespace velkhost::providers {
namespace {

constexpr unsigned kUnusable = CMPI_nullValue | CMPI_notFound | CMPI_badValue;

bool is_usable(const CMPIStatus &status, const CMPIData &data) {
    return status.rc == CMPI_RC_OK && (data.state & kUnusable) == 0U;
}

}  // namespace

std::optional<std::string> text_of(const CMPIString *string) {
    if (string == nullptr || string->hdl == nullptr) {
        return std::nullopt;
    }
    const char *text = string->ft->getCharPtr(string, nullptr);
    return text == nullptr ? std::nullopt : std::optional<std::string>(text);
}

bool same_name(std::string_view a, std::string_view b) {
    return a.size() == b.size() && ::strncasecmp(a.data(), b.data(), a.size()) == 0;
}

std::string Path::name_space() const {
    if (path_ == nullptr) {
        return {};
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return text_of(CMGetNameSpace(path_, &status)).value_or("");
}

std::optional<std::string> Path::key(const char *name) const {
    if (path_ == nullptr) {
        return std::nullopt;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetKey(path_, name, &status);
    if (!is_usable(status, data) || data.type != CMPI_string) {
        return std::nullopt;
    }
    return text_of(data.value.string);
}

std::size_t Path::key_count() const {
    return path_ == nullptr ? 0 : CMGetKeyCount(path_, nullptr);
}

std::string Path::class_name() const {
    if (path_ == nullptr) {
        return {};
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return text_of(CMGetClassName(path_, &status)).value_or("");
}

Path Path::reference_key(const char *name) const {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetKey(path_, name, &status);
    return Path(is_usable(status, data) && data.type == CMPI_ref ? data.value.ref : nullptr);
}

bool Path::has(const Property &wanted) const {
    if (const auto *reference = std::get_if<Reference>(&wanted.value)) {
        return reference_key(wanted.name.c_str()).names(*reference);
    }
    const Text *text = std::get_if<Text>(&wanted.value);
    return text != nullptr && *text && key(wanted.name.c_str()) == *text;
}

bool Path::has_exactly(const std::vector<Property> &keys) const {
    return key_count() == keys.size() &&
           std::ranges::all_of(keys, [this](const Property &wanted) { return has(wanted); });
}

bool Path::names(const Reference &instance) const {
    return same_name(class_name(), instance.class_name) && has_exactly(instance.keys);
}

CMPIData Args::typed(const char *name, CMPIType type, const char *type_name) const {
    const std::string parameter = std::string("Parameter ") + name;
    CMPIStatus status{CMPI_RC_OK, nullptr};
    CMPIData data{};
    data.state = CMPI_notFound;
    if (args_ != nullptr) {
        data = CMGetArg(args_, name, &status);
    }
    if (!is_usable(status, data)) {
        throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, parameter + " is missing or null");
    }
    if (data.type != type) {
        throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, parameter + " must be a " + type_name);
    }
    return data;
}

bool Args::has(const char *name) const {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return args_ != nullptr && is_usable(status, CMGetArg(args_, name, &status));
}

std::string Args::text(const char *name) const {
    const auto text = text_of(typed(name, CMPI_string, "string").value.string);
    if (!text) {
        throw CimError(CMPI_RC_ERR_INVALID_PARAMETER,
                       std::string("Parameter ") + name + " is missing or null");
    }
    return *text;
}

std::uint8_t Args::uint8(const char *name) const {
    return typed(name, CMPI_uint8, "uint8").value.uint8;
}

std::uint16_t Args::uint16_or(const char *name, std::uint16_t otherwise) const {
    return has(name) ? typed(name, CMPI_uint16, "uint16").value.uint16 : otherwise;
}

std::vector<std::uint16_t> Args::uint16s(const char *name) const {
    const CMPIArray *array = typed(name, CMPI_uint16A, "uint16[]").value.array;
    std::vector<std::uint16_t> numbers;
    const CMPICount count = CMGetArrayCount(array, nullptr);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIStatus status{CMPI_RC_OK, nullptr};
        const CMPIData element = CMGetArrayElementAt(array, i, &status);
        if (is_usable(status, element)) {
            numbers.push_back(element.value.uint16);
        }
    }
    return numbers;
}

Path Args::reference(const char *name) const {
    return Path(typed(name, CMPI_ref, "reference").value.ref);
}

}  // namespace velkhost::providers
