#include "RecordFile.h"

#include <cerrno>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

bool isRegular(int descriptor) {
    struct stat state {};
    return ::fstat(descriptor, &state) == 0 && S_ISREG(state.st_mode);
}

bool isSomebodyElses(int descriptor) {
    return isRegular(descriptor) && ::flock(descriptor, LOCK_EX | LOCK_NB) != 0 &&
           errno == EWOULDBLOCK;
}

[[noreturn]] void refuse(const std::string& path, const std::string& problem) {
    throw UsageError(fmt::format("cannot write {}: {}", path, problem));
}

} // namespace

RecordFile::RecordFile(const std::string& path)
    : path_(path), descriptor_(::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0644)) {
    if (descriptor_ < 0) {
        refuse(path, errorText(errno));
    }
    if (isSomebodyElses(descriptor_)) {
        ::close(descriptor_);
        refuse(path, "somebody else writes it");
    }
}

void RecordFile::begin() const {
    if (isRegular(descriptor_) && ::ftruncate(descriptor_, 0) != 0) {
        refuse(path_, errorText(errno));
    }
}

RecordFile::~RecordFile() {
    ::close(descriptor_);
}

} // namespace vantelhost
