#include "CommandLine.h"

#include <cstdio>
#include <string>
#include <utility>

#include <CLI/CLI.hpp>
#include <fmt/format.h>
#include <fmt/ranges.h>

#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

int refuse(const std::string& problem) {
    fmt::print(stderr, "vantel-host: {}\n", onOneLine(problem));
    return exitUsage;
}

/// What is wrong with the word in the place of the command; empty when nothing is.
std::string complaintAbout(const std::vector<Subcommand>& subcommands, const char* word) {
    std::string names;
    for (const auto& subcommand : subcommands) {
        if (word != nullptr && std::string(word) == subcommand.name) {
            return {};
        }
        names += (names.empty() ? "" : ", ") + std::string(subcommand.name);
    }
    if (word != nullptr && word[0] == '-') {
        return {};
    }
    return fmt::format("{}; the commands are: {}",
                       word == nullptr ? "a command is missing"
                                       : fmt::format("there is no command \"{}\"", word),
                       names);
}

/// What is wrong with the words that nobody took.
std::string complaintAboutRest(const std::vector<std::string>& words) {
    for (const auto& word : words) {
        if (word.compare(0, 1, "-") == 0) {
            return fmt::format("there is no option \"{}\"; --help behind a command lists them",
                               word);
        }
    }
    return fmt::format("an argument too many: \"{}\"", fmt::join(words, "\", \""));
}

} // namespace

int execute(const std::vector<Subcommand>& subcommands, int argc, const char* const* argv) {
    const std::string complaint = complaintAbout(subcommands, argc > 1 ? argv[1] : nullptr);
    if (!complaint.empty()) {
        return refuse(complaint);
    }
    CLI::App app("A host for the boundary clock plug-in.", "vantel-host");
    app.set_version_flag("--version", "vantel-host " VANTEL_HOST_VERSION);
    app.require_subcommand(0, 1);
    std::vector<std::pair<CLI::App*, std::function<int()>>> actions;
    for (const auto& subcommand : subcommands) {
        auto* command = app.add_subcommand(subcommand.name, subcommand.description);
        actions.emplace_back(command, subcommand.prepare(*command));
    }
    try {
        app.parse(argc, argv);
    } catch (const CLI::ExtrasError&) {
        return refuse(complaintAboutRest(app.remaining(true)));
    } catch (const CLI::ParseError& error) {
        return app.exit(error) == 0 ? exitClean : exitUsage;
    }
    for (const auto& [command, action] : actions) {
        if (command->parsed()) {
            return action();
        }
    }
    return refuse(complaintAbout(subcommands, nullptr));
}

} // namespace vantelhost
