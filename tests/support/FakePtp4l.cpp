#include "support/FakePtp4l.h"

#include <algorithm>
#include <exception>
#include <filesystem>
#include <memory>
#include <utility>

namespace {

constexpr std::uint64_t clockIdentity = 0xAABBCCFFFEDDEEFF;
constexpr std::uint64_t grandmasterIdentity = 0x001B21FFFE0A0B0C;

/// Of a message up to the data: 34 + 14 + 6 octets.
constexpr unsigned headSize = 54;

class Writer {
public:
    Writer& u8(unsigned value) {
        octets_.push_back(static_cast<std::uint8_t>(value & 0xffU));
        return *this;
    }
    Writer& u16(unsigned value) { return u8(value >> 8).u8(value); }
    Writer& u32(std::uint32_t value) { return u16(value >> 16).u16(value & 0xffffU); }
    Writer& u64(std::uint64_t value) {
        return u32(static_cast<std::uint32_t>(value >> 32))
            .u32(static_cast<std::uint32_t>(value & 0xffffffffU));
    }
    Writer& text(const std::string& value) {
        u8(static_cast<unsigned>(value.size()));
        octets_.insert(octets_.end(), value.begin(), value.end());
        return *this;
    }
    Writer& append(const std::vector<std::uint8_t>& octets) {
        octets_.insert(octets_.end(), octets.begin(), octets.end());
        return *this;
    }
    Writer& padToEven() { return octets_.size() % 2 == 0 ? *this : u8(0); }

    const std::vector<std::uint8_t>& octets() const { return octets_; }

private:
    std::vector<std::uint8_t> octets_;
};

/// What a daemon sends back: header, body of the management message, TLV.
std::vector<std::uint8_t> response(const FakePtp4l::Request& request, unsigned port,
                                   const Writer& data) {
    const auto size = static_cast<unsigned>(data.octets().size());
    Writer message;
    message.u8(0x0D).u8(0x02).u16(headSize + size).u16(0).u16(0).u64(0).u32(0);
    message.u64(clockIdentity).u16(port).u16(request.sequenceId()).u8(0x04).u8(0x7F);
    message.u64(0).u16(1).u8(0).u8(0).u8(0x02).u8(0);
    message.u16(0x0001).u16(2 + size).u16(request.managementId());
    return message.append(data.octets()).octets();
}

Writer timeStatus() {
    Writer data;
    data.u64(0xFFFFFFFFFFFFFFD6).u64(0x1797AB0123456789).u32(0xFFFFFFF9).u32(0x00000005);
    data.u16(0x0003).u16(0x1234).u64(0x5566778899AABBCC).u16(0xDDEE);
    return data.u32(0x00000001).u64(grandmasterIdentity);
}

Writer parent() {
    Writer data;
    data.u64(grandmasterIdentity).u16(1).u8(0).u8(0).u16(0xFFFF).u32(0x7FFFFFFF);
    return data.u8(128).u8(6).u8(0x21).u16(20061).u8(127).u64(grandmasterIdentity);
}

Writer defaults(unsigned ports) {
    Writer data;
    data.u8(1).u8(0).u16(ports).u8(128).u8(248).u8(0xFE).u16(65535).u8(129);
    return data.u64(clockIdentity).u8(24).u8(0);
}

Writer port(unsigned number) {
    Writer data;
    data.u64(clockIdentity).u16(number).u8(number == 1 ? 9 : 6).u8(0).u64(0x0000000000010000);
    return data.u8(1).u8(3).u8(0xFD).u8(2).u8(0xFE).u8(2);
}

Writer portNp(unsigned number) {
    Writer data;
    return data.u32(799 + number).u32(number == 1 ? 1 : 0);
}

Writer portProperties(unsigned number) {
    Writer data;
    data.u64(clockIdentity).u16(number).u8(number == 1 ? 9 : 6).u8(1);
    return data.text("swp" + std::to_string(number)).padToEven();
}

Writer perPort(const FakePtp4l::Request& request, unsigned number) {
    switch (request.managementId()) {
    case FakePtp4l::portDataSet:
        return port(number);
    case FakePtp4l::portDataSetNp:
        return portNp(number);
    default:
        return portProperties(number);
    }
}

template <typename Take>
void forEachAnswer(const FakePtp4l::Request& request, unsigned ports, const Take& take) {
    switch (request.managementId()) {
    case FakePtp4l::timeStatusNp:
        return take(response(request, 0, timeStatus()));
    case FakePtp4l::parentDataSet:
        return take(response(request, 0, parent()));
    case FakePtp4l::defaultDataSet:
        return take(response(request, 0, defaults(ports)));
    default:
        break;
    }
    for (unsigned number = 1; number <= ports; ++number) {
        take(response(request, number, perPort(request, number)));
    }
}

/// Fills the data of an answer: octets, and zeros behind them.
void setData(Octets& answer, const Writer& data) {
    const std::size_t size = answer.size();
    answer.resize(headSize);
    answer.insert(answer.end(), data.octets().begin(), data.octets().end());
    answer.resize(size);
}

FakePtp4l::Script measured(std::vector<FakePtp4l::Measurement> polls) {
    return [polls = std::move(polls), next = std::make_shared<std::size_t>(0)](
               const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        Writer data;
        if (request.managementId() == FakePtp4l::timeStatusNp) {
            const auto& poll = polls.at(*next);
            data.u64(poll.masterOffset).u64(poll.ingressTime);
            data.u64(0).u64(0).u32(0).u16(0); // rates, time base and phase change
            data.u32(poll.gmPresent);
            *next = std::min(*next + 1, polls.size() - 1);
        }
        for (Octets& answer : answers) {
            setData(answer, data);
        }
    };
}

} // namespace

