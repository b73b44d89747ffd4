// Arbitrary datagrams as answers to the node's exchanges: an exchange takes what a model of it
// takes, by length alone, and ends in an error that the fetcher knows.

#include <algorithm>
#include <cstring>
#include <set>
#include <string>
#include <vector>

#include "FuzzInput.h"
#include "errors/Exception.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"
#include "tUdsMsgAddress.h"

using namespace zekelVantel;

namespace {

constexpr std::int32_t timedOut = -52007;
constexpr std::int32_t endOfData = -52012;
constexpr std::int32_t fault = -52024;

// Lengths of a datagram that stand for something else.
constexpr std::uint32_t failingReceive = 0xffff;
constexpr std::uint32_t warningReceive = 0xfffe;

/// Hands out the datagrams that are cut from the input, and keeps them for the model.
class CutInterface : public iMsgInterface {
public:
    explicit CutInterface(FuzzInput& input) : input_(input) {}

    void open(const std::string& /*localPath*/, zeerr::Status& /*status*/) override {}
    int close() override { return 0; }
    bool isOpen() const override { return true; }

    void send(const tMsgBuffer& buffer, const iMsgAddress& /*remoteAddress*/,
              zeerr::Status& /*status*/) override {
        request.assign(buffer.data(), buffer.data() + buffer.getLength());
    }

    void receive(tMsgBuffer& buffer, std::uint32_t timeoutMs, zeerr::Status& status) override {
        require(timeoutMs == 2000, "every answer has 2000 ms");
        if (zeerr::isError(status)) {
            return;
        }
        received.emplace_back();
        if (input_.atEnd()) {
            zeerr::setError(status, zeerr::site::receiveTimedOut);
            return;
        }
        std::uint32_t length = input_.octet() * 256U;
        length += input_.octet();
        if (length == failingReceive) {
            zeerr::setError(status, zeerr::site::receiveFailed);
            return;
        }
        if (length == warningReceive) {
            zeerr::setCode(status, 1);
        }
        std::vector<std::uint8_t>& datagram = received.back();
        for (length %= tMsgBuffer::capacity() + 1; length > 0 && !input_.atEnd(); --length) {
            datagram.push_back(input_.octet());
        }
        std::copy(datagram.begin(), datagram.end(), buffer.data());
        buffer.setLength(static_cast<std::uint32_t>(datagram.size()), status);
    }

    void receive(tMsgBuffer& buffer, iMsgAddress& /*sourceAddress*/, std::uint32_t timeoutMs,
                 zeerr::Status& status) override {
        receive(buffer, timeoutMs, status);
    }

    std::vector<std::uint8_t> request;
    std::vector<std::vector<std::uint8_t>> received;

private:
    FuzzInput& input_;
};

class Exchange {
public:
    Exchange(FuzzInput& input, tPtpMgmtNode& node) : interface_(input), node_(node) {
        status_.code = input.octet() % 8 == 7 ? 1 : 0;
    }

    template <typename Tlv>
    void single(std::size_t octets) {
        Tlv tlv;
        node_.getSingle(interface_, remote_, tlv, status_);
        checkRequest(octets, octets);
        require(interface_.received.size() == 1, "one answer is received");
        const auto& answer = interface_.received.front();
        if (!zeerr::isError(status_)) {
            require(answer.size() == octets, "a single answer has the length of the request");
            require(tlv.lengthField() == answer[50] * 256U + answer[51], "the answer is decoded");
        } else if (status_.code == endOfData) {
            require(answer.size() != octets, "an answer of the right length is taken");
        }
        checkStatus();
    }

