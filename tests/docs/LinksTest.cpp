// Every link from one document of the project to another leads somewhere.

#include <algorithm>
#include <cctype>
#include <filesystem>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/TemporaryFolder.h"

namespace {

namespace fs = std::filesystem;

/// A heading as links name it.
std::string anchorOf(const std::string& heading) {
    std::string anchor;
    for (const char character : heading) {
        const auto code = static_cast<unsigned char>(character);
        if (character == ' ') {
            anchor += '-';
        } else if (std::isalnum(code) != 0 || character == '-' || character == '_') {
            anchor += static_cast<char>(std::tolower(code));
        }
    }
    return anchor;
}

std::set<std::string> anchorsIn(const fs::path& document) {
    static const std::regex heading("#+ (.*)");
    std::istringstream lines(readFile(document));
    std::set<std::string> anchors;
    std::smatch found;
    for (std::string line; std::getline(lines, line);) {
        if (std::regex_match(line, found, heading)) {
            anchors.insert(anchorOf(found[1]));
        }
    }
    return anchors;
}

std::vector<std::string> linksIn(const std::string& text) {
    static const std::regex link(R"(\]\(([^)\s]+)\))");
    std::vector<std::string> links;
    for (std::sregex_iterator found(text.begin(), text.end(), link), end; found != end; ++found) {
        if ((*found)[1].str().find("://") == std::string::npos) {
            links.push_back((*found)[1]);
        }
    }
    return links;
}

void expectLinksLeadSomewhere(const fs::path& document) {
    for (const std::string& link : linksIn(readFile(document))) {
        const std::size_t mark = std::min(link.find('#'), link.size());
        const std::string name = link.substr(0, mark);
        const fs::path target = name.empty() ? document : document.parent_path() / name;
        EXPECT_TRUE(fs::exists(target)) << document << ": " << link;
        const std::string anchor = link.substr(std::min(mark + 1, link.size()));
        EXPECT_TRUE(anchor.empty() || anchorsIn(target).count(anchor) == 1)
            << document << ": " << link;
    }
}

TEST(LinksTest, LeadToFilesAndHeadings) {
    const fs::path root = VANTEL_PROJECT_FOLDER;
    for (const char* name : {"README.md", "ARCHITECTURE.md", "CONTRIBUTING.md", "CHANGELOG.md"}) {
        expectLinksLeadSomewhere(root / name);
    }
    for (const char* folder : {"docs", "tools"}) {
        for (const auto& entry : fs::recursive_directory_iterator(root / folder)) {
            if (entry.path().extension() == ".md") {
                expectLinksLeadSomewhere(entry.path());
            }
        }
    }
}

} // namespace
