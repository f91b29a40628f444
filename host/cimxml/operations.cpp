#include "host/cimxml/operations.h"

#include "host/cim/names.h"
#include "host/cimxml/errors.h"

#include <algorithm>
#include <array>

namespace velkhost::cimxml {
namespace {

struct Operation {
    std::string_view name;
    void (*run)(const Call &);
    bool returns;  // whether it has an IRETURNVALUE
};

constexpr std::array kOperations = {
    Operation{"GetClass", &get_class, true},
    Operation{"EnumerateClasses", &enumerate_classes, true},
    Operation{"EnumerateClassNames", &enumerate_class_names, true},
    Operation{"GetInstance", &get_instance, true},
    Operation{"EnumerateInstances", &enumerate_instances, true},
    Operation{"EnumerateInstanceNames", &enumerate_instance_names, true},
    Operation{"DeleteInstance", &delete_instance, false},
    Operation{"Associators", &associators, true},
    Operation{"AssociatorNames", &associator_names, true},
    Operation{"References", &references, true},
    Operation{"ReferenceNames", &reference_names, true},
};

}  // namespace

const std::string &Call::name_space() const {
    if (!broker.repository().has_namespace(request.object)) {
        throw CimError(CMPI_RC_ERR_INVALID_NAMESPACE, "Invalid namespace");
    }
    return request.object;
}

broker::RequestOptions Call::options(CMPIFlags flags) const {
    broker::RequestOptions result;
    result.principal = principal;
    result.flags = flags;
    return result;
}

void run_intrinsic(const Call &call) {
    const auto *const operation = std::find_if(
        kOperations.begin(), kOperations.end(),
        [&call](const Operation &each) { return cim::same_name(each.name, call.request.method); });
    if (operation == kOperations.end()) {
        throw CimError(CMPI_RC_ERR_NOT_SUPPORTED, "The requested operation is not supported");
    }
    static_cast<void>(call.name_space());
    if (!operation->returns) {
        operation->run(call);
        return;
    }
    const XmlWriter::Scope value(call.out, "IRETURNVALUE");
    operation->run(call);
}

broker::ClassPointer require_class(const Call &call, const std::string &name) {
    auto declared = call.broker.repository().find_class(call.name_space(), name);
    if (declared == nullptr) {
        throw CimError(CMPI_RC_ERR_INVALID_CLASS, "Class not found");
    }
    return declared;
}

}  // namespace velkhost::cimxml
