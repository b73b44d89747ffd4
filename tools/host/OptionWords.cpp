#include "OptionWords.h"

#include <algorithm>

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace vantelhost {

namespace {

bool isFlag(const CLI::Option& option) {
    return option.get_expected_min() == 0;
}

bool isRepeatable(const CLI::Option& option) {
    return option.get_multi_option_policy() == CLI::MultiOptionPolicy::TakeAll;
}

/// The option of this name, or null.
const CLI::Option* optionNamed(const CLI::App& command, const std::string& key) {
    return command.get_option_no_throw("--" + key);
}

/// A false flag is as one that is not given, lest it excludes others.
Words wordsFor(const CLI::Option& option, const std::vector<std::string>& values) {
    const std::string name = "--" + option.get_lnames().at(0);
    Words words;
    for (const auto& value : values) {
        if (!isFlag(option)) {
            words.insert(words.end(), {name, value});
        } else if (value != "false") {
            words.push_back(name);
        }
    }
    return words;
}

std::string complaintAboutType(const CLI::Option& option, const ConfigEntry& entry) {
    const std::string text = fmt::format("\"{}\"", fmt::join(entry.values, "\", \""));
    if (isFlag(option)) {
        const bool fits =
            !entry.isArray && (entry.values.at(0) == "true" || entry.values.at(0) == "false");
        return fits ? "" : fmt::format("must be true or false, not {}", text);
    }
    return entry.isArray && !isRepeatable(option) ? "must be one value, not an array" : "";
}

/// Those of CLI11 begin with the option's name.
std::string withoutName(const std::string& problem, const std::string& key) {
    const std::string name = fmt::format("--{}: ", key);
    return problem.compare(0, name.size(), name) == 0 ? problem.substr(name.size()) : problem;
}

/// @param words those of the entries before; gets those of this one if nothing is wrong with it.
std::string complaintAbout(const ConfigEntry& entry, const CLI::App& command,
                           const std::function<void(const Words&)>& parse, Words& words) {
    const auto* option = optionNamed(command, entry.key);
    if (option == nullptr) {
        return "is unknown: no option of \"run\"; settings stand below [settings]";
    }
    if (!option->get_configurable()) {
        return "stands on the command line alone";
    }
    std::string problem = complaintAboutType(*option, entry);
    if (!problem.empty()) {
        return problem;
    }
    Words all = words;
    for (auto& word : wordsFor(*option, entry.values)) {
        all.push_back(std::move(word));
    }
    try {
        parse(all);
        words = std::move(all);
        return {};
    } catch (const CLI::ParseError& error) {
        return withoutName(error.what(), entry.key);
    }
}

} // namespace

OptionValues valuesOf(const CLI::App& command) {
    OptionValues values;
    for (const auto* option : command.get_options()) {
        if (option->count() > 0 && !option->get_lnames().empty()) {
            values[option->get_lnames().at(0)] = option->results();
        }
    }
    return values;
}

Words wordsOf(const CLI::App& command) {
    Words words;
    for (const auto* option : command.get_options()) {
        if (option->count() > 0 && !option->get_lnames().empty()) {
            const Words more = wordsFor(*option, option->results());
            words.insert(words.end(), more.begin(), more.end());
        }
    }
    return words;
}

void parseWords(CLI::App& command, const Words& words) {
    command.parse(Words(words.rbegin(), words.rend())); // the last one first, as CLI11 wants it
}

Words wordsToAdd(const CLI::App& command, const std::vector<ConfigEntry>& entries) {
    const auto isGiven = [](const CLI::Option* option) { return option->count() > 0; };
    Words words;
    for (const auto& entry : entries) {
        const auto* option = optionNamed(command, entry.key);
        if (option == nullptr || !option->get_configurable() || isGiven(option)) {
            continue;
        }
        const auto excluded = option->get_excludes();
        if (std::none_of(excluded.begin(), excluded.end(), isGiven)) {
            const Words more = wordsFor(*option, entry.values);
            words.insert(words.end(), more.begin(), more.end());
        }
    }
    return words;
}

std::vector<ConfigError> complaintsAbout(const std::vector<ConfigEntry>& entries,
                                         const CLI::App& command,
                                         const std::function<void(const Words&)>& parse) {
    std::vector<ConfigError> complaints;
    Words words;
    for (const auto& entry : entries) {
        const std::string problem = complaintAbout(entry, command, parse, words);
        if (!problem.empty()) {
            complaints.push_back(
                {entry.line, fmt::format("{}: {}: {}", entry.place, entry.key, problem)});
        }
    }
    return complaints;
}

} // namespace vantelhost
