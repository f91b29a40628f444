// The frame that all encapsulated objects share: face, tag, payload; making, opening, releasing
// and cloning them.
#pragma once

#include "host/broker/core.h"
#include "host/broker/ledger.h"
#include "host/broker/payloads.h"
#include "host/broker/tables.h"

#include <cmpi/cmpift.h>

#include <optional>
#include <type_traits>
#include <utility>

namespace velkhost::broker {

template <class Face>
struct Traits;

template <ObjectKind Kind, class PayloadType, const auto &Table>
struct TraitsOf {
    using Payload = PayloadType;
    static constexpr ObjectKind kKind = Kind;
    // The object structs of 2.0 have pointers to non-const tables; nobody writes through them.
    static auto *table() { return const_cast<std::remove_cvref_t<decltype(Table)> *>(&Table); }
};

// clang-format off
template <> struct Traits<CMPIContext>     : TraitsOf<ObjectKind::kContext,     ContextPayload,     kContextTable> {};
template <> struct Traits<CMPIResult>      : TraitsOf<ObjectKind::kResult,      ResultPayload,      kResultTable> {};
template <> struct Traits<CMPIString>      : TraitsOf<ObjectKind::kString,      StringPayload,      kStringTable> {};
template <> struct Traits<CMPIArray>       : TraitsOf<ObjectKind::kArray,       ArrayPayload,       kArrayTable> {};
template <> struct Traits<CMPIEnumeration> : TraitsOf<ObjectKind::kEnumeration, EnumerationPayload, kEnumerationTable> {};
template <> struct Traits<CMPIInstance>    : TraitsOf<ObjectKind::kInstance,    InstancePayload,    kInstanceTable> {};
template <> struct Traits<CMPIObjectPath>  : TraitsOf<ObjectKind::kObjectPath,  PathPayload,        kObjectPathTable> {};
template <> struct Traits<CMPIArgs>        : TraitsOf<ObjectKind::kArgs,        ArgsPayload,        kArgsTable> {};
template <> struct Traits<CMPIDateTime>    : TraitsOf<ObjectKind::kDateTime,    DateTimePayload,    kDateTimeTable> {};
template <> struct Traits<CMPISelectExp>   : TraitsOf<ObjectKind::kSelectExp,   SelectExpPayload,   kSelectExpTable> {};
template <> struct Traits<CMPISelectCond>  : TraitsOf<ObjectKind::kSelectCond,  SelectCondPayload,  kSelectCondTable> {};
template <> struct Traits<CMPISubCond>     : TraitsOf<ObjectKind::kSubCond,     SubCondPayload,     kSubCondTable> {};
template <> struct Traits<CMPIPredicate>   : TraitsOf<ObjectKind::kPredicate,   PredicatePayload,   kPredicateTable> {};
// clang-format on

// What readers of a released string's bare text find.
inline constexpr char kReleasedText[] = "(text of a released CMPIString)";

template <class Face>
struct Object : Face {
    using Payload = typename Traits<Face>::Payload;

    Object(Core &core, Custody custody, Origin origin, Payload content)
        : tag(core, Traits<Face>::kKind, custody, std::move(origin), &bury, &destroy),
          payload(std::move(content)) {
        tag.object = this;
        this->ft = Traits<Face>::table();
        this->hdl = &tag;
        if constexpr (std::is_same_v<Face, CMPIString>) {
            this->hdl = *payload ? (*payload)->data() : nullptr;
        }
    }

    static Object &of(Tag &tag) { return *static_cast<Object *>(tag.object); }

    static void bury(Tag &tag) {
        Object &self = of(tag);
        if constexpr (std::is_same_v<Face, CMPIString>) {
            self.hdl = const_cast<char *>(kReleasedText);
        }
        self.payload.reset();
    }

    static void destroy(Tag &tag) { delete &of(tag); }

    Tag tag;
    std::optional<Payload> payload;
};

// A new object in the books of its broker.
template <class Face>
Object<Face> *make(Core &core, Custody custody, Origin origin,
                   typename Traits<Face>::Payload payload) {
    auto *object = new Object<Face>(core, custody, std::move(origin), std::move(payload));
    core.ledger->enroll(object->tag);
    return object;
}

inline void set_status(CMPIStatus *status, CMPIrc rc, CMPIString *message = nullptr) {
    if (status != nullptr) {
        *status = {rc, message};
    }
}

// The object behind a face, with the status set to 0; null with 60 when it is none of this broker's
// or is gone. `function` is the slot that asks, as findings name it.
template <class Face>
Object<Face> *open(const Face *face, const char *function, CMPIStatus *status = nullptr) {
    const bool ours = face != nullptr && face->ft == Traits<Face>::table();
    auto *object = ours ? static_cast<Object<Face> *>(const_cast<Face *>(face)) : nullptr;
    const bool usable = ours && object->tag.ledger.usable(object->tag, function);
    set_status(status, usable ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return usable ? object : nullptr;
}

// The release slot of every table.
template <class Face>
CMPIStatus release(Face *face) {
    if (face == nullptr || face->ft != Traits<Face>::table()) {
        return {CMPI_RC_ERR_INVALID_HANDLE, nullptr};
    }
    Tag &tag = static_cast<Object<Face> *>(face)->tag;
    return {tag.ledger.release(tag), nullptr};
}

// The clone slot of the tables whose payload can simply be copied.
template <class Face>
Face *clone(const Face *face, CMPIStatus *status) {
    auto *object = open(face, "clone", status);
    if (object == nullptr) {
        return nullptr;
    }
    return make<Face>(object->tag.core, Custody::kClone, {"clone", object->tag.origin.subject},
                      *object->payload);
}

}  // namespace velkhost::broker
