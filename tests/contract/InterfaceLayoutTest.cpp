// What passes between host and plug-in has the same size and octets with 32-bit and with 64-bit
// pointers, but for the pointers themselves. The functions and the status are in AbiTest.

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <limits>

#include <gmock/gmock.h>

#include <vantel_bc/quality.h>
#include <vantel_bc/zekeltr.h>

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

TEST(InterfaceLayoutTest, NothingButPointersAndTheSizesOfMemoryIsNarrowOn32Bits) {
    struct Row {
        const char* type;
        std::size_t size;
        std::size_t alignment;
        std::size_t wide;
        std::size_t narrow;
    };
    for (const auto& row : {
             Row{"code", sizeof(std::int32_t), alignof(std::int32_t), 4, 4},
             Row{"capacity", sizeof(std::uint32_t), alignof(std::uint32_t), 4, 4},
             Row{"version", sizeof(zekeltr_getAPIVersion()), alignof(std::uint32_t), 4, 4},
             Row{"time", sizeof(std::uint64_t), alignof(std::uint64_t), 8, 8},
             Row{"quality value", sizeof(double), alignof(double), 8, 8},
             Row{"success of resize", sizeof(bool), alignof(bool), 1, 1},
             Row{"name character", sizeof(char), alignof(char), 1, 1},
             Row{"slot", sizeof(void**), alignof(void**), 8, 4},
             Row{"text", sizeof(char*), alignof(char*), 8, 4},
             Row{"resize", sizeof(zeerr_Resize), alignof(zeerr_Resize), 8, 4},
             Row{"reallocate", sizeof(zekeltr_Reallocate), alignof(zekeltr_Reallocate), 8, 4},
             Row{"size for reallocate", sizeof(std::size_t), alignof(std::size_t), 8, 4},
         }) {
        const std::size_t expected = sizeof(void*) == 4 ? row.narrow : row.wide;
        EXPECT_EQ(row.size, expected) << row.type;
        EXPECT_EQ(row.alignment, expected) << row.type;
    }
    EXPECT_EQ(ZEKELTR_NAME_SIZE, 18);
}

} // namespace
