#include "Rotation.h"

#include <filesystem>
#include <system_error>
#include <utility>

#include "RotatedName.h"

namespace vantelhost {

namespace {

namespace fs = std::filesystem;

/// Removed if it still has its name when this object ends.
class Draft {
public:
    explicit Draft(std::string path) : path_(std::move(path)) {}
    ~Draft() {
        std::error_code ignored;
        fs::remove(path_, ignored);
    }
    Draft(const Draft&) = delete;
    Draft& operator=(const Draft&) = delete;

    const std::string& path() const { return path_; }

private:
    std::string path_;
};

} // namespace

Rotation::Rotation(std::string path, unsigned keep) : path_(std::move(path)), keep_(keep) {}

RecordFile Rotation::rotate(const RecordFile& present) const {
    const Draft draft(path_ + ".new");
    RecordFile next(draft.path());
    next.begin();
    makeFirstFree(present);
    // One file, two names, until the new one takes the first: FILE never is nobody's.
    const auto first = rotatedName(path_, 1);
    fs::create_hard_link(path_, first);
    try {
        fs::rename(draft.path(), path_);
    } catch (const fs::filesystem_error&) {
        fs::remove(first);
        throw;
    }
    removeSurplus();
    return next;
}

void Rotation::makeFirstFree(const RecordFile& present) const {
    const auto isFree = [&](unsigned number) {
        // A rotation that was cut short has left it.
        const auto name = rotatedName(path_, number);
        return !fs::exists(fs::symlink_status(name)) || present.isAt(name);
    };
    unsigned number = 1;
    while (number < keep_ && !isFree(number)) {
        ++number;
    }
    for (; number > 1; --number) {
        fs::rename(rotatedName(path_, number - 1), rotatedName(path_, number));
    }
    fs::remove(rotatedName(path_, 1));
}

void Rotation::removeSurplus() const {
    std::error_code ignored;
    for (unsigned number = keep_ + 1; fs::remove(rotatedName(path_, number), ignored); ++number) {
    }
}

} // namespace vantelhost
