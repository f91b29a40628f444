// The CMPI side of a provider: function tables and factories.
#pragma once

#include "host/providers/kit/provider.h"
#include "host/providers/kit/shared_while_used.h"

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <exception>
#include <memory>

namespace velkhost::providers {

// What stands behind the `hdl` of a provider object. All kinds of a class share one provider; it
// goes when the last of them has been cleaned up.
struct Binding {
    const CMPIBroker *broker = nullptr;
    std::shared_ptr<Provider> provider;
};

CMPIInstanceMIFT instance_table(const char *name);
CMPIMethodMIFT method_table(const char *name);

// Tells the broker that a factory ended well, or with the exception in flight.
void report_made(CMPIStatus *status);
void report_exception(const CMPIBroker *broker, CMPIStatus *status);

// The body of a factory. `Mi` is the kind of provider object, `table` its function table.
template <typename Class, typename Mi, typename Table>
Mi *make_mi(const CMPIBroker *broker, CMPIStatus *status, Table &table) {
    static Binding binding;
    static Mi mi;
    try {
        binding = {broker, shared_while_used<Class>()};
        mi = {&binding, &table};
    } catch (const std::exception &) {
        report_exception(broker, status);
        return nullptr;
    }
    report_made(status);
    return &mi;
}

}  // namespace velkhost::providers

// Exports `Class` (derived from Provider) as the provider `NAME`, for instances and methods.
// A macro because a factory's symbol is made from the provider's name.
// NOLINTBEGIN(cppcoreguidelines-macro-usage,bugprone-macro-parentheses)
#define VELKHOST_EXPORT_FACTORY(NAME, Class, KIND, kind)                                   \
    extern "C" [[gnu::visibility("default")]] CMPI##KIND##MI *NAME##_Create_##KIND##MI(    \
        const CMPIBroker *broker, const CMPIContext * /*context*/, CMPIStatus *status) {   \
        static CMPI##KIND##MIFT table = velkhost::providers::kind##_table(#kind #NAME);    \
        return velkhost::providers::make_mi<Class, CMPI##KIND##MI>(broker, status, table); \
    }                                                                                      \
    static_assert(true, "takes the semicolon")
#define VELKHOST_EXPORT_PROVIDER(NAME, Class)                 \
    VELKHOST_EXPORT_FACTORY(NAME, Class, Instance, instance); \
    VELKHOST_EXPORT_FACTORY(NAME, Class, Method, method)
// NOLINTEND(cppcoreguidelines-macro-usage,bugprone-macro-parentheses)
