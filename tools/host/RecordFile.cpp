#include "RecordFile.h"

#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <fmt/format.h>
#include <unistd.h>

#include "UsageError.h"

namespace vantelhost {

RecordFile::RecordFile(const std::string& path)
    : descriptor_(::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644)) {
    if (descriptor_ < 0) {
        throw UsageError(fmt::format("cannot write {}: {}", path, std::strerror(errno)));
    }
}

RecordFile::~RecordFile() {
    ::close(descriptor_);
}

} // namespace vantelhost
