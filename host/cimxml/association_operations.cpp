// Operations along associations (DSP0200, 5.3.2.14 to 5.3.2.17), from instances.
#include "host/cimxml/errors.h"
#include "host/cimxml/instance_form.h"
#include "host/cimxml/operations.h"
#include "host/cimxml/value_writer.h"

namespace velkhost::cimxml {
namespace {

// The instance that the request starts from.
cim::ObjectPath source(const Call &call, const Parameters &in) {
    const XmlElement &object = in.require("ObjectName");
    if (object.name == "CLASSNAME") {
        throw CimError(CMPI_RC_ERR_NOT_SUPPORTED,
                       "Associations of classes are not supported, only those of instances");
    }
    return call.reader().instance_name(object);
}

broker::AssociationFilter filter_of(const Parameters &in) {
    return {in.class_name("AssocClass"), in.class_name("ResultClass"), in.text("Role"),
            in.text("ResultRole"), in.property_list()};
}

void write_instances(const Call &call, const Parameters &in, const broker::InstancesReply &reply) {
    check(reply.status);
    for (const cim::Instance &instance : reply.instances) {
        const XmlWriter::Scope object(call.out, "VALUE.OBJECTWITHPATH");
        write_instance_path(call.out, path_of(call, instance), call.host);
        write_instance(call.out, instance, instance_form(call, in, instance));
    }
}

void write_paths(const Call &call, const broker::PathsReply &reply) {
    check(reply.status);
    for (const cim::ObjectPath &path : reply.paths) {
        const XmlWriter::Scope object(call.out, "OBJECTPATH");
        write_instance_path(call.out, path, call.host);
    }
}

}  // namespace

void associators(const Call &call) {
    const Parameters in(call.request.call,
                        {"ObjectName", "AssocClass", "ResultClass", "Role", "ResultRole",
                         "IncludeQualifiers", "IncludeClassOrigin", "PropertyList"});
    write_instances(call, in,
                    call.broker.associators(source(call, in), filter_of(in), call.options()));
}

void associator_names(const Call &call) {
    const Parameters in(call.request.call,
                        {"ObjectName", "AssocClass", "ResultClass", "Role", "ResultRole"});
    write_paths(call,
                call.broker.associator_names(source(call, in), filter_of(in), call.options()));
}

void references(const Call &call) {
    const Parameters in(call.request.call,
                        {"ObjectName", "ResultClass", "Role", "IncludeQualifiers",
                         "IncludeClassOrigin", "PropertyList"});
    write_instances(call, in,
                    call.broker.references(source(call, in), filter_of(in), call.options()));
}

void reference_names(const Call &call) {
    const Parameters in(call.request.call, {"ObjectName", "ResultClass", "Role"});
    write_paths(call, call.broker.reference_names(source(call, in), filter_of(in), call.options()));
}

}  // namespace velkhost::cimxml