std::uint16_t FakePtp4l::Request::at(std::size_t index) const {
    return static_cast<std::uint16_t>(octets.at(index) << 8 | octets.at(index + 1));
}

FakePtp4l::FakePtp4l(const std::string& path, std::uint16_t ports, Script script)
    : path_(path), socket_(path), ports_(ports), script_(std::move(script)), thread_([this] {
          run();
      }) {}

FakePtp4l::FakePtp4l(const std::string& path, std::vector<Measurement> polls)
    : FakePtp4l(path, 0, measured(std::move(polls))) {}

FakePtp4l::~FakePtp4l() {
    stopped_ = true;
    try {
        DatagramSocket().sendTo(path_, {});
    } catch (const std::exception&) {
        // Then its wait ends at the deadline.
    }
    thread_.join();
    std::error_code ignored;
    std::filesystem::remove(path_, ignored);
}

void FakePtp4l::setPorts(std::uint16_t ports) {
    const std::lock_guard<std::mutex> lock(mutex_);
    ports_ = ports;
}

void FakePtp4l::setScript(Script script) {
    const std::lock_guard<std::mutex> lock(mutex_);
    script_ = std::move(script);
}

std::vector<FakePtp4l::Request> FakePtp4l::requests() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return requests_;
}

void FakePtp4l::settle() const {
    std::unique_lock<std::mutex> lock(mutex_);
    const unsigned before = marks_;
    lock.unlock();
    DatagramSocket().sendTo(path_, {});
    lock.lock();
    settled_.wait(lock, [&] { return marks_ != before; });
}

FakePtp4l::Answers FakePtp4l::answersTo(const Request& request, std::uint16_t ports) {
    Answers answers;
    forEachAnswer(request, ports, [&](const Octets& answer) { answers.push_back(answer); });
    return answers;
}

void FakePtp4l::run() {
    while (!stopped_) {
        const auto datagram = socket_.receive();
        if (!datagram) {
            continue;
        }
        if (datagram->octets.empty()) {
            const std::lock_guard<std::mutex> lock(mutex_);
            ++marks_;
            settled_.notify_all();
        } else {
            answer({datagram->octets, datagram->source});
        }
    }
}

void FakePtp4l::answer(const Request& request) {
    Script script;
    std::uint16_t ports = 0;
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        requests_.push_back(request);
        script = script_;
        ports = ports_;
    }
    const auto send = [&](const Octets& answer) { socket_.sendTo(request.source, answer); };
    if (!script) {
        // One by one, as a daemon does: nobody waits until ten thousand are made.
        forEachAnswer(request, ports, send);
        return;
    }
    Answers answers = answersTo(request, ports);
    script(request, answers);
    std::for_each(answers.begin(), answers.end(), send);
}
