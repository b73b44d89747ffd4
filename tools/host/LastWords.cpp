#include "LastWords.h"

#include <array>
#include <cerrno>
#include <sstream>
#include <system_error>

#include <fcntl.h>
#include <unistd.h>

#include "WriteAll.h"

namespace vantelhost {

LastWords::Redirection::Redirection(LastWords& words)
    : saved_(::fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 0)) {
    if (saved_ < 0) {
        return;
    }
    int ends[2];
    if (::pipe2(ends, O_CLOEXEC) != 0) {
        const int error = errno;
        ::close(saved_);
        throw std::system_error(error, std::system_category(), "a pipe");
    }
    // The writing end stays as it is: whoever gets it may rely on waiting.
    ::fcntl(ends[0], F_SETFL, O_NONBLOCK);
    // Nobody reads while the plug-in stops ptp4l, which must not wait for that with its last words.
    ::fcntl(ends[0], F_SETPIPE_SZ, 1 << 20);
    ::dup2(ends[1], STDERR_FILENO);
    ::close(ends[1]);
    words.reading_ = ends[0];
}

LastWords::Redirection::~Redirection() {
    if (saved_ >= 0) {
        ::dup2(saved_, STDERR_FILENO);
        ::close(saved_);
    }
}

LastWords::~LastWords() {
    if (reading_ >= 0) {
        ::close(reading_);
    }
}

void LastWords::take() {
    constexpr int most = 256; // a pipe full: a writer that never pauses must not hold the host
    std::array<char, 4096> buffer{};
    for (int i = 0; i < most && reading_ >= 0; ++i) {
        const ssize_t count = ::read(reading_, buffer.data(), buffer.size());
        if (count > 0) {
            keep({buffer.data(), static_cast<std::size_t>(count)});
        } else if (count == 0) { // whoever had the other end is gone
            ::close(reading_);
            reading_ = -1;
        } else if (errno != EINTR) {
            return;
        }
    }
}

void LastWords::keep(const std::string& text) {
    constexpr std::size_t most = 2000;
    if (passOn_ >= 0) {
        writeAll(passOn_, text);
    }
    kept_ += text;
    kept_.erase(0, kept_.size() > most ? kept_.size() - most : 0);
}

std::deque<std::string> LastWords::lines() const {
    constexpr std::size_t most = 3;
    std::deque<std::string> lines;
    std::istringstream text(kept_);
    for (std::string line; std::getline(text, line);) {
        if (line.find_first_not_of(" \t\r") != std::string::npos) {
            lines.push_back(line);
        }
        if (lines.size() > most) {
            lines.pop_front();
        }
    }
    return lines;
}

} // namespace vantelhost
