#include "RunConfig.h"

#include <algorithm>
#include <cstdio>
#include <utility>

#include <fmt/format.h>

#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

RunConfig readRunConfig(const Words& commandLine) {
    RunOptions given;
    CLI::App command;
    addRunOptions(command, given);
    parseWords(command, commandLine);
    Config config = readConfig(given);

    RunConfig result{given, std::move(config.json), complaintsAbout(config.file)};
    if (result.errors.empty()) {
        Words words = commandLine;
        const Words more = wordsToAdd(command, config.file.options);
        words.insert(words.end(), more.begin(), more.end());
        result.options = optionsOf(words, addRunOptions);
        result.options.fileSettings = std::move(config.file.settings);
    }
    return result;
}

std::vector<std::string> complaintsAbout(const ConfigFile& file) {
    RunOptions unused;
    CLI::App command;
    addRunOptions(command, unused);
    const auto parse = [](const Words& words) { optionsOf(words, addRunOptions); };
    std::vector<ConfigError> errors = complaintsAbout(file.options, command, parse);
    errors.insert(errors.end(), file.errors.begin(), file.errors.end());
    std::stable_sort(errors.begin(), errors.end(),
                     [](const auto& a, const auto& b) { return a.line < b.line; });
    std::vector<std::string> texts;
    for (auto& error : errors) {
        texts.push_back(std::move(error.text));
    }
    return texts;
}

void refuseBadFile(const std::vector<std::string>& errors) {
    for (const auto& error : errors) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(error));
    }
    if (!errors.empty()) {
        throw UsageError("nothing is done with a bad configuration file");
    }
}

} // namespace vantelhost
