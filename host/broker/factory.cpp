// The broker's factories and the services that come with them.
#include "host/broker/convert.h"
#include "host/broker/datetime.h"

#include <chrono>

namespace velkhost::broker {
namespace {

constexpr auto kTracked = Custody::kTracked;

std::string text_or_empty(const char *text) {
    return text != nullptr ? text : "";
}

// Asks for a fault; when there is one, sets the status to it.
bool strikes(Core &core, const char *step, const std::string &subject, CMPIStatus *status) {
    const auto fault = core.faults.ask(step, subject);
    if (!fault) {
        set_status(status, CMPI_RC_OK);
        return false;
    }
    to_cmpi(core, {static_cast<CMPIrc>(fault->code), fault->message}, status);
    return true;
}

// -- Factories --

CMPIInstance *new_instance(const CMPIBroker *broker, const CMPIObjectPath *path,
                           CMPIStatus *status) {
    Core &core = Core::of(broker);
    const auto *object = open(path, "newInstance", status);
    if (object == nullptr ||
        strikes(core, "broker.newInstance", object->payload->class_name, status)) {
        return nullptr;
    }
    return make_instance({core, kTracked, {"newInstance", object->payload->class_name}, nullptr},
                         core.repository.new_instance(*object->payload));
}

// Neither namespace nor class need be known, or even be there.
CMPIObjectPath *new_object_path(const CMPIBroker *broker, const char *name_space,
                                const char *class_name, CMPIStatus *status) {
    Core &core = Core::of(broker);
    const std::string subject = text_or_empty(class_name);
    if (strikes(core, "broker.newObjectPath", subject, status)) {
        return nullptr;
    }
    return make_path({core, kTracked, {"newObjectPath", subject}, nullptr},
                     {"", text_or_empty(name_space), subject, {}});
}

CMPIArgs *new_args(const CMPIBroker *broker, CMPIStatus *status) {
    Core &core = Core::of(broker);
    if (strikes(core, "broker.newArgs", "", status)) {
        return nullptr;
    }
    return make<CMPIArgs>(core, kTracked, {"newArgs", ""}, {});
}

CMPIString *new_string(const CMPIBroker *broker, const char *text, CMPIStatus *status) {
    Core &core = Core::of(broker);
    const std::string subject = text_or_empty(text);
    if (strikes(core, "broker.newString", subject, status)) {
        return nullptr;
    }
    return make_string({core, kTracked, {"newString", subject}, nullptr},
                       text != nullptr ? StringPayload(text) : std::nullopt);
}

CMPIArray *new_array(const CMPIBroker *broker, CMPICount count, CMPIType type, CMPIStatus *status) {
    Core &core = Core::of(broker);
    auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    if (strikes(core, "broker.newArray", cim::type_name(element), status)) {
        return nullptr;
    }
    if (cim::type_name(element) == "unknown" || element == CMPI_ptr) {
        set_status(status, CMPI_RC_ERR_INVALID_DATA_TYPE);
        return nullptr;
    }
    element = element == CMPI_chars ? CMPI_string : element;
    CMPIData null{};
    null.type = element;
    null.state = CMPI_nullValue;
    return make<CMPIArray>(core, kTracked, {"newArray", cim::type_name(element)},
                           {element, count == 0, std::vector<CMPIData>(count, null), {}});
}

CMPIDateTime *make_time(Core &core, const char *maker, const std::string &text) {
    return make<CMPIDateTime>(core, kTracked, {maker, text}, text);
}

CMPIDateTime *new_date_time(const CMPIBroker *broker, CMPIStatus *status) {
    using namespace std::chrono;
    Core &core = Core::of(broker);
    if (strikes(core, "broker.newDateTime", "", status)) {
        return nullptr;
    }
    const auto now = duration_cast<microseconds>(system_clock::now().time_since_epoch());
    return make_time(core, "newDateTime",
                     datetime::from_microseconds(static_cast<std::uint64_t>(now.count()), false));
}

CMPIDateTime *new_date_time_from_binary(const CMPIBroker *broker, CMPIUint64 microseconds,
                                        CMPIBoolean is_interval, CMPIStatus *status) {
    Core &core = Core::of(broker);
    if (strikes(core, "broker.newDateTimeFromBinary", "", status)) {
        return nullptr;
    }
    return make_time(core, "newDateTimeFromBinary",
                     datetime::from_microseconds(microseconds, is_interval != 0));
}

CMPIDateTime *new_date_time_from_chars(const CMPIBroker *broker, const char *text,
                                       CMPIStatus *status) {
    Core &core = Core::of(broker);
    if (strikes(core, "broker.newDateTimeFromChars", text_or_empty(text), status)) {
        return nullptr;
    }
    if (text == nullptr || !datetime::is_valid(text)) {
        set_status(status, CMPI_RC_ERR_INVALID_PARAMETER);
        return nullptr;
    }
    return make_time(core, "newDateTimeFromChars", text);
}

// The selected names; null when all are.
CMPIArray *projection_of(Core &core, const query::Query &query) {
    if (query.selected.empty()) {
        return nullptr;
    }
    cim::Value::Array names;
    for (const std::string &name : query.selected) {
        names.push_back(cim::Value::string(name));
    }
    return to_data({core, kTracked, {"newSelectExp", "projection"}, nullptr},
                   cim::Value::array(CMPI_string, std::move(names)))
        .value.array;
}

CMPISelectExp *new_select_exp(const CMPIBroker *broker, const char *text, const char *language,
                              CMPIArray **projection, CMPIStatus *status) {
    Core &core = Core::of(broker);
    if (strikes(core, "broker.newSelectExp", text_or_empty(text), status)) {
        return nullptr;
    }
    const query::Parsed parsed = query::parse(text_or_empty(text), text_or_empty(language));
    to_cmpi(core, {parsed.code, parsed.message}, status);
    if (parsed.query == nullptr) {
        return nullptr;
    }
    if (projection != nullptr) {
        *projection = projection_of(core, *parsed.query);
    }
    return make<CMPISelectExp>(core, kTracked, {"newSelectExp", parsed.query->text}, parsed.query);
}

// -- Questions about objects --

CMPIBoolean class_path_is_a(const CMPIBroker *broker, const CMPIObjectPath *path,
                            const char *class_name, CMPIStatus *status) {
    const auto *object = open(path, "classPathIsA", status);
    if (object == nullptr || class_name == nullptr) {
        return 0;
    }
    const cim::ObjectPath &target = *object->payload;
    const bool is_a =
        Core::of(broker).repository.is_a(target.name_space, target.class_name, class_name);
    return is_a ? 1 : 0;
}

// Any object is told apart by the table that it points to.
template <class Face>
const Face *as(const void *object) {
    const auto *face = static_cast<const Face *>(object);
    return face != nullptr && face->ft == Traits<Face>::table() ? face : nullptr;
}

template <class... Faces>
std::string_view kind_of(const void *object) {
    std::string_view name;
    ((as<Faces>(object) != nullptr && !(name = kind_name(Traits<Faces>::kKind)).empty()) || ...);
    return name;
}

std::string_view any_kind_of(const void *object) {
    return kind_of<CMPIContext, CMPIResult, CMPIString, CMPIArray, CMPIEnumeration, CMPIInstance,
                   CMPIObjectPath, CMPIArgs, CMPIDateTime, CMPISelectExp, CMPISelectCond,
                   CMPISubCond, CMPIPredicate>(object);
}

CMPIString *to_string(const CMPIBroker *broker, const void *object, CMPIStatus *status) {
    std::string text;
    if (const auto *path = open(as<CMPIObjectPath>(object), "toString", status)) {
        text = cim::to_text(*path->payload);
    } else if (const auto *instance = open(as<CMPIInstance>(object), "toString", status)) {
        text = cim::to_text(instance->payload->instance);
    } else {
        set_status(status, CMPI_RC_ERR_NOT_SUPPORTED);
        return nullptr;
    }
    return make_string({Core::of(broker), kTracked, {"toString", text}, nullptr}, text);
}

CMPIBoolean is_of_type(const CMPIBroker *, const void *object, const char *type_name,
                       CMPIStatus *status) {
    set_status(status, CMPI_RC_OK);
    return type_name != nullptr && any_kind_of(object) == type_name ? 1 : 0;
}

CMPIString *get_type(const CMPIBroker *broker, const void *object, CMPIStatus *status) {
    const std::string name(any_kind_of(object));
    set_status(status, name.empty() ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
    return name.empty()
               ? nullptr
               : make_string({Core::of(broker), kTracked, {"getType", name}, nullptr}, name);
}

// -- Messages: there is no catalogue, no log and no trace behind them --

CMPIString *get_message(const CMPIBroker *broker, const char *, const char *text,
                        CMPIStatus *status, CMPICount, ...) {
    set_status(status, CMPI_RC_ERR_NOT_SUPPORTED);
    return make_string({Core::of(broker), kTracked, {"getMessage", ""}, nullptr},
                       text_or_empty(text));
}

CMPIStatus not_supported(const CMPIBroker *, int, const char *, const char *, const CMPIString *) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

}  // namespace

const CMPIBrokerEncFT kFactoryTable{
    .ftVersion = 1,
    .newInstance = new_instance,
    .newObjectPath = new_object_path,
    .newArgs = new_args,
    .newString = new_string,
    .newArray = new_array,
    .newDateTime = new_date_time,
    .newDateTimeFromBinary = new_date_time_from_binary,
    .newDateTimeFromChars = new_date_time_from_chars,
    .newSelectExp = new_select_exp,
    .classPathIsA = class_path_is_a,
    .toString = to_string,
    .isOfType = is_of_type,
    .getType = get_type,
    .getMessage = get_message,
    .logMessage = not_supported,
    .trace = not_supported,
    .newCMPIError = nullptr,
    .openMessageFile = nullptr,
    .closeMessageFile = nullptr,
    .getMessage2 = nullptr,
};

}  // namespace velkhost::broker
