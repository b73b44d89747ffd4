/// @file
#pragma once

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "support/DatagramSocket.h"

/// Plays ptp4l's management socket, on a thread and with an encoder of its own. It knows the clock
/// AA:BB:CC:FF:FE:DD:EE:FF with some ports, port 1 of which follows a grandmaster; or a clock
/// without ports whose data sets are all zero, with measurements that a test chooses.
class FakePtp4l {
public:
    enum ManagementId : std::uint16_t {
        defaultDataSet = 0x2000,
        parentDataSet = 0x2002,
        portDataSet = 0x2004,
        timeStatusNp = 0xC000,
        portDataSetNp = 0xC002,
        portPropertiesNp = 0xC004
    };

    struct Request {
        std::vector<std::uint8_t> octets;
        std::string source; ///< path of the sender

        std::uint16_t at(std::size_t index) const;
        std::uint16_t messageLength() const { return at(2); }
        std::uint16_t sequenceId() const { return at(30); }
        std::uint16_t managementId() const { return at(52); }
    };

    using Answers = std::vector<std::vector<std::uint8_t>>;

    /// Told of every request before it is answered, on the daemon's thread. May change the answers.
    using Script = std::function<void(const Request& request, Answers& answers)>;

    /// What TIME_STATUS_NP shows.
    struct Measurement {
        std::uint64_t masterOffset = 0; ///< as the 64 bits on the wire
        std::uint64_t ingressTime = 0;
        std::uint32_t gmPresent = 0;
    };

    explicit FakePtp4l(const std::string& path, std::uint16_t ports = 1, Script script = {});

    /// @param polls the first poll gets the first measurement, and so on; the last one stays.
    FakePtp4l(const std::string& path, std::vector<Measurement> polls);
    ~FakePtp4l();
    FakePtp4l(const FakePtp4l&) = delete;
    FakePtp4l& operator=(const FakePtp4l&) = delete;

    void setPorts(std::uint16_t ports);
    void setScript(Script script);

    std::vector<Request> requests() const;

    /// Waits until everything that was sent so far has been answered.
    void settle() const;

    /// Sends something that nobody asked for. @return false when nobody is there.
    bool send(const std::string& path, const std::vector<std::uint8_t>& octets) const {
        return socket_.sendTo(path, octets);
    }

    /// The answers to a request, if there is no script.
    static Answers answersTo(const Request& request, std::uint16_t ports);

private:
    void run();
    void answer(const Request& request);

    const std::string path_;
    DatagramSocket socket_;
    mutable std::mutex mutex_;
    mutable std::condition_variable settled_;
    std::vector<Request> requests_;
    std::uint16_t ports_;
    Script script_;
    unsigned marks_ = 0; ///< empty datagrams received
    std::atomic<bool> stopped_{false};
    std::thread thread_;
};
