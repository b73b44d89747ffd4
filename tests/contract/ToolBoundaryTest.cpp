// The tools share nothing with the plug-in but the headers that every host gets: what they find
// wrong is then not a mistake that both make.

#include <filesystem>
#include <regex>
#include <set>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "ElfFile.h"
#include "NamedTests.h"
#include "support/TemporaryFolder.h"

namespace {

namespace fs = std::filesystem;

const fs::path projectFolder = VANTEL_PROJECT_FOLDER;
const fs::path headers = projectFolder / "include/vantel_bc";

bool isBelow(const fs::path& folder, const fs::path& path) {
    const fs::path relative = path.lexically_normal().lexically_relative(folder);
    return !relative.empty() && *relative.begin() != "..";
}

/// Calls `visit` with each file below a folder and each header that it includes, as it is written.
template <typename Visitor>
void forEachInclude(const fs::path& folder, Visitor visit) {
    static const std::regex directive(R"re((?:^|\n)[ \t]*#[ \t]*include[ \t]*([^\n]*))re");
    for (const auto& entry : fs::recursive_directory_iterator(folder)) {
        const fs::path kind = entry.path().extension();
        if (kind != ".h" && kind != ".cpp") {
            continue;
        }
        const std::string text = readFile(entry.path());
        for (std::sregex_iterator found(text.begin(), text.end(), directive), end; found != end;
             ++found) {
            visit(entry.path(), (*found)[1].str());
        }
    }
}

bool isOfTheProject(const std::string& name) {
    return fs::exists(projectFolder / "source" / name) ||
           fs::exists(projectFolder / "support" / name) ||
           fs::exists(projectFolder / "include" / name);
}

/// What a tool includes that is neither its own nor a library's.
std::set<std::string> foreignHeaders(const fs::path& folder) {
    std::set<std::string> names;
    forEachInclude(folder, [&](const fs::path& file, const std::string& header) {
        const std::string name = header.substr(1, header.find_first_of("\">", 1) - 1);
        const bool own = name.find("..") == std::string::npos &&
                         (fs::exists(folder / name) || fs::exists(file.parent_path() / name));
        if ((header[0] == '"') != own || (!own && isOfTheProject(name))) {
            names.insert(header);
        }
    });
    return names;
}

std::vector<std::string> linesOf(const std::string& text) {
    static const std::regex line("[^;\n]+");
    std::vector<std::string> lines;
    for (std::sregex_iterator found(text.begin(), text.end(), line), end; found != end; ++found) {
        lines.push_back(found->str());
    }
    return lines;
}

struct Tool {
    const char* name;
    const char* program;
    const char* ingredients; ///< file with a path of a source, or of a folder of headers, in a line
    std::set<std::string> headers;
    std::set<std::string> exports;
};

const Tool host = {
    "host",
    VANTEL_HOST_PROGRAM,
    VANTEL_HOST_INGREDIENTS,
    {"<vantel_bc/quality.h>", "<vantel_bc/status.h>", "<vantel_bc/zekel.h>",
     "<vantel_bc/zekeltr.h>"},
    {"zekel_adjustTime", "zekel_getTime", "zekel_setTRQuality", "zekel_updateMetaData"}};
const Tool simulator = {"simptp4l", VANTEL_SIMPTP4L_PROGRAM, VANTEL_SIMPTP4L_INGREDIENTS, {}, {}};

class ToolBoundaryTest : public testing::TestWithParam<Tool> {
protected:
    const Tool& tool = GetParam();
    const fs::path folder = projectFolder / "tools" / tool.name;
};

/// Whether a mangled name is of the plug-in's own code. Without regular expressions: a tool has
/// tens of thousands of names.
bool isOfThePlugIn(const std::string& name) {
    for (const char* inside : {"11zekelVantel", "6zesdbg", "zesdbg_VarLine"}) {
        if (name.find(inside) != std::string::npos) {
            return true;
        }
    }
    const std::string errors = "5zeerr";
    for (auto at = name.find(errors); at != std::string::npos; at = name.find(errors, at + 1)) {
        // The status is a type of the interface.
        if (name.compare(at + errors.size(), 7, "6Status") != 0) {
            return true;
        }
    }
    return false;
}

TEST(ToolBoundary, NamesOfThePlugInAreTold) {
    EXPECT_TRUE(isOfThePlugIn("_ZN11zekelVantel10tMsgBuffer5clearEv"));
    EXPECT_TRUE(isOfThePlugIn("_ZN14zesdbg_VarLine6appendE"));
    EXPECT_TRUE(isOfThePlugIn("_ZN6zesdbg8settingsE"));
    EXPECT_TRUE(isOfThePlugIn("_ZN5zeerr7setCodeERNS_6StatusEi"));
    EXPECT_FALSE(isOfThePlugIn("_ZN10vantelhost10HostStatusC1EPN5zeerr6StatusE"));
    EXPECT_FALSE(isOfThePlugIn("main"));
}

TEST_P(ToolBoundaryTest, OnlyTheInterfacesHeadersAreIncluded) {
    EXPECT_EQ(foreignHeaders(folder), tool.headers);
}

TEST_P(ToolBoundaryTest, NothingOfThePlugInIsCompiledIn) {
    const auto paths = linesOf(readFile(tool.ingredients));
    EXPECT_GE(paths.size(), 15U);
    for (const std::string& path : paths) {
        const bool project =
            isBelow(projectFolder, path) && !isBelow(projectFolder / "build", path);
        EXPECT_TRUE(!project || isBelow(folder, path) || isBelow(headers.parent_path(), path))
            << path;
    }
}

TEST_P(ToolBoundaryTest, ProgramHoldsNothingOfThePlugIn) {
    const auto symbols = ElfFile(tool.program).symbols(SHT_SYMTAB);
    EXPECT_GE(symbols.size(), 100U);
    for (const auto& symbol : symbols) {
        EXPECT_FALSE(isOfThePlugIn(symbol.name)) << symbol.name;
    }
}

TEST_P(ToolBoundaryTest, ProgramExportsTheCallbacksOfAHostAlone) {
#ifdef VANTEL_SANITIZED
    GTEST_SKIP() << "a sanitized program exports the sanitizer's functions, too";
#endif
    std::set<std::string> functions;
    for (const auto& symbol : ElfFile(tool.program).symbols(SHT_DYNSYM)) {
        // Weak ones are instances of the standard library's templates, which it shares.
        if (symbol.isDefined() && symbol.type == STT_FUNC && symbol.binding == STB_GLOBAL) {
            functions.insert(symbol.name);
        }
    }
    EXPECT_EQ(functions, tool.exports);
}

INSTANTIATE_TEST_SUITE_P(Tools, ToolBoundaryTest, testing::Values(host, simulator),
                         [](const testing::TestParamInfo<Tool>& row) {
                             return std::string(row.param.name);
                         });

} // namespace
