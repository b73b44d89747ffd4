/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "Report/Averages.h"
#include "Report/LowPass.h"
#include "Report/Mtie.h"
#include "Report/PhaseGrid.h"
#include "Report/TauValue.h"
#include "Report/TimeDeviation.h"

namespace vantelhost {

/// What divides the time error into its slow and its fast part.
constexpr double dynamicCutoff = 0.1; ///< hertz

/// Over so long a time the constant time error is averaged.
constexpr double constantTime = 1000; ///< seconds

/// MTIE and TDEV of one time error. In nanoseconds.
struct Wander {
    std::vector<TauValue> mtie;
    std::vector<TauValue> tdev;
};

/// What a time error consists of: its constant part, and its dynamic part below and above 0.1 Hz.
/// In bounded memory.
class TimeError {
public:
    /// After so many slots without a sample, windows, means and the filter begin anew: four hours
    /// of eight offsets a second.
    static constexpr std::int64_t longestGap = std::int64_t{1} << 17;

    /// @param sample   slots ascend
    /// @param interval of the grid, about, seconds; above 0, and always the same
    void add(const PhaseSample& sample, double interval);

    /// The lowest and the highest mean of 1000 s, above that of the grid's base, nanoseconds.
    std::optional<Extent> averages() const;
    std::uint64_t averageCount() const { return parts_ ? parts_->averages.count() : 0; }

    /// From the lowest to the highest, nanoseconds; nothing before the filter has settled.
    std::optional<double> lowPassRange() const;
    std::optional<double> highPassRange() const;

    /// With MTIE at 1000 s, too.
    /// @param interval of the grid, seconds
    Wander wander(double interval) const;

    /// The same of the dynamic time error below 0.1 Hz.
    Wander lowPassWander(double interval) const;

private:
    /// Of one time error.
    struct Stability {
        Mtie mtie;
        TimeDeviation tdev;

        void add(const PhaseSample& sample);
        Wander wander(double interval) const;
    };

    /// What needs to know the interval.
    struct Parts {
        explicit Parts(double interval);

        Averages averages;
        LowPass filter;
        Stability whole;
        Stability low;
    };

    void addFiltered(const PhaseSample& sample, double phase);

    std::optional<Parts> parts_;
    std::int64_t lastSlot_ = 0;
    bool lowBegins_ = true; ///< what the filter gives next is not to be compared with before
    std::optional<Extent> low_;
    std::optional<Extent> high_;
};

} // namespace vantelhost
