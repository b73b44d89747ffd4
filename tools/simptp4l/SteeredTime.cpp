#include "SteeredTime.h"

#include <cerrno>
#include <cmath>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>

namespace simptp4l {
namespace {

[[noreturn]] void fail(const std::string& path, int error) {
    throw std::system_error(error, std::generic_category(), path);
}

/// A file that ends too early would be noticed at the first access only, by a signal.
const void* map(const std::string& path, int descriptor) {
    struct stat state {};
    if (fstat(descriptor, &state) != 0) {
        fail(path, errno);
    }
    if (state.st_size < static_cast<off_t>(sizeof(SteeredTime))) {
        fail(path, ENODATA);
    }
    const void* const mapped =
        mmap(nullptr, sizeof(SteeredTime), PROT_READ, MAP_SHARED, descriptor, 0);
    if (mapped == MAP_FAILED) {
        fail(path, errno);
    }
    return mapped;
}

} // namespace

std::int64_t SteeredTime::localAt(std::int64_t time) const {
    const std::int64_t elapsed = time - since;
    return local + elapsed + std::llround(static_cast<double>(elapsed) * frequency / 1e9);
}

SteeredTimeFile::SteeredTimeFile(const std::string& path) {
    const int descriptor = open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (descriptor < 0) {
        fail(path, errno);
    }
    try {
        time_ = static_cast<const SteeredTime*>(map(path, descriptor));
    } catch (...) {
        close(descriptor);
        throw;
    }
    close(descriptor);
}

SteeredTimeFile::~SteeredTimeFile() {
    munmap(const_cast<SteeredTime*>(time_), sizeof(SteeredTime));
}

} // namespace simptp4l
