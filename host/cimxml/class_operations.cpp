// Operations on classes (DSP0200, 5.3.2.2, 5.3.2.9 and 5.3.2.10).
#include "host/cim/names.h"
#include "host/cimxml/class_writer.h"
#include "host/cimxml/errors.h"
#include "host/cimxml/operations.h"

namespace velkhost::cimxml {
namespace {

ClassForm form_of(const Parameters &in) {
    ClassForm form;
    form.local_only = in.flag("LocalOnly", true);
    form.qualifiers = in.flag("IncludeQualifiers", true);
    form.class_origin = in.flag("IncludeClassOrigin", false);
    return form;
}

// What an enumeration starts from: the classes below `ancestor`, or below none; the nearest ones
// alone unless `deep`.
std::vector<broker::ClassPointer> classes_below(const Call &call, const std::string &ancestor,
                                                bool deep) {
    if (!ancestor.empty()) {
        require_class(call, ancestor);
    }
    auto classes = call.broker.repository().classes(call.name_space(), ancestor);
    std::erase_if(classes, [&](const broker::ClassPointer &each) {
        const cim::ClassDecl &declaration = each->declaration;
        const bool itself = !ancestor.empty() && cim::same_name(declaration.name, ancestor);
        return itself || (!deep && !cim::same_name(declaration.superclass, ancestor));
    });
    return classes;
}

}  // namespace

void get_class(const Call &call) {
    const Parameters in(call.request.call, {"ClassName", "LocalOnly", "IncludeQualifiers",
                                            "IncludeClassOrigin", "PropertyList"});
    static_cast<void>(in.require("ClassName"));
    const auto declared =
        call.broker.repository().find_class(call.name_space(), in.class_name("ClassName"));
    if (declared == nullptr) {
        throw CimError(CMPI_RC_ERR_NOT_FOUND, "The requested object could not be found");
    }
    ClassForm form = form_of(in);
    form.wanted = membership(in.property_list());
    write_class(call.out, call.broker.repository(), call.name_space(), *declared, form);
}

void enumerate_classes(const Call &call) {
    const Parameters in(call.request.call, {"ClassName", "DeepInheritance", "LocalOnly",
                                            "IncludeQualifiers", "IncludeClassOrigin"});
    const ClassForm form = form_of(in);
    for (const auto &declared :
         classes_below(call, in.class_name("ClassName"), in.flag("DeepInheritance", false))) {
        write_class(call.out, call.broker.repository(), call.name_space(), *declared, form);
    }
}

void enumerate_class_names(const Call &call) {
    const Parameters in(call.request.call, {"ClassName", "DeepInheritance"});
    for (const auto &declared :
         classes_below(call, in.class_name("ClassName"), in.flag("DeepInheritance", false))) {
        call.out.empty("CLASSNAME", {{"NAME", declared->declaration.name}});
    }
}

}  // namespace velkhost::cimxml
