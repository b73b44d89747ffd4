// The command "completion", in a real bash.

#include <filesystem>
#include <regex>
#include <set>
#include <sstream>

#include "Terminal.h"
#include "Tool.h"

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::IsSupersetOf;

namespace {

class CompletionTest : public testing::Test {
protected:
    CompletionTest() {
        Child child({HOST_TOOL, "completion"});
        EXPECT_EQ(child.wait(), 0);
        EXPECT_EQ(child.errors(), "");
        writeFile(script, child.output());
    }

    /// What bash offers for the last of the words, in the folder.
    std::set<std::string> offered(const Words& words) const {
        Words command{"/bin/bash",
                      "--norc",
                      "-c",
                      "compopt() { :; }\nsource \"$0\"\ncd \"$1\"\nshift\nCOMP_WORDS=(\"$@\")\n"
                      "COMP_CWORD=$(($# - 1))\n_vantel_host\nprintf '%s\\n' \"${COMPREPLY[@]}\"",
                      script,
                      folder.path(""),
                      HOST_TOOL};
        command.insert(command.end(), words.begin(), words.end());
        const auto libraries = std::filesystem::path(VANTEL_BC_LIBRARY).parent_path().string();
        Child bash(command, {"LD_LIBRARY_PATH=" + libraries});
        EXPECT_EQ(bash.wait(), 0);
        EXPECT_EQ(bash.errors(), "");
        std::istringstream lines(bash.output());
        std::set<std::string> all;
        for (std::string line; std::getline(lines, line);) {
            all.insert(line);
        }
        all.erase("");
        return all;
    }

    const Folder folder;
    const std::string script = folder.path("completion");
};

/// The words that a help text lists at the beginning of lines and that match.
std::set<std::string> helpWords(const Words& arguments, const std::string& expression) {
    Words words{HOST_TOOL};
    words.insert(words.end(), arguments.begin(), arguments.end());
    Child child(words);
    EXPECT_EQ(child.wait(), 0);
    const std::string help = child.output();
    const std::regex line("\n  (?:-., *)?(" + expression + ")\\b");
    std::set<std::string> all;
    for (std::sregex_iterator found(help.begin(), help.end(), line), end; found != end; ++found) {
        all.insert((*found)[1]);
    }
    return all;
}

} // namespace

TEST_F(CompletionTest, OffersAllCommands) {
    const auto commands = helpWords({"--help"}, "[a-z]+");
    EXPECT_GE(commands.size(), 5U);
    EXPECT_THAT(offered({""}), IsSupersetOf(commands));
    EXPECT_THAT(offered({"rep"}), ElementsAre("report"));
    EXPECT_THAT(offered({"--v"}), ElementsAre("--version"));
}

TEST_F(CompletionTest, OffersAllOptionsOfEachCommand) {
    for (const auto& command : helpWords({"--help"}, "[a-z]+")) {
        const auto options = helpWords({command, "--help"}, "--[a-z0-9-]+");
        EXPECT_GE(options.size(), 1U) << command;
        EXPECT_EQ(offered({command, "--"}), options) << command;
    }
    EXPECT_THAT(offered({"run", "--json", "--epoch-offset-"}), ElementsAre("--epoch-offset-at"));
}

TEST_F(CompletionTest, OffersFilesWhereTheyAreMeant) {
    writeFile(folder.path("my file.toml"), "");
    EXPECT_THAT(offered({"run", "--config", "my"}), ElementsAre("my file.toml"));
    EXPECT_THAT(offered({"run", "--config", "=", "my"}), ElementsAre("my file.toml"));
    EXPECT_THAT(offered({"run", "--config", "="}), Contains("my file.toml"));
    EXPECT_THAT(offered({"report", "m"}), ElementsAre("my file.toml"));
    EXPECT_THAT(offered({"run", "m"}), IsEmpty());
}

TEST_F(CompletionTest, OffersTheInterfacesOfTheMachine) {
    std::set<std::string> interfaces;
    for (const auto& entry : std::filesystem::directory_iterator("/sys/class/net")) {
        interfaces.insert(entry.path().filename());
    }
    EXPECT_EQ(offered({"run", "--interface", ""}), interfaces);
}

TEST_F(CompletionTest, OffersThePlugInsParameters) {
    EXPECT_THAT(offered({"run", "--set", "prior"}), ElementsAre("priority1=", "priority2="));
    EXPECT_THAT(offered({"check", "--set", "=", "followUp"}), ElementsAre("followUpInfo="));
}

TEST_F(CompletionTest, OffersNothingForOtherValues) {
    EXPECT_THAT(offered({"run", "--seconds", ""}), IsEmpty());
    EXPECT_THAT(offered({"run", "--set", "priority1", "="}), IsEmpty());
    EXPECT_THAT(offered({"run", "--set", "priority1", "=", ""}), IsEmpty());
}

TEST_F(CompletionTest, CompletesWhatIsTypedAtATerminal) {
    Terminal bash({"/bin/bash", "--norc", "--noprofile", "-i"});
    bash.write("source '" + script + "'; echo rea''dy\n");
    ASSERT_TRUE(bash.waitForOutput("ready"));
    bash.write("vantel-host che\t--crea\t#\n");
    EXPECT_TRUE(bash.waitForOutput("vantel-host check --create-fifo #"));
    bash.write("exit\n");
    bash.wait();
}
