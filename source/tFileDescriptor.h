/// @file
#pragma once

#include <utility>

namespace zekelVantel {

/// Owns a file descriptor. -1 stands for none.
class tFileDescriptor {
public:
    tFileDescriptor() = default;

    /// Takes the descriptor over and makes it close-on-exec, so that ptp4l does not inherit it.
    explicit tFileDescriptor(int descriptor);

    tFileDescriptor(tFileDescriptor&& other) noexcept
        : descriptor_(std::exchange(other.descriptor_, -1)) {}
    tFileDescriptor& operator=(tFileDescriptor&& other) noexcept;
    ~tFileDescriptor() { close(); }

    int get() const { return descriptor_; }
    bool isOpen() const { return descriptor_ >= 0; }

    /// Closes the descriptor, if there is one.
    /// @return what close(2) returned, with errno; 0 when there was none.
    int close();

private:
    int descriptor_ = -1;
};

} // namespace zekelVantel
