// What the ledger knows of one object. Every object of the broker carries a tag behind its face.
#pragma once

#include <atomic>
#include <cstdint>
#include <string>
#include <string_view>

namespace velkhost::broker {

class Ledger;
struct Core;

enum class ObjectKind : std::uint8_t {
    kContext,
    kResult,
    kString,
    kArray,
    kEnumeration,
    kInstance,
    kObjectPath,
    kArgs,
    kDateTime,
    kSelectExp,
    kSelectCond,
    kSubCond,
    kPredicate,
};

// "CMPIString" and so on.
std::string_view kind_name(ObjectKind kind);

// Who frees an object.
enum class Custody : std::uint8_t {
    kTracked,       // the broker, with the request or the thread that made it
    kClone,         // whoever asked for it, with release
    kCallArgument,  // the broker, when the provider call returns
    kPart,          // the object that it is an inner part of
};

enum class Life : std::uint8_t {
    kAlive,
    kReleased,  // by release
    kOver,      // by its request's, thread's, call's or parent's end
};

// Where an object came from: the call that made it, and of what.
struct Origin {
    const char *maker = "";  // "newObjectPath"
    std::string subject;     // class name, argument name, text: whatever tells it apart
};

struct Tag;

// Place in the ring of a thread's tracked objects; the ring's head has no tag.
struct Link {
    Link *previous = this;
    Link *next = this;
    Tag *const tag;

    explicit Link(Tag *owner = nullptr) : tag(owner) {}
    Link(const Link &) = delete;
    Link &operator=(const Link &) = delete;
    ~Link() = default;

    void insert_before(Link &place);
    void unlink();
};

struct Tag : Link {
    // `bury_object` drops the contents but keeps the object answering, `destroy_object` frees it.
    using Undertaker = void (*)(Tag &tag);

    Tag(Core &owner, ObjectKind object_kind, Custody object_custody, Origin object_origin,
        Undertaker bury_object, Undertaker destroy_object);

    Core &core;
    Ledger &ledger;
    const ObjectKind kind;
    const Custody custody;
    std::atomic<Life> life{Life::kAlive};
    const unsigned thread;  // that made it
    const Origin origin;
    const Undertaker bury;
    const Undertaker destroy;
    void *object = nullptr;  // the whole object that the tag is a member of

    // "CMPIObjectPath made by newObjectPath (ZEB_ConcreteJob) on thread 3"
    [[nodiscard]] std::string describe() const;
};

}  // namespace velkhost::broker
