#include "errors/ErrorText.h"

#include <array>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <string>

#include <cjson/cJSON.h>
#include <gtest/gtest.h>

#include "ResizeOperations.h"
#include "errors/Exception.h"

using zeerr::addInt;
using zeerr::addObject;
using zeerr::addString;
using zeerr::beginMembers;
using zeerr::leaveObject;
using zeerr::Resizer;

namespace {

const std::array<const char*, 32> controlCharacters{
    "\\u0000", "\\u0001", "\\u0002", "\\u0003", "\\u0004", "\\u0005", "\\u0006", "\\u0007",
    "\\b",     "\\t",     "\\n",     "\\u000b", "\\f",     "\\r",     "\\u000e", "\\u000f",
    "\\u0010", "\\u0011", "\\u0012", "\\u0013", "\\u0014", "\\u0015", "\\u0016", "\\u0017",
    "\\u0018", "\\u0019", "\\u001a", "\\u001b", "\\u001c", "\\u001d", "\\u001e", "\\u001f"};

std::string expectedEscape(unsigned octet) {
    if (octet < controlCharacters.size()) {
        return controlCharacters[octet];
    }
    switch (octet) {
    case 0x22:
        return "\\\"";
    case 0x5c:
        return "\\\\";
    case 0x7f:
        return "\\u007f";
    default:
        return {static_cast<char>(octet)};
    }
}

class ErrorTextTest : public testing::Test {
protected:
    zeerr::LocalStatus status;
    Resizer resizer{status};

    void startWith(const std::string& text) {
        ASSERT_TRUE(zeerr::resize(status, static_cast<std::uint32_t>(text.size() + 1)));
        std::strcpy(status.json, text.c_str());
    }
};

/// cJSON finds no memory while this object lives.
class CjsonWithoutMemory {
public:
    CjsonWithoutMemory() {
        requests = 0;
        cJSON_Hooks hooks{[](std::size_t) -> void* {
                              ++requests;
                              return nullptr;
                          },
                          &std::free};
        cJSON_InitHooks(&hooks);
    }
    ~CjsonWithoutMemory() { cJSON_InitHooks(nullptr); }
    CjsonWithoutMemory(const CjsonWithoutMemory&) = delete;
    CjsonWithoutMemory& operator=(const CjsonWithoutMemory&) = delete;

