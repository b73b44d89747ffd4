// Keeps what operators read about log lines, reasons and error codes in step with the sources.

#include <map>
#include <regex>
#include <set>
#include <string>
#include <utility>

#include <gtest/gtest.h>

#include "NamedTests.h"
#include "support/Markdown.h"

namespace {

using Line = std::pair<std::string, std::string>; ///< priority, text
using markdown::unquoted;

constexpr char literals[] = R"re(((?:\s*"(?:[^"\\]|\\.)*")+))re";

std::string sources() {
    return sourcesBelow("source") + sourcesBelow("support");
}

/// The text of adjacent string literals.
std::string joined(const std::string& code) {
    std::string text;
    bool inside = false;
    for (const char character : code) {
        if (character == '"') {
            inside = !inside;
        } else if (inside) {
            text += character;
        }
    }
    return text;
}

/// Calls `visit` with each match in the sources.
template <typename Visitor>
void forEachMatch(const std::string& expression, Visitor visit) {
    const std::string text = sources();
    const std::regex pattern(expression);
    for (std::sregex_iterator found(text.begin(), text.end(), pattern), end; found != end;
         ++found) {
        visit(*found);
    }
}

/// All that the plug-in logs. What is put together from two texts is shown as one.
std::multiset<Line> loggedLines() {
    std::multiset<Line> lines;
    std::set<std::string> composed;
    forEachMatch(R"(syslog\(\s*(LOG_\w+),)" + std::string(literals), [&](const std::smatch& call) {
        const std::string text = joined(call[2]);
        if (text == "%s%d") {
            composed.insert(call[1]);
        } else {
            lines.emplace(call[1], text);
        }
    });
    EXPECT_EQ(composed, std::set<std::string>{"LOG_ERR"});
    forEachMatch(R"(logHostFailure\()" + std::string(literals), [&](const std::smatch& call) {
        lines.emplace("LOG_ERR", joined(call[1]) + "%d");
    });
    forEachMatch(R"(trace\(zesdbg::levelFailure, \{[^}]*\},)" + std::string(literals),
                 [&](const std::smatch& call) { lines.emplace("stderr", joined(call[1])); });
    return lines;
}

/// Calls that log something, however they are written.
std::size_t loggingCalls() {
    std::size_t calls = 0;
    // The two threads log through a function, whose one call is theirs.
    forEachMatch(R"((syslog|logHostFailure)\()", [&](const std::smatch&) { ++calls; });
    forEachMatch("levelFailure,", [&](const std::smatch&) { ++calls; });
    return calls;
}

std::set<std::string> reportedReasons() {
    std::map<std::string, std::string> texts;
    forEachMatch(R"(constexpr char (\w+)\[\] =)" + std::string(literals),
                 [&](const std::smatch& text) { texts[text[1]] = joined(text[2]); });
    std::set<std::string> reasons;
    forEachMatch(R"(host_\.setQuality\([^;]*,\s*(\w+)\);)",
                 [&](const std::smatch& call) { reasons.insert(texts[call[1]]); });
    return reasons;
}

std::set<Line> raisedErrors() {
    std::map<std::string, std::string> codes;
    std::set<Line> errors;
    forEachMatch(R"(int32_t (\w+) = (-52\d+);)",
                 [&](const std::smatch& code) { codes[code[1]] = code[2]; });
    forEachMatch(R"re(ErrorSite \w+\{\s*code::(\w+),\s*"(\w+)")re",
                 [&](const std::smatch& site) { errors.emplace(codes[site[1]], site[2]); });
    return errors;
}

void expectAdvice(const markdown::Row& row) {
    for (const std::string& cell : row) {
        EXPECT_FALSE(cell.empty()) << row.at(0);
    }
}

TEST(OperationsDocumentTest, EveryLogLineHasARow) {
    std::multiset<Line> rows;
    for (const auto& row : markdown::tables(projectFile("docs/operations.md"),
                                            {"priority", "text", "meaning", "what to do"})) {
        rows.emplace(row.at(0), unquoted(row.at(1)));
        expectAdvice(row);
    }
    const auto lines = loggedLines();
    EXPECT_EQ(rows, lines);
    EXPECT_GE(lines.size(), 14U);
}

TEST(OperationsDocumentTest, NoLogLineEscapesTheScan) {
    // The definition of the function, and the call in it, are no lines of their own.
    EXPECT_EQ(loggedLines().size() + 2, loggingCalls());
}

TEST(OperationsDocumentTest, EveryReasonHasARow) {
    std::set<std::string> rows;
    for (const auto& row : markdown::tables(projectFile("docs/operations.md"),
                                            {"reason", "quality", "meaning", "what to do"})) {
        EXPECT_TRUE(rows.insert(unquoted(row.at(0))).second) << row.at(0) << " stands twice";
        expectAdvice(row);
    }
    EXPECT_EQ(rows, reportedReasons());
    EXPECT_EQ(rows.size(), 4U);
}

TEST(OperationsDocumentTest, EveryErrorCodeHasARowWithItsConstants) {
    static const std::regex word("\\w+");
    std::set<Line> rows;
    for (const auto& row : markdown::tables(projectFile("docs/host-interface.md"),
                                            {"code", "\"error_constant\"", "when", "what to do"})) {
        expectAdvice(row);
        for (std::sregex_iterator name(row[1].begin(), row[1].end(), word), end; name != end;
             ++name) {
            rows.emplace(row.at(0), name->str());
        }
    }
    EXPECT_EQ(rows, raisedErrors());
    EXPECT_GE(rows.size(), 12U);
}

} // namespace
