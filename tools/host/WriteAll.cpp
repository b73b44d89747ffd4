#include "WriteAll.h"

#include <cerrno>
#include <cstddef>
#include <stdexcept>

#include <fmt/format.h>
#include <unistd.h>

#include "Text.h"

namespace vantelhost {

bool writeAll(int descriptor, std::string_view text) {
    while (!text.empty()) {
        const ssize_t written = ::write(descriptor, text.data(), text.size());
        if (written >= 0) {
            text.remove_prefix(static_cast<std::size_t>(written));
        } else if (errno != EINTR) {
            return false;
        }
    }
    return true;
}

void writeOutput(std::string_view text) {
    if (!writeAll(STDOUT_FILENO, text)) {
        throw std::runtime_error(
            fmt::format("cannot write the standard output: {}", errorText(errno)));
    }
}

} // namespace vantelhost
