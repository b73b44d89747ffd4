#include "Report/ReportJson.h"

#include <string>
#include <vector>

#include "Report/TimeErrorFigures.h"

namespace vantelhost {

namespace {

Json orNull(const std::optional<double>& value) {
    return value ? Json(*value) : Json();
}

Json pairsJson(const Recording& recording) {
    const auto& counts = recording.counts;
    return {{"measured", counts.measured},
            {"leftOut", counts.all() - counts.measured},
            {"rate_Hz", recording.pairs->rate()}};
}

/// @param name of the values
Json tauJson(const std::vector<TauValue>& values, const char* name, const char* terms) {
    Json rows = Json::array();
    for (const auto& each : values) {
        rows.push_back({{"tau_s", each.tau}, {name, each.value}, {terms, each.terms}});
    }
    return rows;
}

Json wanderJson(const Wander& wander) {
    return {{"mtie", tauJson(wander.mtie, "mtie_ns", "windows")},
            {"tdev", tauJson(wander.tdev, "tdev_ns", "sums")}};
}

Json constantJson(const TimeErrorFigures& figures) {
    const auto& means = figures.constant;
    return {{"average_s", constantTime},
            {"averages", figures.averages},
            {"min_ns", means ? Json(means->low) : Json()},
            {"max_ns", means ? Json(means->high) : Json()},
            {"cTE_ns", figures.constantError()}};
}

Json dynamicJson(const TimeErrorFigures& figures) {
    Json json{{"cutoff_Hz", dynamicCutoff},
              {"lowPassPeakToPeak_ns", orNull(figures.lowPassRange)},
              {"highPassPeakToPeak_ns", orNull(figures.highPassRange)}};
    json.update(wanderJson(figures.low));
    return json;
}

Json timeErrorJson(const TimeErrorFigures& figures) {
    Json json{{"interval_s", figures.interval}, {"missing", figures.missing},
              {"observed_s", figures.seconds},  {"min_ns", figures.extent.low},
              {"max_ns", figures.extent.high},  {"maxAbs_ns", figures.largest()},
              {"mean_ns", figures.mean},        {"rms_ns", figures.rms}};
    json.update(wanderJson(figures.whole));
    json["adev"] = tauJson(figures.deviations, "adev", "sums");
    json["constant"] = constantJson(figures);
    json["dynamic"] = dynamicJson(figures);
    return json;
}

Json limitsJson(const TimeErrorFigures& figures, const Limits& limits) {
    Json verdicts = Json::array();
    for (const auto& each : verdictsOf(figures, limits)) {
        verdicts.push_back({{"quantity", each.quantity},
                            {"value_ns", orNull(each.value)},
                            {"limit_ns", orNull(each.limit)},
                            {"tau_s", orNull(each.tau)},
                            {"verdict", each.result}});
    }
    return {{"recommendation", recommendation},
            {"class", std::string(1, limits.letter)},
            {"verdicts", verdicts}};
}

} // namespace

Json reportJson(const Recording& recording, const std::string& name, const Limits* limits) {
    Json json{{"record", name},
              {"begin_ns", recording.begin},
              {"duration_s", recording.duration},
              {"pairs", pairsJson(recording)},
              {"timeError", nullptr},
              {"limits", nullptr}};
    if (recording.counts.measured > 0) {
        const auto figures = figuresOf(*recording.pairs);
        json["timeError"] = timeErrorJson(figures);
        if (limits != nullptr) {
            json["limits"] = limitsJson(figures, *limits);
        }
    }
    return json;
}

} // namespace vantelhost
