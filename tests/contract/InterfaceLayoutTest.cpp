// What passes between host and plug-in has the same size and bits with 32-bit and with 64-bit
// pointers. The functions and the status, with the types of their members, are in AbiTest.

#include <array>
#include <cstdint>
#include <cstring>
#include <limits>

#include <gmock/gmock.h>

#include <vantel_bc/quality.h>

namespace {

using testing::ElementsAre;

using Quality = std::array<double, ZEKEL_QUALITY_LENGTH>;
using Bits = std::array<std::uint64_t, ZEKEL_QUALITY_LENGTH>;

Bits bitsOf(const Quality& quality) {
    static_assert(sizeof(Bits) == sizeof(Quality));
    Bits bits;
    std::memcpy(bits.data(), quality.data(), sizeof(quality));
    return bits;
}

TEST(InterfaceLayoutTest, QualityIsThreeIeee754DoublesOf64Bits) {
    static_assert(std::numeric_limits<double>::is_iec559);
    EXPECT_THAT(bitsOf(ZEKEL_QUALITY_USABLE),
                ElementsAre(0x3E5AD7F29ABCAF48, 0x3EB0C6F7A0B5ED8D, 0xBFF0000000000000));
    EXPECT_THAT(bitsOf(ZEKEL_QUALITY_UNUSABLE),
                ElementsAre(0xC000000000000000, 0xC000000000000000, 0xBFF0000000000000));
}

} // namespace
