// What the ledger holds against a provider: a misuse of the broker's objects, by name.
#pragma once

#include "host/broker/api.h"

#include <string>
#include <string_view>

namespace velkhost::broker {

enum class FindingKind {
    kCloneNeverReleased,      // a clone was still alive when the books were closed
    kSecondRelease,           // release of an object that is gone already
    kForeignRelease,          // release of a broker-owned object outside of the thread that made it
    kUseAfterRelease,         // a call on an object that was released, or freed with its request
    kEnumerationAtThreadEnd,  // a provider's thread ended with an enumeration that nobody released
    kArgumentReleased,        // release of what the broker passed to a provider call
    kArgumentUsedAfterCall,   // a call on such an object after the provider call returned
    kPartReleased,            // release of an inner part of another object
    kUnsafeCall,              // a call that crashes or misleads a real broker's process
};

// "clone-never-released", "second-release", ... as reports and tests name them.
VELKBROKER_API std::string_view finding_name(FindingKind kind);

struct Finding {
    FindingKind kind;
    std::string text;  // object, where it was made, and by which threads
    unsigned thread;   // number of the thread that did it
};

// `name: text`, one line.
VELKBROKER_API std::string to_text(const Finding &finding);

}  // namespace velkhost::broker
