#include "tests/support/release_watch.h"

#include <utility>

namespace velktest {
namespace {

// The tables' functions find the watch by no other way: there is one at a time.
const CMPIBroker *real = nullptr;
std::vector<CMPIObjectPath *> paths;
std::vector<CMPIInstance *> instances;
std::vector<CMPIArgs *> args;
std::vector<CMPIArray *> arrays;
std::vector<CMPIEnumeration *> enumerations;

template <class Object>
Object *noted(std::vector<Object *> &list, Object *object) {
    if (object != nullptr) {
        list.push_back(object);
    }
    return object;
}

// Whether the object still answers.
template <class Object>
bool is_alive(Object *object) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    Object *copy = object->ft->clone(object, &status);
    if (copy == nullptr || status.rc != CMPI_RC_OK) {
        return false;
    }
    copy->ft->release(copy);
    return true;
}

template <class Object>
void take_alive(std::vector<Object *> &list, const char *kind, std::vector<std::string> &alive) {
    for (Object *object : std::exchange(list, {})) {
        if (is_alive(object)) {
            alive.emplace_back(kind);
        }
    }
}

}  // namespace

ReleaseWatch::ReleaseWatch(const CMPIBroker *broker)
    : factory_(*broker->eft), up_calls_(*broker->bft), face_(*broker) {
    real = broker;
    factory_.newObjectPath = &new_path;
    factory_.newInstance = &new_instance;
    factory_.newArgs = &new_args;
    factory_.newArray = &new_array;
    up_calls_.getInstance = &get_instance;
    up_calls_.enumerateInstances = &enumerate;
    up_calls_.associators = &associators;
    face_.eft = &factory_;
    face_.bft = &up_calls_;
}

std::vector<std::string> ReleaseWatch::unreleased() {
    std::vector<std::string> alive;
    take_alive(paths, "path", alive);
    take_alive(instances, "instance", alive);
    take_alive(args, "argument list", alive);
    take_alive(arrays, "array", alive);
    take_alive(enumerations, "enumeration", alive);
    return alive;
}

CMPIObjectPath *ReleaseWatch::new_path(const CMPIBroker *, const char *name_space,
                                       const char *class_name, CMPIStatus *status) {
    return noted(paths, real->eft->newObjectPath(real, name_space, class_name, status));
}

CMPIInstance *ReleaseWatch::new_instance(const CMPIBroker *, const CMPIObjectPath *path,
                                         CMPIStatus *status) {
    return noted(instances, real->eft->newInstance(real, path, status));
}

CMPIArgs *ReleaseWatch::new_args(const CMPIBroker *, CMPIStatus *status) {
    return noted(args, real->eft->newArgs(real, status));
}

CMPIInstance *ReleaseWatch::get_instance(const CMPIBroker *, const CMPIContext *context,
                                         const CMPIObjectPath *path, const char **properties,
                                         CMPIStatus *status) {
    return noted(instances, real->bft->getInstance(real, context, path, properties, status));
}

CMPIArray *ReleaseWatch::new_array(const CMPIBroker *, CMPICount count, CMPIType type,
                                   CMPIStatus *status) {
    return noted(arrays, real->eft->newArray(real, count, type, status));
}

CMPIEnumeration *ReleaseWatch::enumerate(const CMPIBroker *, const CMPIContext *context,
                                         const CMPIObjectPath *path, const char **properties,
                                         CMPIStatus *status) {
    return noted(enumerations,
                 real->bft->enumerateInstances(real, context, path, properties, status));
}

CMPIEnumeration *ReleaseWatch::associators(const CMPIBroker *, const CMPIContext *context,
                                           const CMPIObjectPath *source, const char *association,
                                           const char *result_class, const char *role,
                                           const char *result_role, const char **properties,
                                           CMPIStatus *status) {
    return noted(enumerations,
                 real->bft->associators(real, context, source, association, result_class, role,
                                        result_role, properties, status));
}

}  // namespace velktest
