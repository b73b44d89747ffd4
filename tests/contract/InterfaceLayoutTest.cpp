// What passes between host and plug-in has the same size and octets with 32-bit and with 64-bit
// pointers. The functions and the status, with the types of their members, are in AbiTest.

#include <array>
#include <cstdint>
#include <cstring>
#include <limits>

#include <gmock/gmock.h>

#include <vantel_bc/quality.h>

namespace {

using testing::ElementsAreArray;

using Quality = std::array<double, ZEKEL_QUALITY_LENGTH>;
using Octets = std::array<std::uint8_t, sizeof(Quality)>;

Octets octetsOf(const Quality& quality) {
    Octets octets;
    std::memcpy(octets.data(), quality.data(), sizeof(quality));
    return octets;
}

TEST(InterfaceLayoutTest, QualityIsThreeIeee754DoublesOf64Bits) {
    static_assert(std::numeric_limits<double>::is_iec559);
    EXPECT_THAT(octetsOf(ZEKEL_QUALITY_USABLE),
                ElementsAreArray({0x48, 0xAF, 0xBC, 0x9A, 0xF2, 0xD7, 0x5A, 0x3E, //
                                  0x8D, 0xED, 0xB5, 0xA0, 0xF7, 0xC6, 0xB0, 0x3E, //
                                  0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0xF0, 0xBF}));
    EXPECT_THAT(octetsOf(ZEKEL_QUALITY_UNUSABLE),
                ElementsAreArray({0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0xC0, //
                                  0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0xC0, //
                                  0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0xF0, 0xBF}));
}

} // namespace
