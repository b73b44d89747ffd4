#include "support/SyslogCapture.h"

#include <algorithm>
#include <atomic>
#include <cstdarg>
#include <cstdio>
#include <ostream>
#include <stdexcept>

#include <syslog.h>

#include "support/OwnAllocations.h"

namespace {

std::atomic<SyslogCapture*> currentLog{nullptr};

[[gnu::format(printf, 2, 0)]] void capture(int priority, const char* format, va_list arguments) {
    const OwnAllocations own;
    char text[8192];
    std::vsnprintf(text, sizeof(text), format, arguments);
    if (SyslogCapture* const log = currentLog.load()) {
        log->add(priority, text);
    }
}

} // namespace

// These stand before the C library's own; the checked one is what _FORTIFY_SOURCE calls.
extern "C" {

[[gnu::visibility("default"), gnu::format(printf, 2, 3)]] void syslog(int pri, const char* fmt,
                                                                      ...) {
    std::va_list arguments;
    va_start(arguments, fmt);
    capture(pri, fmt, arguments);
    va_end(arguments);
}

// NOLINTNEXTLINE: a name of the C library
void __syslog_chk(int pri, int flag, const char* fmt, ...);

[[gnu::visibility("default"), gnu::format(printf, 3, 4)]] void __syslog_chk(int pri, int /*flag*/,
                                                                            const char* fmt, ...) {
    std::va_list arguments;
    va_start(arguments, fmt);
    capture(pri, fmt, arguments);
    va_end(arguments);
}

} // extern "C"

SyslogCapture::SyslogCapture() {
    SyslogCapture* none = nullptr;
    if (!currentLog.compare_exchange_strong(none, this)) {
        throw std::logic_error("the system log is captured already");
    }
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
