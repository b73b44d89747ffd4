#include "Terminal.h"

#include <cerrno>
#include <system_error>

#include <fcntl.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <utmp.h>

Terminal::Terminal(const Words& command, const std::string& kind) {
    int own = -1;
    int programs = -1;
    if (::openpty(&own, &programs, nullptr, nullptr, nullptr) != 0) {
        throw std::system_error(errno, std::generic_category(), "openpty");
    }
    output_ = Descriptor(own);
    const Descriptor terminal(programs);
    input_ = Descriptor(::fcntl(own, F_DUPFD_CLOEXEC, 0));
    ::fcntl(own, F_SETFD, FD_CLOEXEC);
    resize(24, 80);
    start(command, {"TERM=" + kind}, [&] { ::login_tty(terminal.get()); });
}

void Terminal::resize(unsigned short rows, unsigned short columns) const {
    winsize size{};
    size.ws_row = rows;
    size.ws_col = columns;
    ::ioctl(output_.get(), TIOCSWINSZ, &size);
}
