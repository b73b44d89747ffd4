/// @file
#pragma once

#include <string>
#include <vector>

#include "ViewLines.h"

namespace vantelhost {

/// A terminal's second screen, without the cursor. The first one comes back with this object's end.
class Screen {
public:
    /// @param terminal not owned.
    explicit Screen(int terminal);
    ~Screen();
    Screen(const Screen&) = delete;
    Screen& operator=(const Screen&) = delete;

    /// Replaces what is shown, in one write.
    /// @return false when that failed; errno says why.
    bool draw(const std::vector<std::string>& lines) const;

    /// The size at this moment; 24 rows of 80 columns where it is not known.
    ScreenSize size() const;

private:
    int terminal_;
};

} // namespace vantelhost
