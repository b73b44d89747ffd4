#include "Checks/SocketUse.h"

#include <cerrno>

#include <fmt/format.h>

#include "Checks/Listener.h"
#include "Tool.h"

using namespace vantelhost;

namespace {

std::string nameOf(pid_t process) {
    const std::string name = contentOf(fmt::format("/proc/{}/comm", process));
    return fmt::format("{} (process {})", name.substr(0, name.find('\n')), process);
}

std::string thisProcess() {
    return nameOf(::getpid()) + ", started by " + nameOf(::getppid());
}

} // namespace

TEST(SocketUse, NamesTheProcessThatListens) {
    const Folder folder;
    const Listener datagrams(folder.path("uds"), SOCK_DGRAM);
    const SocketUse use = useOfSocket(folder.path("uds"));
    EXPECT_EQ(use.error, 0);
    EXPECT_EQ(use.listener, thisProcess());
}

TEST(SocketUse, ASocketOfAnotherTypeIsInUse) {
    const Folder folder;
    const Listener stream(folder.path("uds"), SOCK_STREAM);
    const SocketUse use = useOfSocket(folder.path("uds"));
    EXPECT_EQ(use.error, 0);
    EXPECT_EQ(use.listener, thisProcess());
}

TEST(SocketUse, SomebodyListensWhereProcDoesNotTell) {
    const Folder folder;
    const Listener datagrams(folder.path("uds"), SOCK_DGRAM);
    const SocketUse use = useOfSocket(folder.path("uds"), folder.path("proc"));
    EXPECT_EQ(use.error, 0);
    EXPECT_EQ(use.listener, "somebody");
}

TEST(SocketUse, ALongPathIsCutAsPlugInAndDaemonDo) {
    const Folder folder;
    std::string path = folder.path("uds");
    path.resize(107, 'x');
    const Listener datagrams(path, SOCK_DGRAM);
    EXPECT_EQ(useOfSocket(path + "y").listener, thisProcess());
}

TEST(SocketUse, SaysWhyNobodyCanBeReached) {
    const Folder folder;
    EXPECT_EQ(useOfSocket(folder.path("uds")).error, ENOENT);
    { const Listener gone(folder.path("uds"), SOCK_DGRAM); }
    const SocketUse use = useOfSocket(folder.path("uds"));
    EXPECT_EQ(use.error, ECONNREFUSED);
    EXPECT_EQ(use.listener, "");
}
