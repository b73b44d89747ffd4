/// @file
/// Every error that the plug-in raises, as data: code, constant, and the source unit and line that
/// the host reads in the error text. The lines are part of the interface; they do not follow the
/// code when it moves.
#pragma once

#include <cstdint>

namespace zeerr {

struct ErrorSite {
    std::int32_t code;
    const char* constant; ///< "error_constant"
    const char* file;     ///< "file"
    int line;             ///< "line"
};

/// "component" of every error.
inline constexpr char component[] = "vantel_bc";

namespace code {
inline constexpr std::int32_t memoryFull = -52000;
inline constexpr std::int32_t softwareFault = -52003;
inline constexpr std::int32_t typeMismatch = -52004;
inline constexpr std::int32_t invalidParameter = -52005;
inline constexpr std::int32_t resourceNotFound = -52006;
inline constexpr std::int32_t operationTimedOut = -52007;
inline constexpr std::int32_t osFault = -52008;
inline constexpr std::int32_t resourceNotInitialized = -52010;
inline constexpr std::int32_t endOfData = -52012;
inline constexpr std::int32_t bufferTooSmall = -52019;
inline constexpr std::int32_t communicationsFault = -52024;
inline constexpr std::int32_t resourceBusy = -52031;
} // namespace code

namespace site {

// Conversion of foreign exceptions.
inline constexpr ErrorSite badAlloc{code::memoryFull, "zeoskerr_memoryFull", "exception_errStatus",
                                    62};
inline constexpr ErrorSite standardException{
    code::softwareFault, "zeoskerr_softwareFaultOSKInternalUseOnly", "exception_errStatus", 69};
inline constexpr ErrorSite unknownException{
    code::softwareFault, "zeoskerr_softwareFaultOSKInternalUseOnly", "exception_errStatus", 74};

// JSON access.
// [oddity shared-codes] Several names share one number: hosts act on the number, people read the
// name.
inline constexpr ErrorSite jsonTypeMismatch{code::typeMismatch, "jsonErrorsTypeMismatch",
                                            "cJSONUtils", 305};
inline constexpr ErrorSite jsonNotAnArray{code::typeMismatch, "jsonErrorsNotAnArray", "cJSONUtils",
                                          83};
inline constexpr ErrorSite jsonInvalid{code::invalidParameter, "jsonErrorsInvalidJSON", "CppJson",
                                       34};
inline constexpr ErrorSite jsonOutOfBounds{code::resourceNotFound, "jsonErrorsArrayItemOutOfBounds",
                                           "ArrayIterator", 102};

// Protocol configuration.
// [oddity err-code] The constant is the literal word "errCode": hosts tell the enriched error from
// the plain one by it.
inline constexpr ErrorSite parameterTypeMismatch{code::typeMismatch, "errCode",
                                                 "jsonHelperFunctions", 50};
inline constexpr ErrorSite keyNotFound{code::invalidParameter, "zeoskerr_invalidParameter",
                                       "tPtp4lTimeRef", 337};
inline constexpr ErrorSite placeholderNotFound{code::invalidParameter, "zeoskerr_invalidParameter",
                                               "tPtp4lTimeRef", 345};
inline constexpr ErrorSite configFileNotFound{code::invalidParameter, "zeoskerr_invalidParameter",
                                              "tPtp4lTimeRef", 387};
inline constexpr ErrorSite interfaceNotFound{code::invalidParameter, "zeoskerr_invalidParameter",
                                             "tPtp4lTimeRef", 394};

// Datagram buffer.
inline constexpr ErrorSite bufferTooSmall{code::bufferTooSmall, "zeoskerr_bufferTooSmall",
                                          "tMsgBuffer", 60};
inline constexpr ErrorSite bufferReadPastEnd{code::endOfData, "zeoskerr_endOfData", "tMsgBuffer",
                                             73};
inline constexpr ErrorSite bufferWritePastEnd{code::endOfData, "zeoskerr_endOfData", "tMsgBuffer",
                                              102};

// Unix-domain transport.
inline constexpr ErrorSite socketAlreadyOpen{code::resourceBusy, "zeoskerr_resourceBusy",
                                             "tUdsMsgInterface", 40};
// [oddity socket-is-memory] Memory-full and not an OS fault: hosts react to this pairing.
inline constexpr ErrorSite socketFailed{code::memoryFull, "zeoskerr_memoryFull", "tUdsMsgInterface",
                                        48};
// [oddity bind-is-not-found] Resource-not-found and not an OS fault: hosts react to this pairing.
inline constexpr ErrorSite bindFailed{code::resourceNotFound, "zeoskerr_resourceNotFound",
                                      "tUdsMsgInterface", 65};
inline constexpr ErrorSite sendWhileClosed{
    code::resourceNotInitialized, "zeoskerr_resourceNotInitialized", "tUdsMsgInterface", 96};
inline constexpr ErrorSite sendFailed{code::communicationsFault, "zeoskerr_communicationsFault",
                                      "tUdsMsgInterface", 109};
inline constexpr ErrorSite receiveWhileClosed{
    code::resourceNotInitialized, "zeoskerr_resourceNotInitialized", "tUdsMsgInterface", 138};
inline constexpr ErrorSite receiveTimedOut{code::operationTimedOut, "zeoskerr_operationTimedOut",
                                           "tUdsMsgInterface", 160};
inline constexpr ErrorSite receiveFailed{code::communicationsFault, "zeoskerr_communicationsFault",
                                         "tUdsMsgInterface", 176};

// Management node.
inline constexpr ErrorSite answerOfOtherLength{code::endOfData, "zeoskerr_endOfData",
                                               "tPtpMgmtNode", 71};
inline constexpr ErrorSite answerTooShort{code::endOfData, "zeoskerr_endOfData", "tPtpMgmtNode",
                                          120};

// Exported functions.
inline constexpr ErrorSite configurationIsNull{code::invalidParameter, "zeoskerr_invalidParameter",
                                               "tPtp4lTimeRef", 56};
inline constexpr ErrorSite schemaNotAllocated{code::memoryFull, "zeoskerr_memoryFull",
                                              "tPtp4lTimeRef", 92};

// ptp4l's process.
inline constexpr ErrorSite forkFailed{code::osFault, "zeoskerr_osFault", "tPtp4lTimeRef", 70};

// Metadata.
inline constexpr ErrorSite portListsDiffer{code::communicationsFault,
                                           "zeoskerr_communicationsFault", "tPtp4lMetaData", 99};

// Shared FIFO.
inline constexpr ErrorSite fifoCreationFailed{code::osFault, "zeoskerr_osFault", "tSharedFifo", 35};
inline constexpr ErrorSite fifoEmpty{code::endOfData, "zeoskerr_endOfData", "tSharedFifo", 82};
inline constexpr ErrorSite fifoReadFailed{code::osFault, "zeoskerr_osFault", "tSharedFifo", 86};
inline constexpr ErrorSite fifoWriteFailed{code::osFault, "zeoskerr_osFault", "tSharedFifo", 112};
inline constexpr ErrorSite fifoNotFound{code::resourceNotFound, "zeoskerr_resourceNotFound",
                                        "tSharedFifo", 139};
inline constexpr ErrorSite fifoOpenFailed{code::osFault, "zeoskerr_osFault", "tSharedFifo", 143};

} // namespace site
} // namespace zeerr
