#include "host/scenario/fault_rules.h"

#include <utility>

namespace velkhost::scenario {
namespace {

bool is_step_of(const FaultRule &rule, std::string_view step) {
    const std::string_view name = rule.step;
    return name.ends_with('*') ? step.starts_with(name.substr(0, name.size() - 1)) : step == name;
}

bool concerns(const FaultRule &rule, std::string_view step, std::string_view subject) {
    return is_step_of(rule, step) && subject.find(rule.match) != std::string_view::npos;
}

}  // namespace

FaultRules::FaultRules(std::vector<FaultRule> rules) {
    for (FaultRule &rule : rules) {
        rules_.push_back({std::move(rule)});
    }
}

bool FaultRules::Counted::strikes() {
    if (passed < rule.after) {
        ++passed;
        return false;
    }
    if (rule.count != FaultRule::kAlways && struck >= rule.count) {
        return false;
    }
    struck += struck < FaultRule::kAlways ? 1 : 0;
    return true;
}

std::optional<Fault> FaultRules::take(std::string_view step, std::string_view subject) {
    const std::lock_guard lock(mutex_);
    for (Counted &counted : rules_) {
        if (concerns(counted.rule, step, subject) && counted.strikes()) {
            const FaultRule &rule = counted.rule;
            return Fault{rule.code, rule.message, rule.controller, rule.transfer};
        }
    }
    return std::nullopt;
}

std::vector<FaultRule> FaultRules::unfired() const {
    const std::lock_guard lock(mutex_);
    std::vector<FaultRule> out;
    for (const Counted &counted : rules_) {
        if (counted.struck == 0) {
            out.push_back(counted.rule);
        }
    }
    return out;
}

}  // namespace velkhost::scenario
