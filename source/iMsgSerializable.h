/// @file
#pragma once

#include "errors/Status.h"
#include "tMsgBuffer.h"

namespace zekelVantel {

/// Something that stands in a PTP message. Slot order is part of the interface.
class iMsgSerializable {
public:
    virtual ~iMsgSerializable() = default;

    /// Reads the fields from the buffer's read position. What a field keeps when the buffer ends
    /// too early is each class's own rule.
    virtual void deserialize(tMsgBuffer& buffer, zeerr::Status& status) = 0;

    /// Appends the fields to the buffer.
    virtual void serialize(tMsgBuffer& buffer, zeerr::Status& status) const = 0;

protected:
    iMsgSerializable() = default;
    iMsgSerializable(const iMsgSerializable&) = default;
    iMsgSerializable& operator=(const iMsgSerializable&) = default;
};

} // namespace zekelVantel
