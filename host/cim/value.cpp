#include "host/cim/value.h"

#include "host/cim/instance.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace velkhost::cim {
namespace {

template <class Form>
std::optional<Form> get(const Value::Content &content) {
    const Form *form = std::get_if<Form>(&content);
    return form ? std::optional<Form>(*form) : std::nullopt;
}

// Whether two contents of the same alternative are equal.
struct SameContent {
    template <class Form>
    bool operator()(const Form &left, const Form &right) const {
        return left == right;
    }
    template <class Left, class Right>
    requires(!std::same_as<Left, Right>) bool operator()(const Left &, const Right &) const {
        return false;
    }
    bool operator()(const Value::PathPointer &left, const Value::PathPointer &right) const {
        return left && right ? *left == *right : left == right;
    }
    bool operator()(const Value::InstancePointer &left, const Value::InstancePointer &right) const {
        return left && right ? *left == *right : left == right;
    }
    bool operator()(const CMPIValuePtr &left, const CMPIValuePtr &right) const {
        return left.ptr == right.ptr && left.length == right.length;
    }
};

}  // namespace

Value Value::reference(ObjectPath path) {
    return {CMPI_ref, std::make_shared<const ObjectPath>(std::move(path))};
}

Value Value::instance(Instance instance) {
    return {CMPI_instance, std::make_shared<const Instance>(std::move(instance))};
}

Value Value::array(CMPIType element_type, Array elements) {
    return {static_cast<CMPIType>(element_type | CMPI_ARRAY), std::move(elements)};
}

bool Value::is_null() const {
    return std::holds_alternative<std::monostate>(content_) ||
           std::holds_alternative<NullText>(content_);
}

std::optional<bool> Value::as_bool() const {
    return get<bool>(content_);
}

std::optional<std::uint64_t> Value::as_unsigned() const {
    if (const auto *number = std::get_if<std::int64_t>(&content_)) {
        return *number >= 0 ? std::optional(static_cast<std::uint64_t>(*number)) : std::nullopt;
    }
    return get<std::uint64_t>(content_);
}

std::optional<std::int64_t> Value::as_signed() const {
    if (const auto *number = std::get_if<std::uint64_t>(&content_)) {
        const bool fits = std::in_range<std::int64_t>(*number);
        return fits ? std::optional(static_cast<std::int64_t>(*number)) : std::nullopt;
    }
    return get<std::int64_t>(content_);
}

std::optional<std::string_view> Value::as_text() const {
    const auto *text = std::get_if<std::string>(&content_);
    return text ? std::optional<std::string_view>(*text) : std::nullopt;
}

const ObjectPath *Value::as_path() const {
    const auto *path = std::get_if<PathPointer>(&content_);
    return path ? path->get() : nullptr;
}

const Instance *Value::as_instance() const {
    const auto *instance = std::get_if<InstancePointer>(&content_);
    return instance ? instance->get() : nullptr;
}

const Value::Array *Value::as_array() const {
    return std::get_if<Array>(&content_);
}

bool Value::operator==(const Value &other) const {
    return type_ == other.type_ && std::visit(SameContent{}, content_, other.content_);
}

}  // namespace velkhost::cim
