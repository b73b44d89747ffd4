/// @file
#pragma once

namespace vantelhost {

/// How long to wait before the next session: twice as long each time, up to a minute.
class RestartDelay {
public:
    /// In seconds.
    double next();

    /// It went well for a while: the next one is short again.
    void reset() { next_ = shortest; }

private:
    static constexpr double shortest = 1;

    double next_ = shortest;
};

} // namespace vantelhost
