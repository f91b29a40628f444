#include "host/scenario/fault_steps.h"

#include <array>
#include <cstring>

namespace velkhost::scenario {
namespace {

// What must follow the begin of a step's name.
enum class Rest { kNothing, kPath, kName };

struct Family {
    std::string_view begin;
    Rest rest;
    CodeKind code;
};

// clang-format off
constexpr std::array kFamilies{
    Family{"open:",         Rest::kPath,    CodeKind::kErrno},
    Family{"unlink:",       Rest::kPath,    CodeKind::kErrno},
    Family{"rmdir:",        Rest::kPath,    CodeKind::kErrno},
    Family{"opendir:",      Rest::kPath,    CodeKind::kErrno},
    Family{"dlopen:",       Rest::kPath,    CodeKind::kErrno},
    Family{"thread.create", Rest::kNothing, CodeKind::kErrno},
    Family{"broker.",       Rest::kName,    CodeKind::kCimStatus},
    Family{"job.",          Rest::kName,    CodeKind::kCimStatus},
    Family{"zeb.",          Rest::kName,    CodeKind::kCimStatus},
    Family{"filetransfer.fetch", Rest::kNothing, CodeKind::kTransfer},
    Family{"filetransfer.", Rest::kName,    CodeKind::kCimStatus},
    Family{"emulex_fc.",    Rest::kName,    CodeKind::kCimStatus},
    Family{"emulex_cna.",   Rest::kName,    CodeKind::kCimStatus},
    Family{"qlogic.",       Rest::kName,    CodeKind::kCimStatus},
    Family{"brocade.",      Rest::kName,    CodeKind::kCimStatus},
    Family{"broadcom.",     Rest::kName,    CodeKind::kCimStatus},
    Family{"lsi.",          Rest::kName,    CodeKind::kCimStatus},
    Family{"hypervisor.",   Rest::kName,    CodeKind::kCimStatus},
    Family{"bmc.",          Rest::kName,    CodeKind::kController},
};
// clang-format on

bool fits(std::string_view rest, Rest wanted) {
    switch (wanted) {
        case Rest::kNothing:
            return rest.empty();
        case Rest::kPath:
            return rest.starts_with('/');
        case Rest::kName:
            return !rest.empty();
    }
    return false;
}

}  // namespace

std::optional<CodeKind> step_code_kind(std::string_view step) {
    for (const Family &family : kFamilies) {
        if (step.starts_with(family.begin) && fits(step.substr(family.begin.size()), family.rest)) {
            return family.code;
        }
    }
    return std::nullopt;
}

std::string known_steps() {
    std::string out;
    for (const Family &family : kFamilies) {
        out += (out.empty() ? "" : ", ") + std::string(family.begin);
        out += family.rest == Rest::kPath ? "/path" : family.rest == Rest::kName ? "name" : "";
    }
    return out;
}

std::optional<int> errno_by_name(std::string_view name) {
    constexpr int kHighestErrno = 133;
    for (int number = 1; number <= kHighestErrno; ++number) {
        const char *known = strerrorname_np(number);
        if (known != nullptr && name == known) {
            return number;
        }
    }
    return std::nullopt;
}

}  // namespace velkhost::scenario
