#include "errors/ErrorSites.h"

#include <ostream>
#include <string>

#include <gtest/gtest.h>

#include "ResizeOperations.h"
#include "errors/Exception.h"

namespace {

struct SiteCase {
    const char* name;
    zeerr::ErrorSite site;
    std::int32_t code;
    const char* text;
};

void PrintTo(const SiteCase& row, std::ostream* out) {
    *out << row.name;
}

const SiteCase sites[] = {
    {"BadAlloc", zeerr::site::badAlloc, -52000,
     R"({"error_constant":"zeoskerr_memoryFull","file":"exception_errStatus","line":62,)"
     R"("component":"vantel_bc"})"},
    {"StandardException", zeerr::site::standardException, -52003,
     R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
     R"("file":"exception_errStatus","line":69,"component":"vantel_bc"})"},
    {"UnknownException", zeerr::site::unknownException, -52003,
     R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
     R"("file":"exception_errStatus","line":74,"component":"vantel_bc"})"},
    {"JsonTypeMismatch", zeerr::site::jsonTypeMismatch, -52004,
     R"({"error_constant":"jsonErrorsTypeMismatch","file":"cJSONUtils","line":305,)"
     R"("component":"vantel_bc"})"},
    {"JsonNotAnArray", zeerr::site::jsonNotAnArray, -52004,
     R"({"error_constant":"jsonErrorsNotAnArray","file":"cJSONUtils","line":83,)"
     R"("component":"vantel_bc"})"},
    {"JsonInvalid", zeerr::site::jsonInvalid, -52005,
     R"({"error_constant":"jsonErrorsInvalidJSON","file":"CppJson","line":34,)"
     R"("component":"vantel_bc"})"},
    {"JsonOutOfBounds", zeerr::site::jsonOutOfBounds, -52006,
     R"({"error_constant":"jsonErrorsArrayItemOutOfBounds","file":"ArrayIterator","line":102,)"
     R"("component":"vantel_bc"})"},
    {"ParameterTypeMismatch", zeerr::site::parameterTypeMismatch, -52004,
     R"({"error_constant":"errCode","file":"jsonHelperFunctions","line":50,)"
     R"("component":"vantel_bc"})"},
    {"KeyNotFound", zeerr::site::keyNotFound, -52005,
     R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef","line":337,)"
     R"("component":"vantel_bc"})"},
    {"PlaceholderNotFound", zeerr::site::placeholderNotFound, -52005,
     R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef","line":345,)"
     R"("component":"vantel_bc"})"},
    {"ConfigFileNotFound", zeerr::site::configFileNotFound, -52005,
     R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef","line":387,)"
     R"("component":"vantel_bc"})"},
    {"InterfaceNotFound", zeerr::site::interfaceNotFound, -52005,
     R"({"error_constant":"zeoskerr_invalidParameter","file":"tPtp4lTimeRef","line":394,)"
     R"("component":"vantel_bc"})"},
};

std::string withMember(const SiteCase& row, const std::string& member) {
    std::string text = row.text;
    return text.replace(text.size() - 1, 1, "," + member + "}");
}

class ErrorSitesTest : public testing::TestWithParam<SiteCase> {};

TEST_P(ErrorSitesTest, RecordsCodeAndMembersInOrder) {
    zeerr::LocalStatus status;
    zeerr::setError(status, GetParam().site);
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_STREQ(status.json, GetParam().text);
}

TEST_P(ErrorSitesTest, AdditionalInfoComesLast) {
    zeerr::LocalStatus status;
    zeerr::setErrorWithInfo(status, GetParam().site, "path: %s, errno: %d (%s)", "/a\"b", 2,
                            "No such file or directory");
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_EQ(status.json, withMember(GetParam(), "\"additionalInfo\":\"path: /a\\\"b, errno: 2 "
                                                  "(No such file or directory)\""));
}

TEST_P(ErrorSitesTest, ThrowsAnExceptionWithTheSameText) {
    try {
        zeerr::throwError(GetParam().site);
        FAIL() << "nothing thrown";
    } catch (zeerr::Exception& exception) {
        EXPECT_EQ(exception.status().code, GetParam().code);
        EXPECT_STREQ(exception.what(), GetParam().text);
    }
}

INSTANTIATE_TEST_SUITE_P(Sites, ErrorSitesTest, testing::ValuesIn(sites));

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
