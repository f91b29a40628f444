#include "host/broker/convert.h"

#include <array>
#include <cstring>
#include <utility>

namespace velkhost::broker {
namespace {

constexpr CMPIType element_code(CMPIType type) {
    return static_cast<CMPIType>(type & ~CMPI_ARRAY);
}

// A string result of an invoked method points into memory that is gone by then.
char *lost_text() {
    static std::array<char, sizeof kReleasedText> text = std::to_array(kReleasedText);
    return text.data();
}

template <class Face>
Face *make_one(const Making &making, typename Traits<Face>::Payload payload) {
    Object<Face> *object =
        make<Face>(making.core, making.custody, making.origin, std::move(payload));
    if (making.parts != nullptr) {
        making.parts->add(object->tag);
    }
    return object;
}

// Fills the member that the type code names.
struct FillMember {
    const Making &making;
    CMPIType type;
    CMPIData &data;

    void operator()(std::monostate) const {
        data.state = CMPI_nullValue;
        if (type == CMPI_string) {
            data.value.string = make_string(making, std::nullopt);
        }
    }
    void operator()(cim::NullText) const { data.value.string = make_string(making, std::nullopt); }
    void operator()(bool value) const { data.value.boolean = value ? 1 : 0; }
    void operator()(std::uint64_t value) const { fill_integer(value); }
    void operator()(std::int64_t value) const { fill_integer(static_cast<std::uint64_t>(value)); }
    void operator()(double value) const {
        if (type == CMPI_real32) {
            data.value.real32 = static_cast<CMPIReal32>(value);
        } else {
            data.value.real64 = value;
        }
    }
    void operator()(const std::string &text) const {
        if (type == CMPI_chars) {
            data.value.chars = lost_text();
        } else if (type == CMPI_dateTime) {
            data.value.dateTime = make_one<CMPIDateTime>(making, text);
        } else {
            data.value.string = make_string(making, text);
        }
    }
    void operator()(const cim::Value::PathPointer &path) const {
        data.value.ref = make_path(making, *path);
    }
    void operator()(const cim::Value::InstancePointer &instance) const {
        data.value.inst = make_instance(making, *instance);
    }
    void operator()(const CMPIValuePtr &block) const { data.value.dataPtr = block; }
    void operator()(const cim::Value::Array &elements) const {
        ArrayPayload array;
        array.element_type = element_code(type);
        const Making inner{making.core, Custody::kPart, making.origin, &array.parts};
        for (const cim::Value &element : elements) {
            array.elements.push_back(to_data(inner, element));
        }
        data.value.array = make_one<CMPIArray>(making, std::move(array));
    }

