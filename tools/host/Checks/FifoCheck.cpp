#include "Checks/FifoCheck.h"

#include <cerrno>

#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Checks/Access.h"
#include "Text.h"

namespace vantelhost {

namespace {

Finding checkAbsent(const Subject& subject, int error) {
    if (error != ENOENT) {
        return bad(fmt::format("{}: {}", subject.fifo, errorText(error)), "");
    }
    if (subject.createFifo) {
        const Finding folder = checkFolderOf(subject.fifo);
        return folder.verdict == Verdict::ok ? good(subject.fifo + ", will be created") : folder;
    }
    return bad(fmt::format("{}: {}", subject.fifo, errorText(error)),
               fmt::format("mkfifo -m 600 {}, at each boot, by its writer; or run with "
                           "--create-fifo",
                           subject.fifo));
}

/// Whose values the plug-in would believe.
std::string strangers(const struct stat& state) {
    if (state.st_uid != 0 && state.st_uid != ::geteuid()) {
        return fmt::format("belongs to user {}, who can shift all time pairs", state.st_uid);
    }
    if ((state.st_mode & (S_IWGRP | S_IWOTH)) != 0) {
        return fmt::format("has mode {:04o}: others can shift all time pairs",
                           state.st_mode & 07777);
    }
    return {};
}

} // namespace

Finding checkFifo(const Subject& subject) {
    const std::string& path = subject.fifo;
    struct stat state {};
    if (::lstat(path.c_str(), &state) != 0) {
        return checkAbsent(subject, errno);
    }
    if (!S_ISFIFO(state.st_mode)) {
        return bad(path + ": is not a FIFO", fmt::format("remove it, then mkfifo -m 600 {}", path));
    }
    if (!isAllowed(path, R_OK)) {
        return bad(fmt::format("{}: {}", path, errorText(errno)),
                   "give the host's user the right to read it");
    }
    if (subject.writeFifo && !isAllowed(path, W_OK)) {
        return bad(fmt::format("{}: {}", path, errorText(errno)),
                   "give the host's user the right to write it, or leave epoch offsets to others");
    }
    const std::string problem = strangers(state);
    if (!problem.empty()) {
        return doubtful(fmt::format("{} {}", path, problem),
                        "have it made by root or the host's user, with mode 0600");
    }
    return good(path + "; its writer is not to be seen");
}

} // namespace vantelhost
