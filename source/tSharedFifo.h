/// @file
#pragma once

#include <cstddef>
#include <string>

#include <sys/types.h>

#include "errors/Status.h"
#include "tFileDescriptor.h"

namespace zekelVantel {

/// One end of a named pipe, fifo(7), that is never waited for. Operations that get a status with an
/// error do nothing.
class tSharedFifo {
public:
    /// @param owner this end creates the FIFO, in place of whatever stands at the path, and removes
    /// it
    ///              in the end. The other end only opens it, when it first reads.
    /// Error: -52008 when the FIFO cannot be created.
    tSharedFifo(std::string path, bool owner, zeerr::Status& status);
    ~tSharedFifo();
    tSharedFifo(const tSharedFifo&) = delete;
    tSharedFifo& operator=(const tSharedFifo&) = delete;

    /// Errors: -52006 when there is nothing at the path, -52008 when it cannot be opened otherwise.
    void open(zeerr::Status& status);
    bool isOpen() const { return descriptor_.isOpen(); }

    /// Reads what is there, after opening if need be.
    /// @return octets read, 0 while nobody has the FIFO open for writing, or -1 with an error:
    /// -52012
    ///         when it is empty, -52008 when it cannot be read otherwise, and those of open.
    ssize_t read(void* buffer, std::size_t length, zeerr::Status& status);

    /// Writes what there is room for, after opening if need be. For the owner.
    /// @return octets written, or -1 with an error: -52008 when the FIFO cannot be written, and
    /// those of
    ///         open.
    ssize_t write(const void* buffer, std::size_t length, zeerr::Status& status);

    /// Octets that the FIFO holds at most.
    std::size_t capacity() const;

    /// A failure is traced only.
    void close();

private:
    std::string path_;
    bool owner_;
    tFileDescriptor descriptor_;
};

} // namespace zekelVantel
