#include "Metrics/MetricPage.h"

#include <prometheus/metric_family.h>

#include "Metrics/MetricTable.h"

namespace vantelhost {

std::vector<prometheus::MetricFamily> MetricPage::Collect() const {
    const double seconds = Moment::now(begin_).seconds;
    std::vector<prometheus::MetricFamily> families;
    for (const MetricRow& row : metricTable()) {
        Samples samples(row);
        row.sample(samples, values_, seconds);
        families.push_back({row.name, row.help, row.type, samples.take()});
    }
    return families;
}

} // namespace vantelhost
