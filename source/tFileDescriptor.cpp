#include "tFileDescriptor.h"

#include <fcntl.h>
#include <unistd.h>

namespace zekelVantel {

tFileDescriptor::tFileDescriptor(int descriptor) : descriptor_(descriptor) {
    if (isOpen()) {
        fcntl(descriptor_, F_SETFD, FD_CLOEXEC);
    }
}

tFileDescriptor& tFileDescriptor::operator=(tFileDescriptor&& other) noexcept {
    std::swap(descriptor_, other.descriptor_);
    return *this;
}

int tFileDescriptor::close() {
    return isOpen() ? ::close(std::exchange(descriptor_, -1)) : 0;
}

} // namespace zekelVantel
