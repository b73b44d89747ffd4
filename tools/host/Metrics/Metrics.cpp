#include "Metrics/Metrics.h"

#include "Metrics/MetricPage.h"

namespace vantelhost {

Metrics::Metrics(const ListenAddress& address, Moment::Clock::time_point begin)
    : server_(address, std::make_shared<MetricPage>(values_, begin)) {}

void Metrics::takeChrony(std::uint64_t sent, std::uint64_t failed) {
    values_.chronySent = sent;
    values_.chronyFailed = failed;
    values_.usesChrony = true;
}

} // namespace vantelhost
