/// @file
#pragma once

#include <string>

#include "RecordFile.h"

namespace vantelhost {

/// Makes a full FILE the newest of its old ones, FILE.1, and a new one in its place. Older ones
/// move on to FILE.2 and so on; those beyond the last number are removed. A number that is missing
/// is filled first.
class Rotation {
public:
    /// @param keep how many old ones there may be, 1 to mostRotated
    Rotation(std::string path, unsigned keep);

    /// FILE is there at any moment, and its writer has it to himself.
    /// @return the new FILE. Throws what says why there is none; the present one is then still
    /// FILE.
    RecordFile rotate(const RecordFile& present) const;

private:
    void makeFirstFree(const RecordFile& present) const;
    void removeSurplus() const;

    std::string path_;
    unsigned keep_;
};

} // namespace vantelhost
