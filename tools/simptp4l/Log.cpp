#include "Log.h"

#include <fcntl.h>
#include <nlohmann/json.hpp>
#include <unistd.h>

namespace simptp4l {
namespace {

using Json = nlohmann::ordered_json;

std::string hex(const Octets& octets) {
    constexpr char digits[] = "0123456789abcdef";
    std::string text;
    for (std::uint8_t octet : octets) {
        text += digits[octet >> 4];
        text += digits[octet & 0x0F];
    }
    return text;
}

double seconds(std::int64_t time) {
    return static_cast<double>(time) / 1e9;
}

void write(int descriptor, const Json& event) {
    if (descriptor < 0) {
        return;
    }
    const std::string line = event.dump(-1, ' ', false, Json::error_handler_t::replace) + "\n";
    // A log that cannot be written must not change what is simulated.
    [[maybe_unused]] const ssize_t written = ::write(descriptor, line.data(), line.size());
}

} // namespace

Log::~Log() {
    if (descriptor_ >= 0) {
        close(descriptor_);
    }
}

bool Log::open(const std::string& path) {
    descriptor_ = ::open(path.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0644);
    return descriptor_ >= 0;
}

void Log::start(const StartRecord& record) const {
    write(descriptor_, Json{{"event", "start"},
                            {"argv", record.argv},
                            {"environment", record.environment},
                            {"pid", record.pid},
                            {"openDescriptors", record.openDescriptors},
                            {"blockedSignals", record.blockedSignals},
                            {"ignoredSignals", record.ignoredSignals}});
}

void Log::bound(std::int64_t time, const std::string& path) const {
    write(descriptor_, Json{{"event", "bound"}, {"t", seconds(time)}, {"path", path}});
}

void Log::request(std::int64_t time, const Octets& octets, const std::string& from,
                  const std::string& ignored) const {
    // Messages are many: nothing is made of them for nobody.
    if (descriptor_ < 0) {
        return;
    }
    Json event{{"event", "request"}, {"t", seconds(time)}, {"octets", hex(octets)}, {"from", from}};
    if (!ignored.empty()) {
        event["ignored"] = ignored;
    }
    write(descriptor_, event);
}

void Log::answer(std::int64_t time, const Octets& octets, const std::string& to) const {
    if (descriptor_ < 0) {
        return;
    }
    write(descriptor_,
          Json{{"event", "answer"}, {"t", seconds(time)}, {"octets", hex(octets)}, {"to", to}});
}

void Log::dropped(std::int64_t time, std::size_t length, const std::string& to,
                  const std::string& reason) const {
    write(descriptor_, Json{{"event", "dropped"},
                            {"t", seconds(time)},
                            {"length", length},
                            {"to", to},
                            {"reason", reason}});
}

void Log::signal(std::int64_t time, const std::string& name, bool ignored) const {
    write(descriptor_,
          Json{{"event", "signal"}, {"t", seconds(time)}, {"name", name}, {"ignored", ignored}});
}

void Log::error(const std::string& text) const {
    write(descriptor_, Json{{"event", "error"}, {"text", text}});
}

void Log::exit(int status) const {
    write(descriptor_, Json{{"event", "exit"}, {"status", status}});
}

} // namespace simptp4l
