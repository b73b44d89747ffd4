#include "RestartDelay.h"

#include <algorithm>
#include <utility>

namespace vantelhost {

double RestartDelay::next() {
    constexpr double longest = 60;
    return std::exchange(next_, std::min(2 * next_, longest));
}

} // namespace vantelhost
