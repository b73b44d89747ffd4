#include "RecordFile.h"

#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "UsageError.h"

namespace vantelhost {

namespace {

/// What keeps a file that is open from being this process's own and empty; null when nothing does.
const char* problemWith(int descriptor) {
    struct stat state {};
    if (::fstat(descriptor, &state) != 0 || !S_ISREG(state.st_mode)) {
        return nullptr;
    }
    if (::flock(descriptor, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) {
        return "somebody else writes it";
    }
    return ::ftruncate(descriptor, 0) == 0 ? nullptr : std::strerror(errno);
}

} // namespace

RecordFile::RecordFile(const std::string& path)
    : descriptor_(::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0644)) {
    const char* const problem = descriptor_ < 0 ? std::strerror(errno) : problemWith(descriptor_);
    if (problem != nullptr) {
        ::close(descriptor_);
        throw UsageError(fmt::format("cannot write {}: {}", path, problem));
    }
}

RecordFile::~RecordFile() {
    ::close(descriptor_);
}

} // namespace vantelhost
