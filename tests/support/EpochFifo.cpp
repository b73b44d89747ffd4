#include "support/EpochFifo.h"

#include <stdexcept>

#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

EpochFifo::EpochFifo() {
    if (mkfifo(path, 0600) == 0) {
        descriptor_ = open(path, O_RDWR | O_NONBLOCK | O_CLOEXEC);
    }
    if (descriptor_ < 0) {
        throw std::runtime_error("no FIFO");
    }
}

EpochFifo::~EpochFifo() {
    close(descriptor_);
    unlink(path);
}

void EpochFifo::write(const std::vector<std::int64_t>& offsets) const {
    for (const std::int64_t offset : offsets) {
        writeOctets({reinterpret_cast<const char*>(&offset), sizeof(offset)});
    }
}

void EpochFifo::writeOctets(const std::string& octets) const {
    if (::write(descriptor_, octets.data(), octets.size()) != static_cast<ssize_t>(octets.size())) {
        throw std::runtime_error("the FIFO takes no more");
    }
}

int EpochFifo::queued() const {
    int octets = -1;
    ioctl(descriptor_, FIONREAD, &octets);
    return octets;
}
