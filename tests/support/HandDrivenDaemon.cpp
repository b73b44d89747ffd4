#include "support/HandDrivenDaemon.h"

#include <utility>

namespace {

/// Of a message up to the data field: 34 + 14 + 6 octets, of which the plug-in reads none.
constexpr std::size_t headSize = 54;

template <typename Integer>
void append(Octets& octets, Integer value) {
    for (std::size_t octet = sizeof(value); octet-- > 0;) {
        octets.push_back(static_cast<std::uint8_t>(value >> (8 * octet)));
    }
}

Octets timeStatus(const HandDrivenDaemon::Measurement& measurement) {
    Octets answer(headSize);
    append(answer, measurement.masterOffset);
    append(answer, measurement.ingressTime);
    answer.resize(headSize + 38); // rates, time base and phase change
    append(answer, measurement.gmPresent);
    answer.resize(headSize + 50);
    return answer;
}

} // namespace

HandDrivenDaemon::HandDrivenDaemon(const std::string& path, std::vector<Measurement> polls)
    : socket_(path), polls_(std::move(polls)), thread_([this] { run(); }) {}

HandDrivenDaemon::~HandDrivenDaemon() {
    stopRequested_ = true;
    thread_.join();
}

void HandDrivenDaemon::run() {
    while (!stopRequested_) {
        if (const auto request = socket_.receive(std::chrono::milliseconds(50))) {
            answer(*request);
        }
    }
}

void HandDrivenDaemon::answer(const DatagramSocket::Datagram& request) {
    const unsigned managementId = request.octets.at(52) * 256U + request.octets.at(53);
    if (managementId == 0xC000) {
        socket_.sendTo(request.source, timeStatus(polls_.at(next_)));
        if (next_ + 1 < polls_.size()) {
            ++next_;
        }
    } else if (managementId == 0x2002) {
        socket_.sendTo(request.source, Octets(headSize + 32));
    } else if (managementId == 0x2000) {
        socket_.sendTo(request.source, Octets(headSize + 20));
    }
}
