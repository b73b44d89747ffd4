#include "RecordFile.h"

#include <cerrno>
#include <utility>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

constexpr int none = -1;

struct stat stateOf(int descriptor) {
    struct stat state {};
    ::fstat(descriptor, &state);
    return state;
}

[[noreturn]] void refuse(const std::string& path, const std::string& problem) {
    throw UsageError(fmt::format("cannot write {}: {}", path, problem));
}

int opened(const std::string& path) {
    const int descriptor = ::open(path.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0644);
    if (descriptor < 0) {
        refuse(path, errorText(errno));
    }
    return descriptor;
}

void closeIfOpen(int descriptor) {
    if (descriptor != none) {
        ::close(descriptor);
    }
}

bool isSomebodyElses(int descriptor) {
    return ::flock(descriptor, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK;
}

} // namespace

RecordFile::RecordFile(const std::string& path) : path_(path), descriptor_(opened(path)) {
    while (isRegular()) {
        if (isSomebodyElses(descriptor_)) {
            ::close(descriptor_);
            refuse(path, "somebody else writes it");
        }
        if (isAt(path)) {
            return;
        }
        // Whoever wrote it has put another one in its place meanwhile.
        ::close(descriptor_);
        descriptor_ = opened(path);
    }
}

RecordFile::RecordFile(RecordFile&& other) noexcept
    : path_(std::move(other.path_)), descriptor_(std::exchange(other.descriptor_, none)) {}

RecordFile& RecordFile::operator=(RecordFile&& other) noexcept {
    std::swap(path_, other.path_);
    std::swap(descriptor_, other.descriptor_);
    return *this;
}

RecordFile::~RecordFile() {
    closeIfOpen(descriptor_);
}

void RecordFile::begin() const {
    if (isRegular() && ::ftruncate(descriptor_, 0) != 0) {
        refuse(path_, errorText(errno));
    }
}

bool RecordFile::isRegular() const {
    return S_ISREG(stateOf(descriptor_).st_mode);
}

std::uint64_t RecordFile::size() const {
    return isRegular() ? static_cast<std::uint64_t>(stateOf(descriptor_).st_size) : 0;
}

bool RecordFile::isAt(const std::string& path) const {
    const auto mine = stateOf(descriptor_);
    struct stat there {};
    return ::stat(path.c_str(), &there) == 0 && there.st_dev == mine.st_dev &&
           there.st_ino == mine.st_ino;
}

} // namespace vantelhost
