#include "Metrics/Metrics.h"

#include "Metrics/MetricPage.h"

namespace vantelhost {

Metrics::Metrics(const ListenAddress& address, Moment::Clock::time_point begin)
    : server_(address, std::make_shared<MetricPage>(values_, begin)) {}

void Metrics::takeChrony(const ChronyCounts& counts) {
    values_.chronySent = counts.sent;
    values_.chronyFailed = counts.failed;
    values_.chronyWithheld = counts.withheld;
    values_.usesChrony = true;
}

} // namespace vantelhost
