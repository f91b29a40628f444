// Reading what a caller sent. Brokers report an absent item in different ways (status 6 or 12,
// state bits, null objects); here it is simply no value.
#pragma once

#include "host/providers/kit/data.h"

#include <cmpi/cmpidt.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace velkhost::providers {

// The text of a broker's string; no value for the null string and for a null pointer.
std::optional<std::string> text_of(const CMPIString *string);

// Whether two CIM names are the same: letter case does not matter (DSP0004, 5.2.2).
bool same_name(std::string_view a, std::string_view b);

// The object path that a call concerns. Does not own it; a null path reads as an empty one.
class Path {
  public:
    explicit Path(const CMPIObjectPath *path) : path_(path) {}

    [[nodiscard]] std::string name_space() const;
    [[nodiscard]] std::string class_name() const;
    [[nodiscard]] const CMPIObjectPath *get() const { return path_; }
    // The text of a key; no value when it is absent, null or no string.
    [[nodiscard]] std::optional<std::string> key(const char *name) const;
    [[nodiscard]] std::size_t key_count() const;
    // Whether the path has these keys and no others. All keys are texts or references.
    [[nodiscard]] bool has_exactly(const std::vector<Property> &keys) const;
    // Whether the path is that of the instance, in whatever namespace.
    [[nodiscard]] bool names(const Reference &instance) const;

  private:
    [[nodiscard]] bool has(const Property &wanted) const;
    [[nodiscard]] Path reference_key(const char *name) const;

    const CMPIObjectPath *path_;
};

// The input arguments of a method. Does not own them; null arguments read as none.
class Args {
  public:
    explicit Args(const CMPIArgs *args) : args_(args) {}

    // Throw CimError "invalid parameter" when the argument is absent, null or of another type.
    [[nodiscard]] std::string text(const char *name) const;
    [[nodiscard]] std::uint8_t uint8(const char *name) const;
    // `otherwise` when the argument is absent or null.
    [[nodiscard]] std::uint16_t uint16_or(const char *name, std::uint16_t otherwise) const;
    [[nodiscard]] std::vector<std::uint16_t> uint16s(const char *name) const;
    [[nodiscard]] Path reference(const char *name) const;

  private:
    [[nodiscard]] bool has(const char *name) const;
    [[nodiscard]] CMPIData typed(const char *name, CMPIType type, const char *type_name) const;

    const CMPIArgs *args_;
};

}  // namespace velkhost::providers
