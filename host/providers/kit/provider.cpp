#include "host/providers/kit/provider.h"

#include "host/providers/kit/cim_error.h"

namespace velkhost::providers {

Instance Provider::read(const Path &path) {
    for (Instance &instance : instances()) {
        if (path.has_exactly(instance.keys)) {
            return std::move(instance);
        }
    }
    fail_not_found();
}

void Provider::remove(const Path & /*path*/) {
    throw CimError(CMPI_RC_ERR_NOT_SUPPORTED,
                   "Instances of this class are made by the service itself and only read");
}

MethodResult Provider::invoke(const Path & /*target*/, const std::string &method,
                              const Args & /*in*/) {
    fail_no_method(method);
}

void Provider::fail_no_method(const std::string &method) const {
    throw CimError(CMPI_RC_ERR_METHOD_NOT_FOUND,
                   std::string(class_name()) + " has no method " + method);
}

void Provider::fail_not_found() const {
    throw CimError(CMPI_RC_ERR_NOT_FOUND,
                   std::string("No instance of ") + class_name() + " has these keys");
}

}  // namespace velkhost::providers
