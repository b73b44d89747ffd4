/// @file
#pragma once

#include <cstdint>
#include <string>
#include <vector>

/// The other party of the plug-in's epoch FIFO: creates it and keeps it open for writing.
class EpochFifo {
public:
    EpochFifo();
    ~EpochFifo();
    EpochFifo(const EpochFifo&) = delete;
    EpochFifo& operator=(const EpochFifo&) = delete;

    static constexpr char path[] = "quillEpochOffset";

    void write(const std::vector<std::int64_t>& offsets) const;
    void writeOctets(const std::string& octets) const;

    /// Octets that nobody has read yet.
    int queued() const;

private:
    int descriptor_ = -1;
};
