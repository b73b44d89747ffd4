/// @file
#pragma once

#include <string>
#include <vector>

/// Where chronyd listens.
class ListeningChronyd {
public:
    explicit ListeningChronyd(const std::string& path);
    ~ListeningChronyd();
    ListeningChronyd(const ListeningChronyd&) = delete;
    ListeningChronyd& operator=(const ListeningChronyd&) = delete;

    /// @return the next sample that was sent; empty when there is none.
    std::string receive() const;

    /// What the local time lacks, in seconds, of the samples to come in their order. To be called
    /// often: about ten wait, and chronyd would not be sent more.
    void read();

    /// Those that were read; then none is.
    std::vector<double> takeOffsets();

private:
    int descriptor_;
    std::vector<double> offsets_;
};
