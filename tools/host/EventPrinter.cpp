#include "EventPrinter.h"

#include <cmath>
#include <fmt/format.h>

#include "Text.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

std::string readableLine(const Event& event, const Moment& moment) {
    std::string text = fmt::format("{:10.3f} {:<12} {}", moment.seconds, event.name, event.text);
    text.erase(text.find_last_not_of(' ') + 1);
    return onOneLine(text);
}

} // namespace

std::string jsonLine(const Event& event, const Moment& moment) {
    Json object{{"event", event.name},
                {"t", std::round(moment.seconds * 1e6) / 1e6},
                {"time", moment.realtime}};
    object.update(event.members);
    return toAscii(object);
}

EventPrinter::EventPrinter(int descriptor, Format format)
    : descriptor_(descriptor), format_(format) {}

bool EventPrinter::operator()(const Event& event, const Moment& moment) const {
    const std::string line =
        format_ == Format::readable ? readableLine(event, moment) : jsonLine(event, moment);
    return writeAll(descriptor_, line + "\n");
}

} // namespace vantelhost
