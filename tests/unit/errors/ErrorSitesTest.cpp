#include "errors/ErrorSites.h"

#include <ostream>
#include <string>

#include <gtest/gtest.h>

#include "ResizeOperations.h"
#include "errors/Exception.h"
#include "support/ErrorText.h"

namespace {

namespace site = zeerr::site;

struct SiteCase {
    const char* name;
    zeerr::ErrorSite site;
    std::int32_t code;
    const char* constant;
    const char* file;
    int line;

    std::string text(const std::string& info = "") const {
        return errorText(constant, file, line, info);
    }
};

void PrintTo(const SiteCase& row, std::ostream* out) {
    *out << row.name;
}

const SiteCase sites[] = {
    {"BadAlloc", site::badAlloc, -52000, "zeoskerr_memoryFull", "exception_errStatus", 62},
    {"StandardException", site::standardException, -52003,
     "zeoskerr_softwareFaultOSKInternalUseOnly", "exception_errStatus", 69},
    {"UnknownException", site::unknownException, -52003, "zeoskerr_softwareFaultOSKInternalUseOnly",
     "exception_errStatus", 74},
    {"JsonTypeMismatch", site::jsonTypeMismatch, -52004, "jsonErrorsTypeMismatch", "cJSONUtils",
     305},
    {"JsonNotAnArray", site::jsonNotAnArray, -52004, "jsonErrorsNotAnArray", "cJSONUtils", 83},
    {"JsonInvalid", site::jsonInvalid, -52005, "jsonErrorsInvalidJSON", "CppJson", 34},
    {"JsonOutOfBounds", site::jsonOutOfBounds, -52006, "jsonErrorsArrayItemOutOfBounds",
     "ArrayIterator", 102},
    {"ParameterTypeMismatch", site::parameterTypeMismatch, -52004, "errCode", "jsonHelperFunctions",
     50},
    {"KeyNotFound", site::keyNotFound, -52005, "zeoskerr_invalidParameter", "tPtp4lTimeRef", 337},
    {"PlaceholderNotFound", site::placeholderNotFound, -52005, "zeoskerr_invalidParameter",
     "tPtp4lTimeRef", 345},
    {"ConfigFileNotFound", site::configFileNotFound, -52005, "zeoskerr_invalidParameter",
     "tPtp4lTimeRef", 387},
    {"InterfaceNotFound", site::interfaceNotFound, -52005, "zeoskerr_invalidParameter",
     "tPtp4lTimeRef", 394},
    {"BufferTooSmall", site::bufferTooSmall, -52019, "zeoskerr_bufferTooSmall", "tMsgBuffer", 60},
    {"BufferReadPastEnd", site::bufferReadPastEnd, -52012, "zeoskerr_endOfData", "tMsgBuffer", 73},
    {"BufferWritePastEnd", site::bufferWritePastEnd, -52012, "zeoskerr_endOfData", "tMsgBuffer",
     102},
    {"SocketAlreadyOpen", site::socketAlreadyOpen, -52031, "zeoskerr_resourceBusy",
     "tUdsMsgInterface", 40},
    {"SocketFailed", site::socketFailed, -52000, "zeoskerr_memoryFull", "tUdsMsgInterface", 48},
    {"BindFailed", site::bindFailed, -52006, "zeoskerr_resourceNotFound", "tUdsMsgInterface", 65},
    {"SendWhileClosed", site::sendWhileClosed, -52010, "zeoskerr_resourceNotInitialized",
     "tUdsMsgInterface", 96},
    {"SendFailed", site::sendFailed, -52024, "zeoskerr_communicationsFault", "tUdsMsgInterface",
     109},
    {"ReceiveWhileClosed", site::receiveWhileClosed, -52010, "zeoskerr_resourceNotInitialized",
     "tUdsMsgInterface", 138},
    {"ReceiveTimedOut", site::receiveTimedOut, -52007, "zeoskerr_operationTimedOut",
     "tUdsMsgInterface", 160},
    {"ReceiveFailed", site::receiveFailed, -52024, "zeoskerr_communicationsFault",
     "tUdsMsgInterface", 176},
    {"AnswerOfOtherLength", site::answerOfOtherLength, -52012, "zeoskerr_endOfData", "tPtpMgmtNode",
     71},
    {"AnswerTooShort", site::answerTooShort, -52012, "zeoskerr_endOfData", "tPtpMgmtNode", 120},
    {"ConfigurationIsNull", site::configurationIsNull, -52005, "zeoskerr_invalidParameter",
     "tPtp4lTimeRef", 56},
    {"SchemaNotAllocated", site::schemaNotAllocated, -52000, "zeoskerr_memoryFull", "tPtp4lTimeRef",
     92},
    {"ForkFailed", site::forkFailed, -52008, "zeoskerr_osFault", "tPtp4lTimeRef", 70},
    {"PortListsDiffer", site::portListsDiffer, -52024, "zeoskerr_communicationsFault",
     "tPtp4lMetaData", 99},
    {"FifoCreationFailed", site::fifoCreationFailed, -52008, "zeoskerr_osFault", "tSharedFifo", 35},
    {"FifoEmpty", site::fifoEmpty, -52012, "zeoskerr_endOfData", "tSharedFifo", 82},
    {"FifoReadFailed", site::fifoReadFailed, -52008, "zeoskerr_osFault", "tSharedFifo", 86},
    {"FifoWriteFailed", site::fifoWriteFailed, -52008, "zeoskerr_osFault", "tSharedFifo", 112},
    {"FifoNotFound", site::fifoNotFound, -52006, "zeoskerr_resourceNotFound", "tSharedFifo", 139},
    {"FifoOpenFailed", site::fifoOpenFailed, -52008, "zeoskerr_osFault", "tSharedFifo", 143},
};

class ErrorSitesTest : public testing::TestWithParam<SiteCase> {};

TEST_P(ErrorSitesTest, HasCodeConstantFileAndLine) {
    EXPECT_EQ(GetParam().site.code, GetParam().code);
    EXPECT_STREQ(GetParam().site.constant, GetParam().constant);
    EXPECT_STREQ(GetParam().site.file, GetParam().file);
    EXPECT_EQ(GetParam().site.line, GetParam().line);
}

TEST_P(ErrorSitesTest, RecordsCodeAndMembersInOrder) {
    zeerr::LocalStatus status;
    zeerr::setError(status, GetParam().site);
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_EQ(textOf(status), GetParam().text());
}

TEST_P(ErrorSitesTest, AdditionalInfoComesLast) {
    zeerr::LocalStatus status;
    zeerr::setErrorWithInfo(status, GetParam().site, "path: %s, errno: %d (%s)", "/a\"b", 2,
                            "No such file or directory");
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_EQ(textOf(status),
              GetParam().text(R"(path: /a\"b, errno: 2 (No such file or directory))"));
}

TEST_P(ErrorSitesTest, ThrowsAnExceptionWithTheSameText) {
    try {
        zeerr::throwError(GetParam().site);
        FAIL() << "nothing thrown";
    } catch (zeerr::Exception& exception) {
        EXPECT_EQ(exception.status().code, GetParam().code);
        EXPECT_EQ(exception.what(), GetParam().text());
    }
}

std::string nameOf(const testing::TestParamInfo<SiteCase>& row) {
    return row.param.name;
}

INSTANTIATE_TEST_SUITE_P(Sites, ErrorSitesTest, testing::ValuesIn(sites), nameOf);

TEST(CodesTest, HaveTheirNumbers) {
    EXPECT_EQ(zeerr::code::memoryFull, -52000);
    EXPECT_EQ(zeerr::code::softwareFault, -52003);
    EXPECT_EQ(zeerr::code::typeMismatch, -52004);
    EXPECT_EQ(zeerr::code::invalidParameter, -52005);
    EXPECT_EQ(zeerr::code::resourceNotFound, -52006);
    EXPECT_EQ(zeerr::code::operationTimedOut, -52007);
    EXPECT_EQ(zeerr::code::osFault, -52008);
    EXPECT_EQ(zeerr::code::resourceNotInitialized, -52010);
    EXPECT_EQ(zeerr::code::endOfData, -52012);
    EXPECT_EQ(zeerr::code::bufferTooSmall, -52019);
    EXPECT_EQ(zeerr::code::communicationsFault, -52024);
    EXPECT_EQ(zeerr::code::resourceBusy, -52031);
    EXPECT_EQ(ZEKEL_HOST_IS_STOPPING, -52009);
}

TEST(SetErrorTest, EarlierErrorStaysAndNothingIsWritten) {
    zeerr::LocalStatus status;
    status.code = -52008;
    zeerr::setError(status, zeerr::site::keyNotFound, "info");
    EXPECT_EQ(status.code, -52008);
    EXPECT_EQ(status.json, nullptr);
}

TEST(SetErrorTest, WarningAndItsTextAreReplaced) {
    zeerr::LocalStatus status;
    status.code = 1;
    ASSERT_TRUE(zeerr::resize(status, 32));
    std::strcpy(status.json, R"({"warning":true})");
    zeerr::setError(status, zeerr::site::keyNotFound);
    EXPECT_EQ(status.code, -52005);
    EXPECT_STREQ(status.json,
                 R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef",)"
                 R"("line":337,"component":"vantel_bc"})");
}

TEST(SetErrorTest, CodeIsSetWithoutMemoryForTheText) {
    for (const zeerr_Resize operation : {zeerr_Resize(nullptr), &refusingResize, &notGrowingResize,
                                         &forgettingResize, &throwingResize}) {
        HostStatus status(operation);
        zeerr::setError(status, zeerr::site::keyNotFound, "info");
        EXPECT_EQ(status.code, -52005);
        EXPECT_EQ(status.json, nullptr);
    }
}

TEST(SetErrorTest, LongInfoIsCutAndTheTextStaysAnObject) {
    zeerr::LocalStatus status;
    const std::string info(5000, 'x');
    zeerr::setErrorWithInfo(status, zeerr::site::keyNotFound, "%s", info.c_str());
    const std::string text = status.json;
    EXPECT_NE(text.find(R"("component":"vantel_bc","additionalInfo":"xxxxxxxx)"),
              std::string::npos);
    EXPECT_EQ(text.substr(text.size() - 3), "x\"}");
}

TEST(ThrowIfErrorTest, ThrowsForErrorsOnly) {
    zeerr::LocalStatus status;
    EXPECT_NO_THROW(zeerr::throwIfError(status));
    status.code = 1;
    EXPECT_NO_THROW(zeerr::throwIfError(status));
    status.code = -1;
    EXPECT_THROW(zeerr::throwIfError(status), zeerr::Exception);
}

} // namespace
