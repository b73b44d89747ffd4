#include <cstdlib>
#include <cstring>
#include <stdexcept>

#include <gmock/gmock.h>

#include "PluginFixture.h"

namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

std::vector<std::pair<char*, std::size_t>> requests;

char* countingReallocate(char* buffer, std::size_t size) {
    requests.emplace_back(buffer, size);
    return static_cast<char*>(std::realloc(buffer, size));
}

constexpr char behindTheText = '\xa5';

/// Gives one octet more than it is asked for.
char* generousReallocate(char* buffer, std::size_t size) {
    char* const text = countingReallocate(buffer, size + 1);
    text[size] = behindTheText;
    return text;
}

char* refusingReallocate(char* buffer, std::size_t size) {
    requests.emplace_back(buffer, size);
    std::free(buffer);
    return nullptr;
}

char* throwingReallocate(char*, std::size_t) {
    throw std::runtime_error("no");
}

class ParameterDataTest : public PluginFixture {
protected:
    ParameterDataTest() { requests.clear(); }
    ~ParameterDataTest() override { std::free(buffer); }

    void fetch(zeerr_Status& status, zekeltr_Reallocate reallocate = &countingReallocate) {
        EXPECT_NO_THROW(plugin().getParameterValidationData(reallocate, &buffer, &status));
    }

    char* buffer = nullptr;
};

TEST_F(ParameterDataTest, AsksOnceForExactlyTheTextAndItsZero) {
    HostStatus status;
    fetch(status);
    ASSERT_EQ(requests.size(), 1U);
    EXPECT_EQ(requests[0].first, nullptr);
    EXPECT_EQ(requests[0].second, 1882U);
    ASSERT_NE(buffer, nullptr);
    EXPECT_EQ(std::strlen(buffer), 1881U);
    EXPECT_THAT(buffer, StartsWith("{\n   \"neighborPropDelayThreshold\": {\n"
                                   "      \"dataType\": \"int\",\n"
                                   "      \"range\": [0, 4294967295],\n"));
    EXPECT_THAT(buffer, EndsWith("   \"ptpDstMac\": {\n"
                                 "      \"dataType\": \"string\",\n"
                                 "      \"default\": \"01:00:5e:00:01:81\",\n"
                                 "      \"hidden\": false\n   }\n}\n"));
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(status.json, nullptr);
}

TEST_F(ParameterDataTest, ExistingBufferIsHandedToTheReallocator) {
    char* const former = static_cast<char*>(std::malloc(1));
    buffer = former;
    HostStatus status;
    fetch(status);
    ASSERT_EQ(requests.size(), 1U);
    EXPECT_EQ(requests[0].first, former);
    EXPECT_EQ(std::strlen(buffer), 1881U);
}

TEST_F(ParameterDataTest, NothingIsWrittenBehindTheText) {
    HostStatus status;
    fetch(status, &generousReallocate);
    ASSERT_NE(buffer, nullptr);
    EXPECT_EQ(std::strlen(buffer), 1881U);
    EXPECT_EQ(buffer[1882], behindTheText);
}

TEST_F(ParameterDataTest, RefusalLeavesANullBufferAndMemoryFull) {
    buffer = static_cast<char*>(std::malloc(1));
    HostStatus status;
    fetch(status, &refusingReallocate);
    ASSERT_EQ(requests.size(), 1U);
    EXPECT_EQ(requests[0].second, 1882U);
    EXPECT_EQ(buffer, nullptr);
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(status.text(), R"({"error_constant":"zeoskerr_memoryFull","file":"tPtp4lTimeRef",)"
                             R"("line":92,"component":"vantel_bc"})");
}

bool resizeToSixtyOctets(zeerr_Status* status, std::uint32_t size) {
    static char text[60];
    if (size > sizeof(text)) {
        return false;
    }
    status->json = text;
    status->capacity = sizeof(text);
    return true;
}

TEST_F(ParameterDataTest, RefusalLeavesTheMembersThatFit) {
    zeerr_Status status{0, 0, &resizeToSixtyOctets, nullptr};
    fetch(status, &refusingReallocate);
    EXPECT_EQ(buffer, nullptr);
    EXPECT_EQ(status.code, -52000);
    ASSERT_NE(status.json, nullptr);
    EXPECT_STREQ(status.json, R"({"error_constant":"zeoskerr_memoryFull"})");
}

TEST_F(ParameterDataTest, NegativeStatusOnEntryMeansNothingHappens) {
    HostStatus status(-1, R"({"mine":1})");
    fetch(status);
    EXPECT_TRUE(requests.empty());
    EXPECT_EQ(buffer, nullptr);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(status.text(), R"({"mine":1})");
}

TEST_F(ParameterDataTest, WarningOnEntryIsNoObstacle) {
    HostStatus status(3);
    fetch(status);
    ASSERT_NE(buffer, nullptr);
    EXPECT_EQ(status.code, 3);
}

TEST_F(ParameterDataTest, ExceptionOfTheReallocatorBecomesASoftwareFault) {
    HostStatus status;
    fetch(status, &throwingReallocate);
    EXPECT_EQ(status.code, -52003);
    EXPECT_THAT(status.text(), HasSubstr(R"("std_exception_what":"no"})"));
    EXPECT_EQ(buffer, nullptr);
}

} // namespace
