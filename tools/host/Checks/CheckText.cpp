#include "Checks/CheckText.h"

#include <algorithm>

#include <fmt/format.h>

#include "Text.h"

namespace vantelhost {

namespace {

const char* nameOf(Verdict verdict) {
    switch (verdict) {
    case Verdict::ok:
        return "ok";
    case Verdict::warn:
        return "warn";
    case Verdict::fail:
        return "fail";
    case Verdict::skip:
        break;
    }
    return "skip";
}

} // namespace

bool allHold(const CheckResults& results) {
    return std::none_of(results.begin(), results.end(), [](const CheckResult& result) {
        return result.finding.verdict == Verdict::fail;
    });
}

std::string checkLines(const CheckResults& results) {
    std::size_t width = 0;
    for (const auto& result : results) {
        width = std::max(width, onOneLine(result.check).size());
    }
    std::string lines;
    for (const auto& [check, finding] : results) {
        // To be found at a glance.
        const char* verdict = finding.verdict == Verdict::fail ? "FAIL" : nameOf(finding.verdict);
        lines += fmt::format("{:<4}  {:<{}}  {}{}\n", verdict, onOneLine(check), width,
                             onOneLine(finding.found),
                             finding.mend.empty() ? "" : " -- mend: " + onOneLine(finding.mend));
    }
    return lines;
}

Json checkJson(const CheckResults& results) {
    Json checks = Json::array();
    for (const auto& [check, finding] : results) {
        checks.push_back({{"check", check},
                          {"result", nameOf(finding.verdict)},
                          {"found", finding.found},
                          {"mend", finding.mend}});
    }
    return {{"passed", allHold(results)}, {"checks", checks}};
}

} // namespace vantelhost
