#include "Terminal.h"

#include <cerrno>
#include <system_error>

#include <fcntl.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <utmp.h>

namespace {

void setSize(int terminal, unsigned short rows, unsigned short columns) {
    winsize size{};
    size.ws_row = rows;
    size.ws_col = columns;
    ::ioctl(terminal, TIOCSWINSZ, &size);
}

} // namespace

Terminal::Terminal(const Words& command, const std::string& kind) {
    int own = -1;
    int programs = -1;
    if (::openpty(&own, &programs, nullptr, nullptr, nullptr) != 0) {
        throw std::system_error(errno, std::generic_category(), "openpty");
    }
    const Descriptor terminal(programs);
    Streams streams{Descriptor(::fcntl(own, F_DUPFD_CLOEXEC, 0)), Descriptor(own), Descriptor()};
    ::fcntl(own, F_SETFD, FD_CLOEXEC);
    setSize(own, 24, 80);
    start(command, {"TERM=" + kind}, std::move(streams), [&] { ::login_tty(terminal.get()); });
}

void Terminal::resize(unsigned short rows, unsigned short columns) const {
    setSize(outputDescriptor(), rows, columns);
}
