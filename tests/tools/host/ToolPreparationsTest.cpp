// What a run looks at and makes before the plug-in gets its settings.

#include <filesystem>

#include <fmt/format.h>
#include <unistd.h>

#include "Checks/Listener.h"
#include "Tool.h"

using testing::HasSubstr;
using testing::IsEmpty;

namespace {

class ToolPreparationsTest : public ToolTest {
protected:
    std::string socketPath = folder.path("uds");
};

} // namespace

TEST_F(ToolPreparationsTest, ASocketInUseIsRefusedWithItsOwnerBeforeAnythingIsMade) {
    const Listener other(socketPath, SOCK_DGRAM);
    const std::string fifo = folder.path("fifo");
    const auto result =
        play("", {"--set", "udsAddress=" + socketPath, "--set",
                  "configFile=" + folder.path("new/a"), "--fifo", fifo, "--create-fifo"});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr(fmt::format("udsAddress {}: in use by ", socketPath)));
    EXPECT_THAT(result.errors, HasSubstr(fmt::format(" (process {}), started by ", ::getpid())));
    EXPECT_THAT(result.errors, HasSubstr("; mend: end it, or choose another path: "
                                         "--set udsAddress=...; or --force\n"));
    EXPECT_THAT(record(), IsEmpty());
    EXPECT_FALSE(std::filesystem::exists(folder.path("new")));
}

TEST_F(ToolPreparationsTest, ForceTakesASocketInUse) {
    const Listener other(socketPath, SOCK_DGRAM);
    EXPECT_EQ(play("", {"--set", "udsAddress=" + socketPath, "--force"}).status, 0);
    EXPECT_EQ(record().back(), "finalise");
}

TEST_F(ToolPreparationsTest, ASocketThatWasLeftBehindIsNotInUse) {
    { const Listener gone(socketPath, SOCK_DGRAM); }
    EXPECT_EQ(play("", {"--set", "udsAddress=" + socketPath}).status, 0);
}

TEST_F(ToolPreparationsTest, TheFolderOfTheConfigFileIsMadeAndTold) {
    const std::string made = folder.path("a/b");
    const auto result = play("", {"--set", "configFile=" + made + "/ptp4l.conf"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("folder").at(0)["path"], made);
    EXPECT_TRUE(std::filesystem::exists(made + "/ptp4l.conf"));
}

TEST_F(ToolPreparationsTest, AFolderThatIsThereIsNotTold) {
    const auto result = play("", {"--set", "configFile=" + folder.path("ptp4l.conf")});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.events("folder"), IsEmpty());
}

TEST_F(ToolPreparationsTest, AFolderThatCannotBeMadeIsRefused) {
    writeFile(folder.path("file"), "");
    const auto result = play("", {"--set", "configFile=" + folder.path("file/a/b")});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors,
                HasSubstr("cannot make the folder " + folder.path("file/a") + " of configFile"));
    EXPECT_THAT(record(), IsEmpty());
}
