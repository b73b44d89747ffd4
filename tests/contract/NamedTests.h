/// @file
/// For documents that name the tests that hold what they say.
#pragma once

#include <set>
#include <string>

/// The content of a file of the project.
std::string projectFile(const std::string& name);

/// The text of all sources and headers below a folder of the project.
std::string sourcesBelow(const std::string& folder);

/// All tests below a folder of the project, as "Suite.Behaviour".
std::set<std::string> definedTests(const std::string& folder = "tests");

/// What stands between a pair of backquotes in a text and looks like "Suite.Behaviour".
std::set<std::string> quotedTests(const std::string& text);
