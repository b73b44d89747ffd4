#include "NamedTests.h"

#include <filesystem>
#include <regex>

#include "support/TemporaryFolder.h"

namespace {

const std::filesystem::path root = VANTEL_PROJECT_FOLDER;

} // namespace

std::string projectFile(const std::string& name) {
    return readFile(root / name);
}

std::string sourcesBelow(const std::string& folder) {
    std::string text;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(root / folder)) {
        if (const auto kind = entry.path().extension(); kind == ".h" || kind == ".cpp") {
            text += readFile(entry.path());
        }
    }
    return text;
}

std::set<std::string> definedTests(const std::string& folder) {
    static const std::regex definition(R"(TEST(_F|_P)?\(\s*(\w+),\s*(\w+)\s*\))");
    static constexpr char word[] = "TEST";
    const std::string text = sourcesBelow(folder);
    std::set<std::string> names;
    std::smatch found;
    // Looking for the word first is much faster than the expression alone.
    for (std::size_t at = text.find(word); at != std::string::npos; at = text.find(word, at + 1)) {
        const auto begin = text.begin() + static_cast<std::ptrdiff_t>(at);
        if (std::regex_search(begin, text.end(), found, definition,
                              std::regex_constants::match_continuous)) {
            names.insert(found[2].str() + '.' + found[3].str());
        }
    }
    return names;
}

std::set<std::string> quotedTests(const std::string& text) {
    static const std::regex quotation(R"(`([A-Z]\w+\.[A-Z]\w+)`)");
    std::set<std::string> names;
    for (std::sregex_iterator found(text.begin(), text.end(), quotation), end; found != end;
         ++found) {
        names.insert((*found)[1]);
    }
    return names;
}
