// Watches that objects which the library has the broker make do not outlive their use.
#pragma once

#include <cmpi/cmpift.h>

#include <string>
#include <vector>

namespace velktest {

// Stands in front of a broker that tells released objects apart (a strict ledger). Notes every
// path, instance, argument list, array and enumeration that is made or got through it; for one
// thread, and one watch at a time.
class ReleaseWatch {
  public:
    explicit ReleaseWatch(const CMPIBroker *broker);
    ReleaseWatch(const ReleaseWatch &) = delete;
    ReleaseWatch &operator=(const ReleaseWatch &) = delete;

    // What to hand to the library.
    [[nodiscard]] const CMPIBroker *broker() const { return &face_; }

    // The objects since the last call that are still alive, by kind and class. Asking released
    // ones leaves findings in the ledger.
    std::vector<std::string> unreleased();

  private:
    static CMPIObjectPath *new_path(const CMPIBroker *broker, const char *name_space,
                                    const char *class_name, CMPIStatus *status);
    static CMPIInstance *new_instance(const CMPIBroker *broker, const CMPIObjectPath *path,
                                      CMPIStatus *status);
    static CMPIArgs *new_args(const CMPIBroker *broker, CMPIStatus *status);
    static CMPIInstance *get_instance(const CMPIBroker *broker, const CMPIContext *context,
                                      const CMPIObjectPath *path, const char **properties,
                                      CMPIStatus *status);
    static CMPIArray *new_array(const CMPIBroker *broker, CMPICount count, CMPIType type,
                                CMPIStatus *status);
    static CMPIEnumeration *enumerate(const CMPIBroker *broker, const CMPIContext *context,
                                      const CMPIObjectPath *path, const char **properties,
                                      CMPIStatus *status);
    static CMPIEnumeration *associators(const CMPIBroker *broker, const CMPIContext *context,
                                        const CMPIObjectPath *source, const char *association,
                                        const char *result_class, const char *role,
                                        const char *result_role, const char **properties,
                                        CMPIStatus *status);

    CMPIBrokerEncFT factory_;
    CMPIBrokerFT up_calls_;
    CMPIBroker face_;
};

}  // namespace velktest
