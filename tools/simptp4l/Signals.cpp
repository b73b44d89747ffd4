#include "Signals.h"

#include <cerrno>
#include <csignal>
#include <sys/signalfd.h>
#include <system_error>
#include <unistd.h>

namespace simptp4l {

Signals::Signals() {
    sigset_t set;
    sigemptyset(&set);
    for (int number : {SIGTERM, SIGINT}) {
        sigaddset(&set, number);
    }
    pthread_sigmask(SIG_BLOCK, &set, nullptr);
    descriptor_ = signalfd(-1, &set, SFD_CLOEXEC | SFD_NONBLOCK);
    if (descriptor_ < 0) {
        throw std::system_error(errno, std::generic_category(), "signalfd");
    }
}

Signals::~Signals() {
    close(descriptor_);
}

int Signals::next() const {
    signalfd_siginfo info{};
    const ssize_t got = read(descriptor_, &info, sizeof info);
    return got == static_cast<ssize_t>(sizeof info) ? static_cast<int>(info.ssi_signo) : 0;
}

} // namespace simptp4l
