/// @file
#pragma once

#include <cstdint>
#include <string>

#include <sys/types.h>

namespace vantelhost {

/// The writing party of the FIFO that carries epoch offsets. Holds the FIFO open while it lives, so
/// that offsets wait in it for the plug-in.
class EpochFifo {
public:
    enum class Absent { refuse, create };

    /// What for: one that is only held, and that another party writes, need not be writable.
    enum class Use { hold, write };

    /// Opens the FIFO; one that it creates has mode 0600. Throws UsageError, also when something
    /// else than a FIFO has that name.
    EpochFifo(std::string path, Absent absent, Use use = Use::write);

    /// Closes the FIFO, and removes it if this object created it and nobody has replaced it.
    ~EpochFifo();
    EpochFifo(const EpochFifo&) = delete;
    EpochFifo& operator=(const EpochFifo&) = delete;

    /// Writes one offset: 8 octets in host order. Throws std::system_error, also when the FIFO is
    /// full.
    void write(std::int64_t nanoseconds);

private:
    bool create() const;
    int open(Use use) const;
    int openFor(Use use) const;
    void remove() const;

    std::string path_;
    bool created_;
    int descriptor_ = -1;
};

} // namespace vantelhost
