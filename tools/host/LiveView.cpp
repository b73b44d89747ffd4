#include "LiveView.h"

#include "WriteAll.h"

namespace vantelhost {

namespace {

/// Time pairs are drawn no more often than this, in seconds; whatever else happens is drawn at
/// once.
constexpr double shortestTime = 0.1;

} // namespace

LiveView::LiveView(int terminal, Moment::Clock::time_point begin)
    : terminal_(terminal), begin_(begin), printer_(terminal, Format::readable) {}

void LiveView::close() {
    const std::lock_guard lock(mutex_);
    if (!screen_) {
        return;
    }
    const auto size = screen_->size();
    screen_.reset();
    for (const auto& line : viewLines(state_, now(), size)) {
        writeAll(terminal_, line + "\n");
    }
}

bool LiveView::take(const Event& event, const Moment& moment) {
    const std::lock_guard lock(mutex_);
    update(state_, event, moment.seconds);
    if (event.name == "initialised" && !screen_) {
        screen_.emplace(terminal_);
    }
    if (!screen_) {
        return printer_(event, moment);
    }
    if (event.name == "pair" && moment.seconds < drawn_ + shortestTime) {
        return true;
    }
    return draw(moment.seconds);
}

void LiveView::refresh() {
    const std::lock_guard lock(mutex_);
    if (screen_) {
        draw(now());
    }
}

double LiveView::now() const {
    return Moment::now(begin_).seconds;
}

bool LiveView::draw(double seconds) {
    drawn_ = seconds;
    return screen_->draw(viewLines(state_, seconds, screen_->size()));
}

} // namespace vantelhost
