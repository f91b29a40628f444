// Between neutral values and what crosses the CMPI tables.
#pragma once

#include "host/broker/object.h"
#include "host/broker/status.h"

#include <optional>

namespace velkhost::broker {

// How the objects of one answer are made.
struct Making {
    Core &core;
    Custody custody = Custody::kTracked;
    Origin origin;
    Parts *parts = nullptr;  // receives them where custody is kPart
};

// The value as a getter returns it; strings, paths, arrays and so on become new objects.
CMPIData to_data(const Making &making, const cim::Value &value);

// An object of one kind, made as `making` says.
CMPIString *make_string(const Making &making, StringPayload text);
CMPIObjectPath *make_path(const Making &making, cim::ObjectPath path);
CMPIInstance *make_instance(const Making &making, cim::Instance instance);
// A sequence over the elements of an array value, which become parts of it.
Object<CMPIEnumeration> *make_enumeration(const Making &making, const cim::Value &elements);

// A value that a caller gave with a type code: `value` points to a CMPIValue, but for CMPI_chars it
// is the text itself. Null pointers give the null of that type, chars become string unless
// `keep_chars`. No value for a code that stands for no storable value.
std::optional<cim::Value> from_caller(const CMPIValue *value, CMPIType type,
                                      bool keep_chars = false);

// The content of an array object.
cim::Value array_value(const ArrayPayload &array);

// What getters answer for an item that is not there: type 0, state notFound.
CMPIData not_found();

// The text of a string object, "" without one.
std::string text_of(const CMPIString *string);

Status from_cmpi(const CMPIStatus &status);
// Sets a status out-parameter, its message as a tracked string.
void to_cmpi(Core &core, const Status &status, CMPIStatus *out);
CMPIStatus to_cmpi(Core &core, const Status &status);

// A null-terminated list of names; a null list gives no value.
using NameList = std::optional<std::vector<std::string>>;
NameList name_list(const char **names);

}  // namespace velkhost::broker
