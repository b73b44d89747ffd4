#include "tGetDataFromPtp4l.h"

#include <unistd.h>

#include "errors/Exception.h"
#include "paths.h"

namespace zekelVantel {

tGetDataFromPtp4l::tGetDataFromPtp4l(const std::string& remoteAddress,
                                     std::uint8_t transportSpecific)
    : node_(tPtpPortIdentity(tPtpClockIdentity(), 1), transportSpecific),
      remoteAddress_(remoteAddress) {}

tGetDataFromPtp4l::~tGetDataFromPtp4l() = default;

std::int32_t tGetDataFromPtp4l::fetch(tTimeStatus& timeStatus, tPtp4lMetaData& metaData) {
    try {
        openOnDemand();
        timeStatus = tTimeStatus();
        tPtp4lTimeStatusMgmtTlv answer;
        getSingle(answer);
        timeStatus = answer.data();
        fetchMetaData(metaData);
        return 0;
    } catch (...) {
        interface_.close();
        zeerr::LocalStatus status;
        zeerr::statusFromCurrentException(status);
        return status.code;
    }
}

void tGetDataFromPtp4l::openOnDemand() {
    if (interface_.isOpen()) {
        return;
    }
    zeerr::LocalStatus status;
    // [oddity path-per-process] The path is the process's, not the session's: one boundary clock a
    // host.
    interface_.open(localSocketPrefix + std::to_string(getpid()), status);
    zeerr::throwIfError(status);
}

void tGetDataFromPtp4l::fetchMetaData(tPtp4lMetaData& metaData) {
    tPtp4lParentDataSetMgmtTlv parent;
    tPtp4lDefaultDataSetMgmtTlv local;
    getSingle(parent);
    getSingle(local);
    const auto portDataSets = getFromPorts<tPtp4lPortDataSetMgmtTlv>(local.numberPorts());
    const auto portDataSetsNp = getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(local.numberPorts());
    const auto portProperties = getPortProperties(local.numberPorts());
    zeerr::LocalStatus status;
    metaData.takeGrandmaster(parent.data());
    metaData.takeLocalClock(local.data());
    metaData.takePorts(portDataSets, portDataSetsNp, portProperties, status);
    zeerr::throwIfError(status);
}

void tGetDataFromPtp4l::getSingle(tPtpMgmtTlv& answer) {
    zeerr::LocalStatus status;
    node_.getSingle(interface_, remoteAddress_, answer, status);
    zeerr::throwIfError(status);
}

template <typename Tlv>
std::vector<typename Tlv::Data> tGetDataFromPtp4l::getFromPorts(std::uint16_t numberPorts) {
    zeerr::LocalStatus status;
    std::vector<typename Tlv::Data> answers;
    node_.getFromPorts<Tlv>(interface_, remoteAddress_, numberPorts, answers, status);
    zeerr::throwIfError(status);
    return answers;
}

// [oddity pad-octet] Older daemons answer a request whose messageLength leaves the pad octet out,
// newer ones drop it without a word. So the first time-out makes us count it for good, which both
// kinds answer.
std::vector<tPortProperties> tGetDataFromPtp4l::getPortProperties(std::uint16_t numberPorts) {
    zeerr::LocalStatus status;
    std::vector<tPortProperties> answers;
    node_.getFromPorts<tPtp4lPortPropertiesMgmtTlv>(interface_, remoteAddress_, numberPorts,
                                                    answers, status, padOctet_);
    if (status.code == zeerr::code::operationTimedOut && answers.empty()) {
        padOctet_ = tPadOctet::counted;
    }
    zeerr::throwIfError(status);
    return answers;
}

} // namespace zekelVantel
