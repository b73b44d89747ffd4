#include "OptionWords.h"

#include <algorithm>
#include <set>

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

/// What is wrong with an entry that stands alone.
std::string complaintAbout(const ConfigEntry& entry, const CLI::App& command,
                           const std::function<void(const Words&)>& parse) {
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
    try {
        parse(wordsFor(*option, entry.values));
    } catch (const CLI::RequiresError&) {
        // Of all entries together only.
    } catch (const CLI::ParseError& error) {
        return withoutName(error.what(), entry.key);
    }
    return {};
}

/// Those options that are there with the entries.
std::set<const CLI::Option*> optionsThere(const CLI::App& command,
                                          const std::vector<ConfigEntry>& entries) {
    std::set<const CLI::Option*> options;
    for (const auto& entry : entries) {
        const auto* option = optionNamed(command, entry.key);
        if (option != nullptr && !wordsFor(*option, entry.values).empty()) {
            options.insert(option);
        }
    }
    return options;
}

/// What is wrong with an entry beside the others.
/// @param before the options of the entries before it
/// @param all    those of all
std::string complaintAboutOthers(const CLI::Option& option,
                                 const std::set<const CLI::Option*>& before,
                                 const std::set<const CLI::Option*>& all) {
    for (const auto* needed : option.get_needs()) {
        if (needed->count() == 0 && all.count(needed) == 0) {
            return fmt::format("needs {}", needed->get_lnames().at(0));
        }
    }
    for (const auto* excluded : option.get_excludes()) {
        if (before.count(excluded) > 0) {
            return fmt::format("excludes {}", excluded->get_lnames().at(0));
        }
    }
    return {};
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
    const auto all = optionsThere(command, entries);
    std::set<const CLI::Option*> before;
    std::vector<ConfigError> complaints;
    for (const auto& entry : entries) {
        std::string problem = complaintAbout(entry, command, parse);
        const auto* option = optionNamed(command, entry.key);
        if (problem.empty() && all.count(option) > 0) {
            problem = complaintAboutOthers(*option, before, all);
            before.insert(option);
        }
        if (!problem.empty()) {
            complaints.push_back(
                {entry.line, fmt::format("{}: {}: {}", entry.place, entry.key, problem)});
        }
    }
    return complaints;
}

} // namespace vantelhost