    static inline int requests = 0;
};

char pool[1024];

/// Serves from a fixed pool, half of it at first.
bool poolResize(zeerr::Status* status, std::uint32_t size) {
    requestedSizes.push_back(size);
    if (size > sizeof(pool)) {
        return false;
    }
    if (size != 0 && status->json == nullptr) {
        std::strcpy(pool, "{}");
    }
    status->json = size == 0 ? nullptr : pool;
    status->capacity = size == 0 ? 0U : size <= 512 ? 512U : 1024U;
    return true;
}

TEST(EscapeTest, EveryOctetByItself) {
    for (unsigned octet = 0; octet < 256; ++octet) {
        const char character = static_cast<char>(octet);
        EXPECT_EQ(zeerr::escaped({&character, 1}), expectedEscape(octet)) << octet;
    }
}

TEST(EscapeTest, AllOctetsInOneText) {
    std::string text;
    std::string expected;
    for (unsigned octet = 0; octet < 256; ++octet) {
        text += static_cast<char>(octet);
        expected += expectedEscape(octet);
    }
    EXPECT_EQ(zeerr::escaped(text), expected);
    EXPECT_EQ(zeerr::escaped(""), "");
}

TEST_F(ErrorTextTest, FreshStatusHoldsAnEmptyObject) {
    char* const position = beginMembers(status);
    ASSERT_NE(position, nullptr);
    EXPECT_STREQ(status.json, "{}");
    EXPECT_EQ(position, status.json + 1);
}

TEST_F(ErrorTextTest, MembersAreSeparatedByCommas) {
    char* position = beginMembers(status);
    position = addString(position, "a", "x", resizer);
    position = addInt(position, "b", 2, resizer);
    position = addString(position, "c", "", resizer);
    ASSERT_NE(position, nullptr);
    EXPECT_STREQ(status.json, R"({"a":"x","b":2,"c":""})");
    EXPECT_STREQ(position, "}");
}

TEST_F(ErrorTextTest, KeysAndValuesAreEscaped) {
    addString(beginMembers(status), "k\"\x01", "v\\\n\x7f\xc3\xa4/", resizer);
    EXPECT_STREQ(status.json, "{\"k\\\"\\u0001\":\"v\\\\\\n\\u007f\xc3\xa4/\"}");
}

TEST_F(ErrorTextTest, IntegersArePlainDecimals) {
    char* position = beginMembers(status);
    position = addInt(position, "a", INT_MIN, resizer);
    position = addInt(position, "b", INT_MAX, resizer);
    position = addInt(position, "c", 0, resizer);
    EXPECT_STREQ(status.json, R"({"a":-2147483648,"b":2147483647,"c":0})");
}

TEST_F(ErrorTextTest, ObjectsNestAndMembersGoOnBehindThem) {
    char* position = beginMembers(status);
    position = addObject(position, "a", resizer);
    position = addInt(position, "b", 1, resizer);
    position = addObject(position, "c", resizer);
    position = leaveObject(position);
    position = addInt(position, "d", 2, resizer);
    position = leaveObject(position);
    position = addString(position, "e", "f", resizer);
    ASSERT_NE(position, nullptr);
    EXPECT_STREQ(status.json, R"({"a":{"b":1,"c":{},"d":2},"e":"f"})");
    EXPECT_STREQ(position, "}");
}

TEST_F(ErrorTextTest, SourceLocationIsFileLineComponent) {
    zeerr::addSourceLocation(beginMembers(status), "tSharedFifo", 139, "vantel_bc", resizer);
    EXPECT_STREQ(status.json, R"({"file":"tSharedFifo","line":139,"component":"vantel_bc"})");
}

TEST_F(ErrorTextTest, SourceLocationWithoutComponentLeavesItOut) {
    zeerr::addSourceLocation(beginMembers(status), "tSharedFifo", 139, nullptr, resizer);
    EXPECT_STREQ(status.json, R"({"file":"tSharedFifo","line":139})");
}

TEST_F(ErrorTextTest, NullPositionIsPassedOn) {
    ASSERT_NE(beginMembers(status), nullptr);
    EXPECT_EQ(addString(nullptr, "a", "b", resizer), nullptr);
    EXPECT_EQ(addInt(nullptr, "a", 1, resizer), nullptr);
    EXPECT_EQ(addObject(nullptr, "a", resizer), nullptr);
    EXPECT_EQ(leaveObject(nullptr), nullptr);
    EXPECT_EQ(zeerr::addSourceLocation(nullptr, "f", 1, "c", resizer), nullptr);
    EXPECT_STREQ(status.json, "{}");
}

TEST_F(ErrorTextTest, MembersGoBehindThoseThatAreThere) {
    startWith(R"({"a":1})");
    addInt(beginMembers(status), "b", 2, resizer);
    EXPECT_STREQ(status.json, R"({"a":1,"b":2})");
}

TEST_F(ErrorTextTest, BlanksBehindTheObjectStay) {
    startWith("{\"a\":1}  \t\r\n");
    addInt(beginMembers(status), "b", 2, resizer);
    EXPECT_STREQ(status.json, "{\"a\":1,\"b\":2}  \t\r\n");
}

TEST_F(ErrorTextTest, TextBehindTheObjectStays) {
    startWith("{} and more }");
    addInt(beginMembers(status), "b", 2, resizer);
    EXPECT_STREQ(status.json, "{\"b\":2} and more }");
}

TEST_F(ErrorTextTest, BlanksInAnEmptyObjectNeedNoComma) {
    startWith(" { \t\r\n }");
    addInt(beginMembers(status), "b", 2, resizer);
    EXPECT_STREQ(status.json, " { \t\r\n \"b\":2}");
}

TEST_F(ErrorTextTest, EveryBlankThatScansInAnEmptyObjectNeedsNoComma) {
    for (char blank = '\x01'; blank <= ' '; ++blank) {
        startWith(std::string("{") + blank + "}");
        if (char* const position = beginMembers(status)) {
            addInt(position, "b", 2, resizer);
            EXPECT_EQ(status.json, std::string("{") + blank + "\"b\":2}") << int{blank};
        }
    }
}

TEST_F(ErrorTextTest, BracesInStringsDoNotCount) {
    startWith(R"({"a":"}]\"{"})");
    addInt(beginMembers(status), "b", 2, resizer);
    EXPECT_STREQ(status.json, R"({"a":"}]\"{","b":2})");
}

