#include "Checks/Access.h"

#include <cerrno>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Text.h"

namespace vantelhost {

namespace {

std::string folderOf(const std::string& file) {
    const auto slash = file.rfind('/');
    if (slash == std::string::npos) {
        return ".";
    }
    return slash == 0 ? "/" : file.substr(0, slash);
}

} // namespace

bool isAllowed(const std::string& path, int mode) {
    return ::faccessat(AT_FDCWD, path.c_str(), mode, AT_EACCESS) == 0;
}

Finding checkFolderOf(const std::string& file, const char* otherMend) {
    const std::string folder = folderOf(file);
    struct stat state {};
    if (::stat(folder.c_str(), &state) != 0) {
        const int error = errno;
        return bad(fmt::format("{}: {}", folder, errorText(error)),
                   error == ENOENT ? "mkdir -p " + folder + otherMend : "");
    }
    if (!S_ISDIR(state.st_mode)) {
        return bad(folder + ": is not a folder", "");
    }
    if (!isAllowed(folder, W_OK | X_OK)) {
        return bad(fmt::format("{}: {}", folder, errorText(errno)),
                   "run the host as a user who may write there");
    }
    return good(folder + " is writable");
}

} // namespace vantelhost