    void fill_integer(std::uint64_t bits) const {
        if (type == CMPI_char16) {
            data.value.char16 = static_cast<CMPIChar16>(bits);
            return;
        }
        // Signed or not, the width is in the same two bits of the code.
        switch (type & (CMPI_uint64 & ~CMPI_UINT)) {
            case 0x00:
                data.value.uint8 = static_cast<CMPIUint8>(bits);
                break;
            case 0x10:
                data.value.uint16 = static_cast<CMPIUint16>(bits);
                break;
            case 0x20:
                data.value.uint32 = static_cast<CMPIUint32>(bits);
                break;
            default:
                data.value.uint64 = bits;
        }
    }
};

cim::Value integer(const CMPIValue &value, CMPIType type) {
    switch (type) {
        case CMPI_uint8:
            return {type, std::uint64_t{value.uint8}};
        case CMPI_uint16:
            return {type, std::uint64_t{value.uint16}};
        case CMPI_char16:
            return {type, std::uint64_t{value.char16}};
        case CMPI_uint32:
            return {type, std::uint64_t{value.uint32}};
        case CMPI_uint64:
            return {type, std::uint64_t{value.uint64}};
        case CMPI_sint8:
            return {type, std::int64_t{value.sint8}};
        case CMPI_sint16:
            return {type, std::int64_t{value.sint16}};
        case CMPI_sint32:
            return {type, std::int64_t{value.sint32}};
        default:
            return {type, std::int64_t{value.sint64}};
    }
}

// The content behind an object pointer, or null of that type.
template <class Face, class Convert>
cim::Value from_object(const Face *face, CMPIType type, Convert convert) {
    const auto *object = open(face, "a call that copies it");
    return object != nullptr ? convert(*object) : cim::Value::null(type);
}

cim::Value encapsulated(const CMPIValue &value, CMPIType type) {
    if ((type & CMPI_ARRAY) != 0) {
        return from_object(value.array, type, [type](const Object<CMPIArray> &array) {
            return cim::Value{type, array_value(*array.payload).content()};
        });
    }
    switch (type) {
        case CMPI_string:
            return from_object(value.string, type, [](const Object<CMPIString> &string) {
                const char *text = static_cast<const char *>(string.hdl);
                return text != nullptr ? cim::Value::string(text) : cim::Value::null(CMPI_string);
            });
        case CMPI_dateTime:
            return from_object(value.dateTime, type, [](const Object<CMPIDateTime> &time) {
                return cim::Value::date_time(*time.payload);
            });
        case CMPI_ref:
            return from_object(value.ref, type, [](const Object<CMPIObjectPath> &path) {
                return cim::Value::reference(*path.payload);
            });
        default:
            return from_object(value.inst, type, [](const Object<CMPIInstance> &instance) {
                return cim::Value::instance(instance.payload->instance);
            });
    }
}

bool is_storable(CMPIType type) {
    const bool known = cim::type_name(type) != "unknown";
    return type == CMPI_null || (known && type != (CMPI_ptr | CMPI_ARRAY));
}

}  // namespace

Parts::~Parts() {
    for (Tag *tag : tags_) {
        tag->ledger.retire(*tag, Life::kOver);
    }
}

CMPIData to_data(const Making &making, const cim::Value &value) {
    CMPIData data{};
    data.type = value.type();
    std::visit(FillMember{making, value.type(), data}, value.content());
    return data;
}

CMPIString *make_string(const Making &making, StringPayload text) {
    return make_one<CMPIString>(making, std::move(text));
}

CMPIObjectPath *make_path(const Making &making, cim::ObjectPath path) {
    return make_one<CMPIObjectPath>(making, std::move(path));
}

CMPIInstance *make_instance(const Making &making, cim::Instance instance) {
    return make_one<CMPIInstance>(making, {std::move(instance), std::nullopt});
}

std::optional<cim::Value> from_caller(const CMPIValue *value, CMPIType type, bool keep_chars) {
    if (!is_storable(type)) {
        return std::nullopt;
    }
    const bool chars = element_code(type) == CMPI_chars;
    const auto stored =
        static_cast<CMPIType>(chars && !keep_chars ? CMPI_string | (type & CMPI_ARRAY) : type);
    if (value == nullptr || type == CMPI_null) {
        return cim::Value::null(stored);
    }
    if (type == CMPI_chars) {
        return cim::Value{stored, std::string(reinterpret_cast<const char *>(value))};
    }
    if (type == CMPI_ptr) {
        return cim::Value{type, value->dataPtr};
    }
    if ((stored & (CMPI_ENC | CMPI_ARRAY)) != 0) {
        return encapsulated(*value, stored);
    }
    if (type == CMPI_boolean) {
        return cim::Value::boolean(value->boolean != 0);
    }
    if (type == CMPI_real32 || type == CMPI_real64) {
        return cim::Value{type, type == CMPI_real32 ? double{value->real32} : value->real64};
    }
    return integer(*value, type);
}

cim::Value array_value(const ArrayPayload &array) {
    cim::Value::Array elements;
    for (const CMPIData &data : array.elements) {
        const bool null = (data.state & CMPI_nullValue) != 0;
        elements.push_back(from_caller(null ? nullptr : &data.value, array.element_type)
                               .value_or(cim::Value::null(array.element_type)));
    }
    return cim::Value::array(array.element_type, std::move(elements));
}

CMPIData not_found() {
    CMPIData data{};
    data.state = CMPI_notFound;
    return data;
}

std::string text_of(const CMPIString *string) {
    const auto *object = open(string, "a call that reads it");
    return object != nullptr && object->hdl != nullptr ? static_cast<const char *>(object->hdl)
                                                       : "";
}

Status from_cmpi(const CMPIStatus &status) {
    return {status.rc, text_of(status.msg)};
}

CMPIStatus to_cmpi(Core &core, const Status &status) {
    if (status.message.empty()) {
        return {status.code, nullptr};
    }
    return {status.code,
            make_string({core, Custody::kTracked, {"status message", status.message}, nullptr},
                        status.message)};
}

void to_cmpi(Core &core, const Status &status, CMPIStatus *out) {
    if (out != nullptr) {
        *out = to_cmpi(core, status);
    }
}

NameList name_list(const char **names) {
    if (names == nullptr) {
        return std::nullopt;
    }
    std::vector<std::string> list;
    for (; *names != nullptr; ++names) {
        list.emplace_back(*names);
    }
    return list;
}

}  // namespace velkhost::broker
