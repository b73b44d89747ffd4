#include "support/SyslogCapture.h"

#include <algorithm>
#include <atomic>
#include <ostream>
#include <stdexcept>

#include "support/LogFunctions.h"

namespace {

std::atomic<SyslogCapture*> currentLog{nullptr};

void addToCurrent(int priority, const char* line) {
    if (SyslogCapture* const log = currentLog.load()) {
        log->add(priority, line);
    }
}

} // namespace

SyslogCapture::SyslogCapture() {
    SyslogCapture* none = nullptr;
    if (!currentLog.compare_exchange_strong(none, this)) {
        throw std::logic_error("the system log is captured already");
    }
    setLogTaker(addToCurrent);
}

SyslogCapture::~SyslogCapture() {
    currentLog = nullptr;
}

std::vector<SyslogCapture::Line> SyslogCapture::lines() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return lines_;
}

int SyslogCapture::count(const std::string& text) const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return static_cast<int>(std::count_if(lines_.begin(), lines_.end(),
                                          [&](const Line& line) { return line.text == text; }));
}

void SyslogCapture::add(int priority, std::string text) {
    const std::lock_guard<std::mutex> lock(mutex_);
    lines_.push_back({priority, std::move(text)});
}

void PrintTo(const SyslogCapture::Line& line, std::ostream* out) {
    *out << line.priority << ": " << line.text;
}
