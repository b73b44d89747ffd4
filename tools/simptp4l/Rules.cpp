#include "Rules.h"

namespace simptp4l {

Rules::Rules(const std::vector<Rule>& rules) {
    for (const Rule& rule : rules) {
        rules_.push_back({rule});
    }
}

std::vector<Action> Rules::match(std::uint16_t managementId, std::int64_t now) {
    std::vector<Action> actions;
    for (Counted& entry : rules_) {
        const Rule& rule = entry.rule;
        if (rule.managementId.value_or(managementId) != managementId) {
            continue;
        }
        if (now < rule.from || now >= rule.until) {
            continue;
        }
        const std::uint64_t before = entry.matched++;
        if (before >= rule.after && before - rule.after < rule.times) {
            actions.push_back(rule.action);
        }
    }
    return actions;
}

} // namespace simptp4l
