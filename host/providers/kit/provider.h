// What a provider of one class answers. Derive, answer in plain data, and export the class with
// VELKHOST_EXPORT_PROVIDER (kit/export.h). Calls come from any thread, several at once. Anything
// thrown becomes a CIM status: a CimError its own, any other exception "failed" with its text.
#pragma once

#include "host/providers/kit/data.h"
#include "host/providers/kit/reading.h"

#include <string>
#include <vector>

namespace velkhost::providers {

class Provider {
  public:
    Provider() = default;
    virtual ~Provider() = default;
    Provider(const Provider &) = delete;
    Provider &operator=(const Provider &) = delete;

    [[nodiscard]] virtual const char *class_name() const = 0;

    // Every instance of the class as it is now; for enumerations.
    virtual std::vector<Instance> instances() = 0;

    // The instance that `path` names. By default the one of instances() that has exactly its keys;
    // throws CimError "not found".
    virtual Instance read(const Path &path);

    // Deletes the instance that `path` names. By default clients cannot: throws CimError "not
    // supported".
    virtual void remove(const Path &path);

    // By default the class has no methods.
    virtual MethodResult invoke(const Path &target, const std::string &method, const Args &in);

    // Whether the library may be unloaded while the broker runs on: false when it holds state.
    [[nodiscard]] virtual bool may_unload() const { return true; }

  protected:
    [[noreturn]] void fail_no_method(const std::string &method) const;
    [[noreturn]] void fail_not_found() const;
};

}  // namespace velkhost::providers
