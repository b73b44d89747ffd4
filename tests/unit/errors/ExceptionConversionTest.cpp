#include <functional>
#include <new>
#include <ostream>
#include <stdexcept>
#include <string>

#include <boost/numeric/conversion/cast.hpp>
#include <gtest/gtest.h>

#include "ResizeOperations.h"
#include "errors/Exception.h"

namespace {

void convert(zeerr::Status& status, const std::function<void()>& raise) {
    try {
        raise();
    } catch (...) {
        zeerr::statusFromCurrentException(status);
    }
}

struct ConversionCase {
    const char* name;
    std::function<void()> raise;
    std::int32_t code;
    std::string text;
};

void PrintTo(const ConversionCase& row, std::ostream* out) {
    *out << row.name;
}

std::string standardException(const std::string& what) {
    return R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
           R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
           R"("std_exception_what":")" +
           what + "\"}";
}

constexpr char unknownException[] =
    R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
    R"("file":"exception_errStatus","line":74,"component":"vantel_bc"})";

class OwnText : public std::exception {
public:
    const char* what() const noexcept override { return "a \"b\"\n\x01"; }
};

class NoText : public std::exception {
public:
    const char* what() const noexcept override { return ""; }
};

const ConversionCase conversions[] = {
    {"BadAlloc", [] { throw std::bad_alloc(); }, -52000,
     R"({"error_constant":"zeoskerr_memoryFull","file":"exception_errStatus","line":62,)"
     R"("component":"vantel_bc","std_exception_what":"std::bad_alloc"})"},
    {"RuntimeError", [] { throw std::runtime_error("x"); }, -52003, standardException("x")},
    {"EmptyWhat", [] { throw NoText(); }, -52003, standardException("")},
    {"EscapedWhat", [] { throw OwnText(); }, -52003, standardException(R"(a \"b\"\n\u0001)")},
    {"InvalidArgument", [] { static_cast<void>(std::stoi("z", nullptr, 16)); }, -52003,
     standardException("stoi")},
    {"BadNumericCast", [] { throw boost::numeric::bad_numeric_cast(); }, -52003,
     standardException("bad numeric conversion: overflow")},
    {"NegativeOverflow", [] { throw boost::numeric::negative_overflow(); }, -52003,
     standardException("bad numeric conversion: negative overflow")},
    {"PositiveOverflow", [] { throw boost::numeric::positive_overflow(); }, -52003,
     standardException("bad numeric conversion: positive overflow")},
    {"Int", [] { throw 42; }, -52003, unknownException},
    {"Pointer", [] { throw "text"; }, -52003, unknownException},
    {"OwnException", [] { zeerr::throwError(zeerr::site::jsonInvalid); }, -52005,
     R"({"error_constant":"jsonErrorsInvalidJSON","file":"CppJson","line":34,)"
     R"("component":"vantel_bc"})"},
};

class ExceptionConversionTest : public testing::TestWithParam<ConversionCase> {};

TEST_P(ExceptionConversionTest, GivesCodeAndText) {
    zeerr::LocalStatus status;
    convert(status, GetParam().raise);
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_EQ(status.json, GetParam().text);
}

TEST_P(ExceptionConversionTest, GivesTheSameTextThroughAHostsOperation) {
    HostStatus status(&countingResize);
    convert(status, GetParam().raise);
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_EQ(status.json, GetParam().text);
}

TEST_P(ExceptionConversionTest, NeverOverwritesAnEarlierError) {
    HostStatus status(&countingResize, R"({"first":1})", 12);
    status.code = -52008;
    convert(status, GetParam().raise);
    EXPECT_EQ(status.code, -52008);
    EXPECT_STREQ(status.json, R"({"first":1})");
    EXPECT_TRUE(requestedSizes.empty());
}

TEST_P(ExceptionConversionTest, ReplacesAWarning) {
    HostStatus status(&countingResize, R"({"warning":1})", 14);
    status.code = 7;
    convert(status, GetParam().raise);
    EXPECT_EQ(status.code, GetParam().code);
    EXPECT_EQ(status.json, GetParam().text);
}

TEST_P(ExceptionConversionTest, KeepsTheCodeWhenThereIsNoMemoryForTheText) {
    for (const zeerr_Resize operation : {zeerr_Resize(nullptr), &refusingResize, &notGrowingResize,
                                         &forgettingResize, &throwingResize}) {
        HostStatus status(operation);
        EXPECT_NO_THROW(convert(status, GetParam().raise));
        EXPECT_EQ(status.code, GetParam().code);
        EXPECT_EQ(status.json, nullptr);
    }
}

TEST_P(ExceptionConversionTest, SurvivesAnOperationThatLosesTheText) {
    for (const zeerr_Resize operation : {&garbageResize, &zeroingResize}) {
        HostStatus status(operation);
        convert(status, GetParam().raise);
        EXPECT_EQ(status.code, GetParam().code);
        EXPECT_LT(zeerr::textLength(status), status.capacity);
    }
}

INSTANTIATE_TEST_SUITE_P(Exceptions, ExceptionConversionTest, testing::ValuesIn(conversions),
                         [](const auto& row) { return row.param.name; });

TEST(ExceptionConversionTest, MovesTheTextOfAnOwnException) {
    zeerr::LocalStatus status;
    const char* address = nullptr;
    try {
        zeerr::throwError(zeerr::site::jsonInvalid);
    } catch (zeerr::Exception& exception) {
        address = exception.what();
        zeerr::statusFromCurrentException(status);
        EXPECT_STREQ(exception.what(), "");
    }
    EXPECT_EQ(status.json, address);
}

TEST(ExceptionConversionTest, BaseOfAnOwnExceptionIsConvertedAsWell) {
    zeerr::LocalStatus status;
    convert(status, [] {
        zeerr::LocalStatus thrown;
        thrown.code = -52031;
        throw zeerr::ExceptionBase(thrown);
    });
    EXPECT_EQ(status.code, -52031);
    EXPECT_EQ(status.json, nullptr);
}

} // namespace
