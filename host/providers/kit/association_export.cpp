#include "host/providers/kit/association_export.h"

#include "host/providers/kit/provider_call.h"

#include <cmpi/cmpimacs.h>

namespace velkhost::providers {
namespace {

// What a traversal asks for (DSP0200, 5.3.2.13 and on). A null pointer stands for any.
struct Query {
    const char *association_class;
    const char *result_class;  // of the instance at the far end
    const char *role;
    const char *result_role;
};

// One end of a link with its role, seen from the other.
struct End {
    const Element &element;
    const char *role;
};

bool is_any_or(const char *wanted, const char *role) {
    return wanted == nullptr || *wanted == '\0' || same_name(wanted, role);
}

bool is_a(const Maker &maker, const std::string &class_name, const char *wanted) {
    if (wanted == nullptr || *wanted == '\0' || same_name(class_name, wanted)) {
        return true;
    }
    return CMClassPathIsA(maker.broker, maker.path({class_name, {}}), wanted, nullptr) != 0;
}

// Whether the link leads from `path`, at the near end, to what the query asks for.
bool leads(const Maker &maker, const Path &path, const Query &query, const End &near,
           const End &far) {
    return path.names(near.element.reference()) && is_any_or(query.role, near.role) &&
           is_any_or(query.result_role, far.role) &&
           is_a(maker, far.element.class_name, query.result_class);
}

// Calls `found(link, far element)` for each link that a traversal from `path` meets.
template <typename Found>
void traverse(Provider &provider, const Maker &maker, const CMPIObjectPath *path,
              const Query &query, Found found) {
    auto &association = static_cast<Association &>(provider);
    if (!is_a(maker, association.class_name(), query.association_class)) {
        return;
    }
    const Association::Roles roles = association.roles();
    for (const Link &link : association.links()) {
        const End first{link.first, roles.first};
        const End second{link.second, roles.second};
        if (leads(maker, Path(path), query, first, second)) {
            found(link, link.second);
        } else if (leads(maker, Path(path), query, second, first)) {
            found(link, link.first);
        }
    }
}

// NOLINTNEXTLINE(readability-function-size): the standard gives the slot nine parameters
CMPIStatus associators(CMPIAssociationMI *mi, const CMPIContext * /*context*/,
                       const CMPIResult *result, const CMPIObjectPath *path,
                       const char *association_class, const char *result_class, const char *role,
                       const char *result_role, const char **wanted) {
    const Query query{association_class, result_class, role, result_role};
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        traverse(provider, maker, path, query, [&](const Link & /*link*/, const Element &far) {
            CMReturnInstance(result, maker.instance(far.class_name, far.instance, wanted));
        });
        CMReturnDone(result);
    });
}

CMPIStatus associator_names(CMPIAssociationMI *mi, const CMPIContext * /*context*/,
                            const CMPIResult *result, const CMPIObjectPath *path,
                            const char *association_class, const char *result_class,
                            const char *role, const char *result_role) {
    const Query query{association_class, result_class, role, result_role};
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        traverse(provider, maker, path, query, [&](const Link & /*link*/, const Element &far) {
            CMReturnObjectPath(result, maker.path(far.reference()));
        });
        CMReturnDone(result);
    });
}

CMPIStatus references(CMPIAssociationMI *mi, const CMPIContext * /*context*/,
                      const CMPIResult *result, const CMPIObjectPath *path,
                      const char *result_class, const char *role, const char **wanted) {
    const Query query{result_class, nullptr, role, nullptr};
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        const auto &association = static_cast<const Association &>(provider);
        traverse(provider, maker, path, query, [&](const Link &link, const Element & /*far*/) {
            CMReturnInstance(result, maker.instance(association.class_name(),
                                                    association.as_instance(link), wanted));
        });
        CMReturnDone(result);
    });
}

CMPIStatus reference_names(CMPIAssociationMI *mi, const CMPIContext * /*context*/,
                           const CMPIResult *result, const CMPIObjectPath *path,
                           const char *result_class, const char *role) {
    const Query query{result_class, nullptr, role, nullptr};
    return run(mi, path, [&](Provider &provider, const Maker &maker) {
        const auto &association = static_cast<const Association &>(provider);
        traverse(provider, maker, path, query, [&](const Link &link, const Element & /*far*/) {
            CMReturnObjectPath(
                result, maker.path({association.class_name(), association.as_instance(link).keys}));
        });
        CMReturnDone(result);
    });
}

}  // namespace

CMPIAssociationMIFT association_table(const char *name) {
    CMPIAssociationMIFT table{};
    table.ftVersion = kTableVersion;
    table.miVersion = kTableVersion;
    table.miName = name;
    table.cleanup = clean_up;
    table.associators = associators;
    table.associatorNames = associator_names;
    table.references = references;
    table.referenceNames = reference_names;
    return table;
}

}  // namespace velkhost::providers
