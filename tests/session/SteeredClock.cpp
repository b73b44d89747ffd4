#include "SteeredClock.h"

#include <cerrno>
#include <system_error>

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

namespace {

using simptp4l::SteeredTime;

constexpr std::int64_t begin = 1700000000000000000;

SteeredTime* map(const std::string& path) {
    const int descriptor = open(path.c_str(), O_RDWR | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
    void* mapped = MAP_FAILED;
    if (ftruncate(descriptor, sizeof(SteeredTime)) == 0) {
        mapped =
            mmap(nullptr, sizeof(SteeredTime), PROT_READ | PROT_WRITE, MAP_SHARED, descriptor, 0);
    }
    const int error = errno;
    close(descriptor);
    if (mapped == MAP_FAILED) {
        throw std::system_error(error, std::generic_category(), path);
    }
    return static_cast<SteeredTime*>(mapped);
}

} // namespace

SteeredClock::SteeredClock(const std::string& path, nanoseconds phase, double excess)
    : time_(map(path)), excess_(excess) {
    *time_ = {begin, 0, begin, begin + phase.count(), excess};
}

SteeredClock::~SteeredClock() {
    munmap(time_, sizeof(SteeredTime));
}

void SteeredClock::pass(nanoseconds time) {
    time_->now += time.count();
}

void SteeredClock::steer(double frequency) {
    time_->local = local().count();
    time_->since = time_->now;
    time_->frequency = excess_ + frequency;
}

void SteeredClock::moveGrandmaster(nanoseconds by) {
    time_->grandmaster += by.count();
}

SteeredClock::nanoseconds SteeredClock::local() const {
    return nanoseconds(time_->localAt(time_->now));
}

SteeredClock::nanoseconds SteeredClock::error() const {
    return local() - nanoseconds(time_->now + time_->grandmaster);
}

SteeredClock::nanoseconds SteeredClock::passed() const {
    return nanoseconds(time_->now - begin);
}
