#include "StatusCommand.h"

#include <array>
#include <cerrno>
#include <chrono>
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
constexpr std::chrono::seconds patience(20);

/// What a run says; empty when it says nothing.
std::string answerOf(const UnixSocket& socket) {
    std::string answer;
    std::array<char, 4096> buffer{};
    pollfd input{socket.descriptor(), POLLIN, 0};
    constexpr int timeout = std::chrono::milliseconds(patience).count();
    while (::poll(&input, 1, timeout) == 1) {
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

int complainAboutSilence(const std::string& path) {
    return complain(exitFailed, fmt::format("{}: the run there does not answer", path));
}

/// @param error errno of the connection that was not made
int complainAboutPath(const std::string& path, int error) {
    const char* const hint =
        error == EACCES ? "" : "; no run listens there: vantel-host run --status-socket";
    return complain(exitUsage, fmt::format("{}: {}{}", path, errorText(error), hint));
}

/// @return the exit status. Throws Json::exception when the answer is not that of a run.
int show(const std::string& answer, bool asJson) {
    const Json status = Json::parse(answer);
    const std::string health = status.at("health");
    writeOutput(asJson ? answer : statusText(status));
    return health == "locked" ? exitClean : exitFailed;
}

int showStatus(const StatusOptions& options) {
    const UnixSocket socket(patience);
    if (socket.connectTo(options.socket) != 0) {
        return errno == EAGAIN ? complainAboutSilence(options.socket)
                               : complainAboutPath(options.socket, errno);
    }
    const std::string answer = answerOf(socket);
    if (answer.empty()) {
        return complainAboutSilence(options.socket);
    }
    try {
        return show(answer, options.json);
    } catch (const Json::exception&) {
        return complain(exitFailed,
                        fmt::format("{}: the answer is not understood: it is not that of a run of "
                                    "this version",
                                    options.socket));
    }
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