    template <typename Tlv>
    void fromPorts(std::uint32_t count, std::size_t octets, std::size_t messageLength,
                   tPadOctet padOctet) {
        std::vector<typename Tlv::Data> answers;
        const bool cleanBefore = zeerr::isClean(status_);
        node_.getFromPorts<Tlv>(interface_, remote_, count, answers, status_, padOctet);
        checkRequest(octets, messageLength);
        const std::size_t received = interface_.received.size();
        require(received <= count, "never more receives than answers are wanted");
        require(answers.size() <= received, "never more answers than datagrams");
        if (zeerr::isClean(status_)) {
            require(answers.size() == count, "a clean exchange has all its answers");
        } else if (zeerr::isError(status_)) {
            require(answers.size() < received, "the answer that failed is not appended");
            require(status_.code != endOfData || isTooShort<Tlv>(interface_.received.back()),
                    "an answer of the minimum length, or longer, is taken");
        } else {
            require(received == count, "a warning does not end the exchange");
        }
        require(cleanBefore || answers.empty(), "answers are appended only to a clean status");
        for (std::size_t index = 0; index < received; ++index) {
            const bool mayHaveFailed = zeerr::isError(status_) && index + 1 == received;
            require(mayHaveFailed || !isTooShort<Tlv>(interface_.received[index]),
                    "an answer below the minimum length ends the exchange");
        }
        for (std::size_t index = 0; index < answers.size(); ++index) {
            checkAnswer(answers[index], interface_.received[index]);
        }
        checkStatus();
    }

private:
    using Octets = std::vector<std::uint8_t>;

    static std::size_t minimum(const tPortDataSet& /*type*/, const Octets& /*octets*/) {
        return 80;
    }
    static std::size_t minimum(const tPortDataSetNp& /*type*/, const Octets& /*octets*/) {
        return 62;
    }
    static std::size_t minimum(const tPortProperties& /*type*/, const Octets& octets) {
        return 67U + (octets.size() < 67 ? 0 : octets[66]);
    }

    template <typename Tlv>
    static bool isTooShort(const Octets& octets) {
        return octets.size() < minimum(typename Tlv::Data(), octets);
    }

    static void checkAnswer(const tPortDataSet& data, const Octets& octets) {
        require(data.versionNumber == octets[79], "answers stay in the order of arrival");
    }
    static void checkAnswer(const tPortDataSetNp& data, const Octets& octets) {
        require((data.neighborPropDelayThresh & 0xff) == octets[57],
                "answers stay in the order of arrival");
    }
    static void checkAnswer(const tPortProperties& data, const Octets& octets) {
        require(data.interface.lengthField() == octets[66], "the length of a name is kept");
        const std::string name = data.interface.text();
        require(name.size() <= octets[66], "a name is no longer than its length");
        require(std::memcmp(name.data(), octets.data() + 67, name.size()) == 0,
                "a name is what was received");
    }

    void checkRequest(std::size_t octets, std::size_t messageLength) const {
        require(interface_.request.size() == octets, "a request is as long as its objects");
        require(interface_.request[2] * 256U + interface_.request[3] == messageLength,
                "messageLength counts the request");
    }

    void checkStatus() const {
        static const std::set<std::int32_t> codes{0, 1, timedOut, endOfData, fault};
        require(codes.count(status_.code) == 1, "the code is one that the fetcher knows");
        require(zeerr::isError(status_) == (status_.json != nullptr), "an error has a text");
    }

    CutInterface interface_;
    tPtpMgmtNode& node_;
    tUdsMsgAddress remote_{"/remote"};
    zeerr::LocalStatus status_;
};

void run(FuzzInput& input, tPtpMgmtNode& node) {
    const unsigned form = input.octet() % 8U;
    const std::uint32_t count = input.octet() % 20U;
    const auto pad = form < 6 ? tPadOctet::uncounted : tPadOctet::counted;
    Exchange exchange(input, node);
    switch (form) {
    case 0:
        return exchange.single<tPtp4lTimeStatusMgmtTlv>(104);
    case 1:
        return exchange.single<tPtp4lParentDataSetMgmtTlv>(86);
    case 2:
        return exchange.single<tPtp4lDefaultDataSetMgmtTlv>(74);
    case 3:
    case 6:
        return exchange.fromPorts<tPtp4lPortDataSetMgmtTlv>(count, 80, 80, pad);
    case 4:
        return exchange.fromPorts<tPtp4lPortDataSetNpMgmtTlv>(count, 62, 62, pad);
    case 5:
        return exchange.fromPorts<tPtp4lPortPropertiesMgmtTlv>(count, 68, 67, pad);
    default:
        return exchange.fromPorts<tPtp4lPortPropertiesMgmtTlv>(count, 68, 68, pad);
    }
}

} // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    FuzzInput input(data, size);
    tPtpMgmtNode node(tPtpPortIdentity(tPtpClockIdentity(), 1), input.octet());
    for (int exchanges = 0; exchanges < 16 && !input.atEnd(); ++exchanges) {
        run(input, node);
    }
    return 0;
}
