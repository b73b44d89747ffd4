#include "Screen.h"

#include <sys/ioctl.h>

#include "WriteAll.h"

namespace vantelhost {

// Control sequences of ECMA-48 and xterm. What cannot be written here cannot be told either; the
// next drawing will fail, too.

Screen::Screen(int terminal) : terminal_(terminal) {
    writeAll(terminal_, "\x1b[?1049h\x1b[?25l");
}

Screen::~Screen() {
    writeAll(terminal_, "\x1b[?25h\x1b[?1049l");
}

bool Screen::draw(const std::vector<std::string>& lines) const {
    std::string text = "\x1b[H";
    for (const auto& line : lines) {
        // No new line behind the last row: it would scroll. Rest of the line, rest of the screen.
        text += (&line == &lines.front() ? "" : "\r\n") + line + "\x1b[K";
    }
    return writeAll(terminal_, text + "\x1b[J");
}

ScreenSize Screen::size() const {
    winsize size{};
    if (::ioctl(terminal_, TIOCGWINSZ, &size) != 0 || size.ws_row == 0 || size.ws_col == 0) {
        return {24, 80};
    }
    return {size.ws_row, size.ws_col};
}

} // namespace vantelhost
