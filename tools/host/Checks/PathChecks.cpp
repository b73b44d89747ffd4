#include "Checks/PathChecks.h"

#include <algorithm>
#include <cerrno>

#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Checks/Access.h"
#include "Checks/SocketUse.h"
#include "Text.h"

namespace vantelhost {

namespace {

constexpr char noSettings[] = "there are no settings";

bool hasControlCharacters(const std::string& text) {
    return std::any_of(text.begin(), text.end(), [](char each) {
        const auto octet = static_cast<unsigned char>(each);
        return octet < 0x20 || octet == 0x7F;
    });
}

/// As plug-in and ptp4l cut it.
std::string socketPath(const std::string& path) {
    return path.substr(0, longestSocketPath);
}

/// What a socket that nobody listens at is.
Finding checkLeftover(const std::string& path) {
    struct stat state {};
    if (::lstat(path.c_str(), &state) != 0) {
        return good("no");
    }
    if (S_ISSOCK(state.st_mode)) {
        return good("no; ptp4l replaces the socket that was left there");
    }
    return S_ISDIR(state.st_mode)
               ? bad(path + ": a folder is there", "choose another path: --set udsAddress=...")
               : doubtful(path + ": is not a socket, ptp4l removes it",
                          "choose another path: --set udsAddress=...");
}

} // namespace

Finding checkConfigFile(const Subject& subject) {
    const auto path = setting(subject, "configFile");
    if (!path) {
        return skipped(noSettings);
    }
    struct stat state {};
    if (::stat(path->c_str(), &state) != 0) {
        return checkFolderOf(*path, "; \"vantel-host run\" makes it by itself");
    }
    if (!S_ISREG(state.st_mode)) {
        return bad(*path + ": is not a file", "choose another path: --set configFile=...");
    }
    if (!isAllowed(*path, W_OK | R_OK)) {
        return bad(fmt::format("{}: {}", *path, errorText(errno)),
                   "give the host's user the right to write it");
    }
    return good(*path + ", will be replaced");
}

Finding checkUdsAddress(const Subject& subject) {
    const auto path = setting(subject, "udsAddress");
    if (!path) {
        return skipped(noSettings);
    }
    const std::string mend = "choose another path: --set udsAddress=...";
    if (path->empty()) {
        return bad("is empty", mend);
    }
    if (hasControlCharacters(*path)) {
        return bad("has control characters: " + *path, mend);
    }
    if (path->size() > longestSocketPath) {
        return doubtful(fmt::format("has {} characters: plug-in and ptp4l cut it to {}",
                                    path->size(), longestSocketPath),
                        mend);
    }
    return good(*path);
}

Finding checkUdsFolder(const Subject& subject) {
    const auto path = setting(subject, "udsAddress");
    return path ? checkFolderOf(socketPath(*path)) : skipped(noSettings);
}

Finding checkUdsInUse(const Subject& subject) {
    const auto given = setting(subject, "udsAddress");
    if (!given || given->empty()) {
        return skipped(noSettings);
    }
    const std::string path = socketPath(*given);
    const auto [error, listener] = useOfSocket(path, subject.proc);
    switch (error) {
    case 0:
        return bad(fmt::format("{}: in use by {}", path, listener),
                   "end it, or choose another path: --set udsAddress=...");
    case ECONNREFUSED:
    case ENOENT:
    case ENOTDIR:
        return checkLeftover(path);
    default:
        return doubtful(fmt::format("{}: {}", path, errorText(error)), "");
    }
}

Finding checkOwnSocket(const Subject& subject) {
    constexpr std::size_t longestPid = 7; // digits: the kernel's highest is 4194304
    const std::size_t length = subject.socketPrefix.size() + longestPid;
    if (length > longestSocketPath) {
        return doubtful(fmt::format("has up to {} characters: the plug-in cuts it to {}", length,
                                    longestSocketPath),
                        "build the plug-in with another VANTEL_LOCAL_SOCKET_PREFIX");
    }
    return checkFolderOf(subject.socketPrefix);
}

} // namespace vantelhost
