// Extrinsic methods (DSP0200, 5.4). As with brokers of the sfcb kind, neither the method's name nor
// its parameters are checked: what is declared tells the types, and the provider judges the rest.
#include "host/cim/names.h"
#include "host/cimxml/errors.h"
#include "host/cimxml/operations.h"
#include "host/cimxml/value_writer.h"

#include <algorithm>

namespace velkhost::cimxml {
namespace {

CMPIType declared_type(const cim::MethodDecl *method, std::string_view parameter) {
    if (method == nullptr) {
        return CMPI_null;
    }
    const auto place = std::find_if(
        method->parameters.begin(), method->parameters.end(),
        [parameter](const auto &each) { return cim::same_name(each.name, parameter); });
    return place == method->parameters.end() ? CMPI_null : place->type.type;
}

cim::NamedValues arguments(const Call &call, const cim::ObjectPath &target) {
    const auto declared = call.broker.repository().find_class(target);
    const cim::MethodDecl *const method =
        declared != nullptr ? declared->find_method(call.request.method) : nullptr;
    const ValueReader reader(call.broker.repository(), target.name_space);
    cim::NamedValues result;
    for (std::size_t i = 1; i < call.request.call.children.size(); ++i) {
        const XmlElement &parameter = call.request.call.children[i];
        if (parameter.name != "PARAMVALUE") {
            fail_not_valid(parameter.name + " stands among the parameters");
        }
        const std::string &name = required_attribute(parameter, "NAME");
        if (result.find(name) != nullptr) {
            throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "parameter " + name + " is given twice");
        }
        result.set(name, reader.parameter(parameter, declared_type(method, name)));
    }
    return result;
}

void write_results(XmlWriter &out, const broker::MethodReply &reply) {
    if (reply.return_value) {
        const std::string type = type_attribute_of(reply.return_value->type());
        const XmlWriter::Scope scope(out, "RETURNVALUE", {{"PARAMTYPE", type}});
        write_value(out, *reply.return_value);
    }
    for (const cim::NamedValue &value : reply.out) {
        const std::string type = type_attribute_of(value.value.type());
        const bool embedded = (value.value.type() & ~CMPI_ARRAY) == CMPI_instance;
        const XmlWriter::Scope scope(out, "PARAMVALUE",
                                     {{"NAME", value.name},
                                      {"PARAMTYPE", type},
                                      {embedded ? "EmbeddedObject" : "", "instance"}});
        write_value(out, value.value);
    }
}

}  // namespace

void run_method(const Call &call) {
    const ValueReader reader(call.broker.repository(), {});
    const cim::ObjectPath target = reader.path(call.request.call.children.front());
    const auto reply = call.broker.invoke_method(target, call.request.method,
                                                 arguments(call, target), call.options());
    check(reply.status);
    write_results(call.out, reply);
}

}  // namespace velkhost::cimxml
