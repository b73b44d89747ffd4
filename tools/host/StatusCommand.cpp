#include "StatusCommand.h"

#include <array>
#include <cerrno>
#include <cstdio>
#include <memory>
#include <string>

#include <CLI/CLI.hpp>
#include <fmt/format.h>
#include <poll.h>
#include <unistd.h>

#include "Json.h"
#include "Status/StatusSocket.h"
#include "Status/StatusText.h"
#include "Status/UnixSocket.h"
#include "Text.h"
#include "UsageError.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

struct StatusOptions {
    std::string socket = defaultStatusSocket;
    bool json = false;
};

/// Longer than a run takes to stop a session.
constexpr int patience = 20000; // ms

/// What a run says; empty when it says nothing.
std::string answerOf(const UnixSocket& socket) {
    std::string answer;
    std::array<char, 4096> buffer{};
    pollfd input{socket.descriptor(), POLLIN, 0};
    while (::poll(&input, 1, patience) == 1) {
        const ssize_t count = ::read(socket.descriptor(), buffer.data(), buffer.size());
        if (count <= 0) {
            break;
        }
        answer.append(buffer.data(), static_cast<std::size_t>(count));
    }
    return answer;
}

int complain(int status, const std::string& text) {
    fmt::print(stderr, "vantel-host: {}\n", onOneLine(text));
    return status;
}

int showStatus(const StatusOptions& options) {
    const UnixSocket socket;
    if (socket.connectTo(options.socket) != 0) {
        const char* const hint =
            errno == EACCES ? "" : "; no run listens there: vantel-host run --status-socket";
        return complain(exitUsage, fmt::format("{}: {}{}", options.socket, errorText(errno), hint));
    }
    const std::string answer = answerOf(socket);
    const Json status = Json::parse(answer, nullptr, false);
    if (!status.is_object()) {
        return complain(exitFailed,
                        fmt::format("{}: the run there does not answer", options.socket));
    }
    writeOutput(options.json ? answer : statusText(status));
    return status["health"] == "locked" ? exitClean : exitFailed;
}

} // namespace

std::function<int()> prepareStatus(CLI::App& command) {
    const auto options = std::make_shared<StatusOptions>();
    command.add_option("--socket", options->socket, "The run's --status-socket")
        ->type_name("PATH")
        ->capture_default_str();
    command.add_flag("--json", options->json, "Print a JSON object");
    command.footer("Exit status: 0 when the clock is locked; 1 when it is not; 2 when nobody runs "
                   "there, or for a bad option.");
    return [options] { return showStatus(*options); };
}

} // namespace vantelhost
