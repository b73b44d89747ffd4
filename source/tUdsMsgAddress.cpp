#include "tUdsMsgAddress.h"

#include <cstring>

namespace zekelVantel {

tUdsMsgAddress::tUdsMsgAddress(const std::string& path) {
    // [oddity cut-path] Cut without a word, as ptp4l cuts its uds_address: both still meet.
    path.copy(address_.sun_path, sizeof(address_.sun_path) - 1);
}

sockaddr* tUdsMsgAddress::receiveAddress() {
    return reinterpret_cast<sockaddr*>(&address_);
}

const sockaddr* tUdsMsgAddress::sendAddress() const {
    return reinterpret_cast<const sockaddr*>(&address_);
}

socklen_t tUdsMsgAddress::length() const {
    return sizeof(address_);
}

// A path that was received may fill its field to the last octet.
std::string tUdsMsgAddress::path() const {
    return {address_.sun_path, strnlen(address_.sun_path, sizeof(address_.sun_path))};
}

} // namespace zekelVantel
