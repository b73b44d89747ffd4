#include "Signals.h"

#include <cerrno>
#include <cstdint>
#include <system_error>

#include <sys/signalfd.h>
#include <unistd.h>

namespace vantelhost {

namespace {

constexpr struct {
    int number;
    const char* name;
} stopSignals[] = {
    {SIGINT, "SIGINT"}, {SIGTERM, "SIGTERM"}, {SIGHUP, "SIGHUP"}, {SIGQUIT, "SIGQUIT"}};

[[noreturn]] void fail(int error, const char* what) {
    throw std::system_error(error, std::system_category(), what);
}

bool isIgnored(int number) {
    struct sigaction action {};
    ::sigaction(number, nullptr, &action);
    return action.sa_handler == SIG_IGN;
}

/// The name of a signal that ends the run; empty for another.
std::string stopName(std::uint32_t number) {
    for (const auto& each : stopSignals) {
        if (static_cast<std::uint32_t>(each.number) == number) {
            return each.name;
        }
    }
    return {};
}

/// Only the end of a child, and also where whoever started this process ignores it.
void wantChildEnds() {
    struct sigaction action {};
    action.sa_handler = SIG_DFL;
    action.sa_flags = SA_NOCLDSTOP;
    ::sigaction(SIGCHLD, &action, nullptr);
}

} // namespace

Signals::Signals(Hangup hangup) : hangup_(hangup) {
    sigemptyset(&stops_);
    for (const auto& each : stopSignals) {
        const bool mayBeIgnored = each.number == SIGHUP || each.number == SIGQUIT;
        if (!mayBeIgnored || !isIgnored(each.number)) {
            sigaddset(&stops_, each.number);
        }
    }
    wantChildEnds();
    sigset_t awaited = stops_;
    if (hangup_ == Hangup::reread) {
        sigdelset(&stops_, SIGHUP);
    }
    sigaddset(&awaited, SIGCHLD);
    sigaddset(&awaited, SIGWINCH);
    sigset_t blocked = awaited;
    sigaddset(&blocked, SIGPIPE);
    const int error = pthread_sigmask(SIG_BLOCK, &blocked, nullptr);
    if (error != 0) {
        fail(error, "blocking signals");
    }
    descriptor_ = ::signalfd(-1, &awaited, SFD_CLOEXEC | SFD_NONBLOCK);
    if (descriptor_ < 0) {
        fail(errno, "waiting for signals");
    }
}

Signals::~Signals() {
    ::close(descriptor_);
}

// The kernel gives the lowest number first: those that stop come before SIGCHLD.
std::optional<Signals::News> Signals::take() {
    const std::lock_guard lock(mutex_);
    signalfd_siginfo info{};
    if (::read(descriptor_, &info, sizeof(info)) < 0) {
        if (errno == EAGAIN || errno == EINTR) {
            return std::nullopt;
        }
        fail(errno, "waiting for signals");
    }
    News news;
    if (info.ssi_signo == SIGHUP && hangup_ == Hangup::reread) {
        news.reread = true;
    } else {
        news.stop = stopName(info.ssi_signo);
    }
    taken_ = taken_ || !news.stop.empty();
    if (info.ssi_signo == SIGCHLD) {
        news.childEnd = {static_cast<pid_t>(info.ssi_pid), info.ssi_code != CLD_EXITED,
                         info.ssi_status};
    }
    return news;
}

bool Signals::stopHasCome() const {
    const std::lock_guard lock(mutex_);
    sigset_t pending;
    sigset_t stops;
    sigpending(&pending);
    sigandset(&stops, &pending, &stops_);
    return taken_ || sigisemptyset(&stops) == 0;
}

void Signals::requestStop() {
    ::kill(::getpid(), SIGTERM);
}

} // namespace vantelhost
