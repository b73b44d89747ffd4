#include "RunConfig.h"

#include <algorithm>
#include <cstdio>
#include <utility>

#include <fmt/format.h>

#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

RunConfig readRunConfig(const Words& commandLine) {
    const ParsedOptions given(commandLine, addRunOptions);
    Config config = readConfig(given.options);
    RunConfig result{
        given.options, {}, std::move(config.json), complaintsAbout(config.file, commandLine)};
    if (result.errors.empty()) {
        Words words = commandLine;
        const Words more = wordsToAdd(given.command, config.file.options);
        words.insert(words.end(), more.begin(), more.end());
        const ParsedOptions all(words, addRunOptions);
        result.options = all.options;
        result.options.fileSettings = std::move(config.file.settings);
        result.values = valuesOf(all.command);
    }
    return result;
}

std::vector<std::string> complaintsAbout(const ConfigFile& file, const Words& commandLine) {
    const ParsedOptions given(commandLine, addRunOptions);
    std::vector<ConfigError> errors =
        complaintsAbout(file.options, given.command,
                        [](const Words& words) { ParsedOptions(words, addRunOptions); });
    errors.insert(errors.end(), file.errors.begin(), file.errors.end());
    std::stable_sort(errors.begin(), errors.end(),
                     [](const auto& a, const auto& b) { return a.line < b.line; });
    std::vector<std::string> texts;
    texts.reserve(errors.size());
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
