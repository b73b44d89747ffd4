#include "Checks/SocketUse.h"

#include <cerrno>
#include <filesystem>
#include <fstream>
#include <set>
#include <sstream>

#include <fmt/format.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include "Checks/Processes.h"

namespace vantelhost {

namespace {

namespace fs = std::filesystem;

/// Why nobody can be reached at a socket's path: errno; 0 when somebody can.
int reach(const std::string& path) {
    const int descriptor = ::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    if (descriptor < 0) {
        return errno;
    }
    sockaddr_un address{};
    static_assert(sizeof(address.sun_path) == longestSocketPath + 1);
    address.sun_family = AF_UNIX;
    path.copy(static_cast<char*>(address.sun_path), longestSocketPath);
    const int result =
        ::connect(descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof(address));
    const int error = result == 0 ? 0 : errno;
    ::close(descriptor);
    // A socket of another type is in use as well.
    return error == EPROTOTYPE ? 0 : error;
}

/// The sockets of that path, as links of open files name them. Without one that another network
/// namespace has.
std::set<std::string> linksOf(const std::string& path, const std::string& proc) {
    std::set<std::string> links;
    std::ifstream sockets(proc + "/net/unix");
    for (std::string line; std::getline(sockets, line);) {
        std::istringstream columns(line);
        std::string ignored;
        std::string inode;
        std::string bound;
        for (int i = 0; i < 6; ++i) {
            columns >> ignored;
        }
        std::getline(columns >> inode >> std::ws, bound);
        if (bound == path) {
            links.insert("socket:[" + inode + "]");
        }
    }
    return links;
}

bool hasOpen(const fs::path& process, const std::set<std::string>& links) {
    std::error_code error;
    for (fs::directory_iterator each(process / "fd", error), end; !error && each != end;
         each.increment(error)) {
        std::error_code closed;
        if (links.count(fs::read_symlink(each->path(), closed)) > 0) {
            return true;
        }
    }
    return false;
}

std::string ownersOf(const std::string& path, const std::string& proc) {
    const auto links = linksOf(path, proc);
    std::error_code ignored;
    const auto processes = processesIn(proc, ignored);
    std::string owners;
    for (const auto& [id, process] : processes) {
        if (hasOpen(fs::path(proc) / std::to_string(id), links)) {
            owners +=
                fmt::format("{}{} (process {})", owners.empty() ? "" : "; ", process.name, id);
            const auto parent = processes.find(process.parent);
            if (parent != processes.end()) {
                owners +=
                    fmt::format(", started by {} (process {})", parent->second.name, parent->first);
            }
        }
    }
    return owners.empty() ? "somebody" : owners;
}

} // namespace

SocketUse useOfSocket(const std::string& path, const std::string& proc) {
    const std::string cut = path.substr(0, longestSocketPath);
    const int error = reach(cut);
    return {error, error == 0 ? ownersOf(cut, proc) : ""};
}

} // namespace vantelhost