TEST_F(ErrorTextTest, ArraysAreContinuedBeforeTheirBracket) {
    startWith("[1] ");
    char* const position = beginMembers(status);
    ASSERT_NE(position, nullptr);
    EXPECT_STREQ(position, "] ");
    addInt(position, "b", 2, resizer);
    EXPECT_STREQ(status.json, "[1,\"b\":2] ");
}

TEST_F(ErrorTextTest, EmptyArraysNeedNoComma) {
    startWith("[]");
    addInt(beginMembers(status), "b", 2, resizer);
    EXPECT_STREQ(status.json, "[\"b\":2]");
}

TEST_F(ErrorTextTest, TextsThatAreNoObjectOrDoNotScanGiveNoPosition) {
    for (const char* const text : {"{", "}", "[", "]", "[1", "null", "true", "12", "\"{}\"", "x{}",
                                   "{\"a\":}", "{\"a\"}", "{]", " ", "{\"a\":1,}"}) {
        startWith(text);
        EXPECT_EQ(beginMembers(status), nullptr) << text;
        EXPECT_STREQ(status.json, text);
    }
}

TEST_F(ErrorTextTest, DescribingAnErrorNeedsNothingOfCjson) {
    const CjsonWithoutMemory shortage;
    zeerr::setErrorWithInfo(status, zeerr::site::fifoNotFound, "errno: %d", 2);
    EXPECT_EQ(CjsonWithoutMemory::requests, 0);
    EXPECT_STREQ(status.json,
                 R"({"error_constant":"zeoskerr_resourceNotFound","file":"tSharedFifo",)"
                 R"("line":139,"component":"vantel_bc","additionalInfo":"errno: 2"})");
    EXPECT_EQ(cJSON_Parse("{}"), nullptr);
    EXPECT_GT(CjsonWithoutMemory::requests, 0);
}

TEST(ErrorTextPoolTest, TextIsFilledFromAFixedPool) {
    requestedSizes.clear();
    zeerr::Status status{0, 0, &poolResize, nullptr};
    {
        const CjsonWithoutMemory shortage;
        zeerr::setError(status, zeerr::site::forkFailed, "pool");
        EXPECT_EQ(CjsonWithoutMemory::requests, 0);
    }
    EXPECT_EQ(status.code, -52008);
    EXPECT_EQ(status.json, pool);
    EXPECT_STREQ(pool, R"({"error_constant":"zeoskerr_osFault","file":"tPtp4lTimeRef","line":70,)"
                       R"("component":"vantel_bc","additionalInfo":"pool"})");
    zeerr::release(status);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(requestedSizes.back(), 0U);
}

TEST(ErrorTextPoolTest, PoolGrowsOnceAndThenTheTextStaysWithoutTheMember) {
    requestedSizes.clear();
    zeerr::Status status{0, 0, &poolResize, nullptr};
    const CjsonWithoutMemory shortage;
    Resizer resizer(status);
    const std::string half(600, 'x');
    char* position = beginMembers(status);
    position = addString(position, "a", half, resizer);
    ASSERT_NE(position, nullptr);
    EXPECT_EQ(status.json, "{\"a\":\"" + half + "\"}");
    EXPECT_EQ(addString(position, "b", half, resizer), nullptr);
    EXPECT_EQ(status.json, "{\"a\":\"" + half + "\"}");
    EXPECT_EQ(requestedSizes, (std::vector<std::uint32_t>{5, 1022, 2046}));
    zeerr::release(status);
}

TEST_F(ErrorTextTest, DeepNestingScansOrIsRefused) {
    for (const std::size_t depth : {500U, 100000U}) {
        startWith("{\"a\":" + std::string(depth, '[') + std::string(depth, ']') + "}");
        char* const position = beginMembers(status);
        EXPECT_EQ(position != nullptr, depth == 500U);
        if (position != nullptr) {
            EXPECT_STREQ(position, "}");
        }
    }
}

} // namespace
