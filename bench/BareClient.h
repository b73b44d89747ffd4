/// @file
#pragma once

#include <cstdint>
#include <vector>

#include "Client.h"
#include "support/DatagramSocket.h"
#include "tUdsMsgAddress.h"

/// Makes the system calls of a fetch and nothing else: sends as many octets as the fetch sends,
/// and throws away what comes.
class BareClient : public Client {
public:
    BareClient(const std::string& daemon, std::uint16_t ports);

    void poll() override;

private:
    struct Request {
        Octets octets;
        std::uint16_t answers;
    };

    template <typename Tlv>
    void prepare(std::uint16_t answers);

    void receive() const;

    /// Its path is as long as the fetch's: the daemon looks it up for each answer.
    DatagramSocket socket_;
    zekelVantel::tUdsMsgAddress daemon_;
    std::vector<Request> requests_;
};
