#include "EventPrinter.h"

#include <cerrno>
#include <cmath>
#include <string_view>

#include <fmt/format.h>
#include <unistd.h>

#include "Text.h"

namespace vantelhost {

namespace {

bool writeAll(int descriptor, std::string_view text) {
    while (!text.empty()) {
        const ssize_t written = ::write(descriptor, text.data(), text.size());
        if (written >= 0) {
            text.remove_prefix(static_cast<std::size_t>(written));
        } else if (errno != EINTR) {
            return false;
        }
    }
    return true;
}

} // namespace

EventPrinter::EventPrinter(int descriptor, Format format, Clock::time_point begin)
    : descriptor_(descriptor), format_(format), begin_(begin) {}

bool EventPrinter::print(const Event& event) {
    return writeAll(descriptor_, line(event) + "\n");
}

double EventPrinter::seconds() const {
    return std::chrono::duration<double>(Clock::now() - begin_).count();
}

std::string EventPrinter::line(const Event& event) const {
    if (format_ == Format::readable) {
        std::string text = fmt::format("{:10.3f} {:<12} {}", seconds(), event.name, event.text);
        text.erase(text.find_last_not_of(' ') + 1);
        return onOneLine(text);
    }
    Json object{{"event", event.name}, {"t", std::round(seconds() * 1e6) / 1e6}};
    object.update(event.members);
    return toAscii(object);
}

} // namespace vantelhost
