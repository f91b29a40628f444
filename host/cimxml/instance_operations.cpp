// Operations on instances (DSP0200, 5.3.2.3, 5.3.2.5, 5.3.2.11 and 5.3.2.12). Instances are always
// shown with what they inherit and without qualifiers, as the standard allows for LocalOnly and
// IncludeQualifiers.
#include "host/cimxml/class_writer.h"
#include "host/cimxml/errors.h"
#include "host/cimxml/instance_form.h"
#include "host/cimxml/operations.h"
#include "host/cimxml/value_writer.h"

#include <utility>

namespace velkhost::cimxml {
namespace {

cim::ObjectPath class_path(const Call &call, const Parameters &in) {
    static_cast<void>(in.require("ClassName"));
    return {{}, call.name_space(), in.class_name("ClassName"), {}};
}

// Without DeepInheritance, subclasses are shown as the class that was asked for.
void leave_out_subclass_properties(InstanceForm &form, broker::ClassPointer asked) {
    auto wanted = std::move(form.wanted);
    form.wanted = [wanted = std::move(wanted), asked = std::move(asked)](std::string_view name) {
        return asked->find_property(name) != nullptr && (!wanted || wanted(name));
    };
}

}  // namespace

InstanceForm instance_form(const Call &call, const Parameters &in, const cim::Instance &instance) {
    InstanceForm form;
    form.wanted = membership(in.property_list());
    if (!in.flag("IncludeClassOrigin", false)) {
        return form;
    }
    const broker::Repository &repository = call.broker.repository();
    const auto declared = repository.find_class(instance.path);
    form.origin = [&repository, name_space = instance.path.name_space,
                   declared](std::string_view property) {
        return declared == nullptr ? std::string()
                                   : class_origin(repository, name_space, *declared, property);
    };
    return form;
}

cim::ObjectPath path_of(const Call &call, const cim::Instance &instance) {
    return call.broker.repository().path_of(instance).value_or(instance.path);
}

void get_instance(const Call &call) {
    const Parameters in(call.request.call, {"InstanceName", "LocalOnly", "IncludeQualifiers",
                                            "IncludeClassOrigin", "PropertyList"});
    const cim::ObjectPath path = call.reader().instance_name(in.require("InstanceName"));
    const CMPIFlags flags =
        in.flag("IncludeClassOrigin", false) ? CMPI_FLAG_IncludeClassOrigin : 0U;
    const auto reply = call.broker.get_instance(path, in.property_list(), call.options(flags));
    check(reply.status);
    if (!reply.instance) {
        throw CimError(CMPI_RC_ERR_NOT_FOUND, "The requested object could not be found");
    }
    write_instance(call.out, *reply.instance, instance_form(call, in, *reply.instance));
}

void enumerate_instances(const Call &call) {
    const Parameters in(call.request.call,
                        {"ClassName", "LocalOnly", "DeepInheritance", "IncludeQualifiers",
                         "IncludeClassOrigin", "PropertyList"});
    const cim::ObjectPath path = class_path(call, in);
    const bool deep = in.flag("DeepInheritance", true);
    const CMPIFlags flags =
        (deep ? CMPI_FLAG_DeepInheritance : 0U) |
        (in.flag("IncludeClassOrigin", false) ? CMPI_FLAG_IncludeClassOrigin : 0U);
    const auto reply =
        call.broker.enumerate_instances(path, in.property_list(), call.options(flags));
    check(reply.status);
    for (const cim::Instance &instance : reply.instances) {
        InstanceForm form = instance_form(call, in, instance);
        if (!deep) {
            leave_out_subclass_properties(form, require_class(call, path.class_name));
        }
        const XmlWriter::Scope named(call.out, "VALUE.NAMEDINSTANCE");
        write_instance_name(call.out, path_of(call, instance));
        write_instance(call.out, instance, form);
    }
}

void enumerate_instance_names(const Call &call) {
    const Parameters in(call.request.call, {"ClassName"});
    const auto reply = call.broker.enumerate_instance_names(class_path(call, in), call.options());
    check(reply.status);
    for (const cim::ObjectPath &path : reply.paths) {
        write_instance_name(call.out, path);
    }
}

void delete_instance(const Call &call) {
    const Parameters in(call.request.call, {"InstanceName"});
    check(call.broker.delete_instance(call.reader().instance_name(in.require("InstanceName")),
                                      call.options()));
}

}  // namespace velkhost::cimxml
