#include "Report/Gnuplot.h"

#include <array>
#include <cerrno>
#include <cstdio>
#include <memory>
#include <stdexcept>

#include <fmt/format.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "Text.h"

namespace vantelhost {

namespace {

constexpr const char* missing = "there is no gnuplot; Debian's package is gnuplot-nox";

struct CloseFile {
    void operator()(std::FILE* file) const { static_cast<void>(std::fclose(file)); }
};

/// Without a name. Files, not pipes: nobody waits for the other end.
using TemporaryFile = std::unique_ptr<std::FILE, CloseFile>;

TemporaryFile temporaryFile(const std::string& content = {}) {
    TemporaryFile file(std::tmpfile());
    if (!file || std::fwrite(content.data(), 1, content.size(), file.get()) != content.size() ||
        std::fflush(file.get()) != 0) {
        throw std::runtime_error(fmt::format("a temporary file: {}", errorText(errno)));
    }
    std::rewind(file.get());
    return file;
}

std::string contentOf(std::FILE* file) {
    std::rewind(file);
    std::string text;
    std::array<char, 65536> buffer{};
    std::size_t count = 0;
    while ((count = std::fread(buffer.data(), 1, buffer.size(), file)) > 0) {
        text.append(buffer.data(), count);
    }
    return text;
}

/// Without the user's own settings (-d).
pid_t spawn(std::FILE* input, std::FILE* output, std::FILE* errors) {
    std::string name = "gnuplot";
    std::string option = "-d";
    std::array<char*, 3> words{name.data(), option.data(), nullptr};
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_adddup2(&actions, ::fileno(input), STDIN_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, ::fileno(output), STDOUT_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, ::fileno(errors), STDERR_FILENO);
    pid_t pid = -1;
    const int failure =
        ::posix_spawnp(&pid, name.c_str(), &actions, nullptr, words.data(), environ);
    ::posix_spawn_file_actions_destroy(&actions);
    if (failure == ENOENT) {
        throw std::runtime_error(missing);
    }
    if (failure != 0) {
        throw std::runtime_error(fmt::format("gnuplot: {}", errorText(failure)));
    }
    return pid;
}

/// The status that waitpid tells.
int waitFor(pid_t pid) {
    int status = -1;
    while (::waitpid(pid, &status, 0) < 0 && errno == EINTR) {
    }
    return status;
}

} // namespace

std::string runGnuplot(const std::string& script) {
    const auto input = temporaryFile(script);
    const auto output = temporaryFile();
    const auto errors = temporaryFile();
    const int status = waitFor(spawn(input.get(), output.get(), errors.get()));
    // Where spawning is emulated the child itself says that there is nothing to run.
    if (WIFEXITED(status) && WEXITSTATUS(status) == 127) {
        throw std::runtime_error(missing);
    }
    if (status != 0) {
        throw std::runtime_error("gnuplot failed: " + contentOf(errors.get()));
    }
    return contentOf(output.get());
}

} // namespace vantelhost
