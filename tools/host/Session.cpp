#include "Session.h"

#include <utility>

namespace vantelhost {

namespace {

/// With which a child of the plug-in ends that did not become ptp4l, without a word.
constexpr int notExecuted = 255;

} // namespace

bool succeeded(Journal& journal, const char* operation, const HostStatus& status) {
    if (status.isError()) {
        journal.error(statusEvent(operation, status.code(), status.text()));
    } else if (status.isWarning()) {
        journal.note(statusEvent(operation, status.code(), status.text()));
    }
    return !status.isError();
}

Session::Session(const PlugIn& plugIn, Journal& journal, const Manner& manner)
    : plugIn_(plugIn),
      journal_(journal),
      callbacks_(journal, manner.refuseWhileStopping, manner.endsBySignal, manner.now),
      words_(manner.passWordsOn) {}

bool Session::initialise(const Json& settings) {
    HostStatus status;
    plugIn_.initialise(callbacks_.slot(), settings.dump(), status);
    if (!succeeded(journal_, "initialize", status)) {
        return false;
    }
    isInitialised_ = true;
    journal_.note(initialisedEvent(settings));
    return true;
}

bool Session::start() {
    HostStatus status;
    {
        const LastWords::Redirection redirection(words_);
        plugIn_.start(callbacks_.slot(), status);
    }
    if (!succeeded(journal_, "start", status)) {
        return false;
    }
    journal_.note(startedEvent());
    return true;
}

void Session::stop(const std::string& cause) {
    if (!std::exchange(isInitialised_, false)) {
        return;
    }
    journal_.note(stoppingEvent(cause));
    callbacks_.stoppingBegins();
    plugIn_.stop(callbacks_.slot());
    words_.take();
    journal_.note(stoppedEvent());
    plugIn_.finalise(callbacks_.slot());
}

void Session::take(const ChildEnd& end) {
    words_.take();
    const Event event = daemonEndedEvent(end, words_.lines());
    journal_.note(event);
    if (daemonEnd_.empty()) {
        daemonEnd_ = event.text;
        notExecuted_ = !end.bySignal && end.status == notExecuted && words_.lines().empty();
    }
}

} // namespace vantelhost
