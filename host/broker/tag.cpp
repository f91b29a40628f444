#include "host/broker/tag.h"

#include "host/broker/core.h"
#include "host/broker/threads.h"

#include <array>
#include <utility>

namespace velkhost::broker {

std::string_view kind_name(ObjectKind kind) {
    static constexpr std::array<std::string_view, 13> kNames{
        "CMPIContext",    "CMPIResult",     "CMPIString",   "CMPIArray",    "CMPIEnumeration",
        "CMPIInstance",   "CMPIObjectPath", "CMPIArgs",     "CMPIDateTime", "CMPISelectExp",
        "CMPISelectCond", "CMPISubCond",    "CMPIPredicate"};
    return kNames.at(static_cast<std::size_t>(kind));
}

void Link::insert_before(Link &place) {
    next = &place;
    previous = place.previous;
    place.previous->next = this;
    place.previous = this;
}

void Link::unlink() {
    previous->next = next;
    next->previous = previous;
    previous = next = this;
}

Tag::Tag(Core &owner, ObjectKind object_kind, Custody object_custody, Origin object_origin,
         Undertaker bury_object, Undertaker destroy_object)
    : Link(this),
      core(owner),
      ledger(*owner.ledger),
      kind(object_kind),
      custody(object_custody),
      thread(thread_number()),
      origin(std::move(object_origin)),
      bury(bury_object),
      destroy(destroy_object) {}

std::string Tag::describe() const {
    std::string text(kind_name(kind));
    text += std::string(" made by ") + origin.maker;
    if (!origin.subject.empty()) {
        text += " (" + origin.subject + ')';
    }
    return text + " on thread " + std::to_string(thread);
}

}  // namespace velkhost::broker
