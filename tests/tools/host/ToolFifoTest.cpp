// The FIFO of epoch offsets, as the plug-in sees it.

#include <algorithm>
#include <filesystem>

#include <sys/stat.h>

#include "Tool.h"

using testing::Contains;
using testing::HasSubstr;

namespace {

class ToolFifoTest : public ToolTest {
protected:
    Result playFifo(const Words& options) const {
        Words words{"--fifo", path, "--set", "fifo=" + path};
        words.insert(words.end(), options.begin(), options.end());
        return play("", words);
    }

    std::vector<std::string> offsetsRead() const {
        auto lines = record();
        lines.erase(std::remove_if(lines.begin(), lines.end(),
                                   [](const auto& line) { return line.compare(0, 4, "fifo"); }),
                    lines.end());
        return lines;
    }

    bool exists() const { return std::filesystem::exists(std::filesystem::symlink_status(path)); }

    std::string path = folder.path("epoch");
};

} // namespace

TEST_F(ToolFifoTest, TheFifoIsCreatedAndRemoved) {
    EXPECT_EQ(playFifo({"--create-fifo"}).status, 0);
    EXPECT_FALSE(exists());
}

TEST_F(ToolFifoTest, TheFirstOffsetIsThereWhenThePlugInStarts) {
    const auto result = playFifo({"--create-fifo", "--epoch-offset", "-2"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("epoch-offset").at(0)["offset"], -2);
#if __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__
    EXPECT_EQ(offsetsRead(), Words{"fifo 254 255 255 255 255 255 255 255"});
#else
    EXPECT_EQ(offsetsRead(), Words{"fifo 255 255 255 255 255 255 255 254"});
#endif
}

TEST_F(ToolFifoTest, LaterOffsetsAreWrittenInOrderUntilTheEnd) {
    const auto result =
        playFifo({"--create-fifo", "--epoch-offset", "0", "--epoch-offset-at", "0.2:-1",
                  "--epoch-offset-at", "0.1:0", "--epoch-offset-at", "50:9", "--seconds", "0.3"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(offsetsRead(), (Words{"fifo 0 0 0 0 0 0 0 0", "fifo 0 0 0 0 0 0 0 0",
                                    "fifo 255 255 255 255 255 255 255 255"}));
    const auto events = result.events("epoch-offset");
    ASSERT_EQ(events.size(), 3U);
    EXPECT_GE(events[2]["t"].get<double>(), 0.2);
}

TEST_F(ToolFifoTest, AnExistingFifoIsUsedAndLeft) {
    ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
    EXPECT_EQ(playFifo({"--create-fifo", "--epoch-offset", "0"}).status, 0);
    EXPECT_EQ(offsetsRead(), Words{"fifo 0 0 0 0 0 0 0 0"});
    EXPECT_TRUE(exists());
}

TEST_F(ToolFifoTest, AnAbsentFifoIsRefusedBeforeAnythingIsInitialised) {
    const auto result = playFifo({"--epoch-offset", "0"});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("cannot open the epoch FIFO " + path));
    EXPECT_TRUE(record().empty());
}

TEST_F(ToolFifoTest, AFileInItsPlaceIsRefusedAndLeft) {
    writeFile(path, "mine");
    const auto result = playFifo({"--create-fifo"});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr(path + " is not a FIFO"));
    EXPECT_EQ(contentOf(path), "mine");
}

TEST_F(ToolFifoTest, TheFifoIsRemovedAfterAFailureToo) {
    EXPECT_EQ(playFifo({"--create-fifo", "--set", "script=initialise-fails"}).status, 1);
    EXPECT_FALSE(exists());
    EXPECT_EQ(playFifo({"--create-fifo", "--set", "count=999"}).status, 2);
    EXPECT_FALSE(exists());
}
