#include <filesystem>

#include <sys/stat.h>

#include <gtest/gtest.h>

#include "ProtocolConfigFixture.h"

namespace {

class ProtocolConfigFileTest : public ProtocolConfigFixture {
protected:
    ~ProtocolConfigFileTest() override { umask(formerMask_); }

    mode_t mode(const std::string& path) const {
        struct stat entry {};
        EXPECT_EQ(stat(path.c_str(), &entry), 0);
        return entry.st_mode;
    }

private:
    const mode_t formerMask_ = umask(022);
};

TEST_F(ProtocolConfigFileTest, NewFileHasTheProcessDefaultPermissions) {
    for (const mode_t mask : {0022U, 0077U, 0002U}) {
        std::filesystem::remove("ptp4l_bc.conf");
        umask(mask);
        read();
        EXPECT_EQ(mode("ptp4l_bc.conf"), S_IFREG | (0666U & ~mask));
    }
}

TEST_F(ProtocolConfigFileTest, ExistingFileIsReplaced) {
    read();
    const std::string first = written();
    writeFile("ptp4l_bc.conf", std::string(10000, 'x'));
    read();
    EXPECT_EQ(written(), first);
}

TEST_F(ProtocolConfigFileTest, ExistingFileKeepsItsPermissions) {
    writeFile("ptp4l_bc.conf", "");
    std::filesystem::permissions("ptp4l_bc.conf", std::filesystem::perms(0666));
    read();
    EXPECT_EQ(mode("ptp4l_bc.conf"), mode_t{S_IFREG | 0666});
}

TEST_F(ProtocolConfigFileTest, SymbolicLinkIsFollowed) {
    writeFile("target", "another's");
    std::filesystem::create_symlink("target", "ptp4l_bc.conf");
    read();
    EXPECT_TRUE(std::filesystem::is_symlink("ptp4l_bc.conf"));
    EXPECT_EQ(readFile("target").substr(0, 9), "[global]\n");
}

TEST_F(ProtocolConfigFileTest, EachReadingStartsFromAFreshTemplate) {
    read();
    set("priority1", "7");
    read();
    EXPECT_TRUE(writtenHasLine("priority1               7"));
    EXPECT_TRUE(writtenHasLine("priority2               128"));
}

TEST_F(ProtocolConfigFileTest, AbsolutePathIsWritten) {
    set("configFile", "\"" + folder.path("absolute.conf") + "\"");
    read();
    EXPECT_EQ(readFile("absolute.conf").substr(0, 9), "[global]\n");
}

TEST_F(ProtocolConfigFileTest, UnwritablePathIsNoErrorAndLeavesNoFile) {
    std::filesystem::create_directory("folder");
    for (const char* const path : {"missing/ptp4l_bc.conf", "folder", ""}) {
        set("configFile", "\"" + std::string(path) + "\"");
        session.interfaces.clear();
        EXPECT_NO_THROW(read()) << path;
        EXPECT_FALSE(std::filesystem::is_regular_file(path));
        EXPECT_EQ(session.interfaces.size(), 2U);
    }
    EXPECT_TRUE(log.lines().empty());
}

TEST_F(ProtocolConfigFileTest, FifoAtThePathDoesNotHoldTheHost) {
    ASSERT_EQ(mkfifo("fifo", 0600), 0);
    set("configFile", "\"fifo\"");
    EXPECT_NO_THROW(read());
    EXPECT_TRUE(std::filesystem::is_fifo("fifo"));
}

TEST_F(ProtocolConfigFileTest, FileEndsWithOneLineFeed) {
    read();
    const std::string end = "ingressLatency       208\nboundary_clock_jbod  0\n";
    const std::string text = written();
    ASSERT_GT(text.size(), end.size());
    EXPECT_EQ(text.substr(text.size() - end.size()), end);
}

} // namespace
