#include "host/broker/finding.h"

namespace velkhost::broker {

std::string_view finding_name(FindingKind kind) {
    switch (kind) {
        case FindingKind::kCloneNeverReleased:
            return "clone-never-released";
        case FindingKind::kSecondRelease:
            return "second-release";
        case FindingKind::kForeignRelease:
            return "release-on-foreign-thread";
        case FindingKind::kUseAfterRelease:
            return "use-after-release";
        case FindingKind::kEnumerationAtThreadEnd:
            return "enumeration-alive-at-thread-end";
        case FindingKind::kArgumentReleased:
            return "argument-released";
        case FindingKind::kArgumentUsedAfterCall:
            return "argument-used-after-call";
        case FindingKind::kPartReleased:
            return "part-released";
        case FindingKind::kUnsafeCall:
            return "unsafe-call";
    }
    return "unknown";
}

std::string to_text(const Finding &finding) {
    return std::string(finding_name(finding.kind)) + ": " + finding.text;
}

}  // namespace velkhost::broker
