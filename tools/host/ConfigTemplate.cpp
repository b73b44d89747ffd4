#include "ConfigTemplate.h"

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Numbers.h"
#include "Text.h"

namespace vantelhost {

namespace {

constexpr char introduction[] =
    "# Options and settings for \"vantel-host run --config FILE\": see vantel-host.toml(5).\n"
    "# \"vantel-host check --config FILE\" tells what is wrong with them.\n"
    "\n"
    "# Options are those of the command line, which wins over this file. Commented out, they show\n"
    "# their default, or what is to be filled in.\n";

constexpr char settingsIntroduction[] = "\n"
                                        "# The plug-in's parameters, with their defaults.\n"
                                        "[settings]\n";

/// The value as a file has it, which isWritable().
std::string written(const std::string& text) {
    if (parseInteger(text)) {
        return text;
    }
    const char quote = text.find_first_of("\"\\") == std::string::npos ? '"' : '\'';
    return fmt::format("{}{}{}", quote, text, quote);
}

/// Whether there are quotes for a text.
bool isWritable(const std::string& text) {
    return onOneLine(text) == text && (text.find('\'') == std::string::npos ||
                                       text.find_first_of("\"\\") == std::string::npos);
}

std::string optionValue(const CLI::Option& option) {
    if (option.get_expected_min() == 0) {
        return "false";
    }
    const std::string text = option.get_default_str();
    const std::string value = written(text.empty() ? option.get_type_name() : text);
    return option.get_multi_option_policy() == CLI::MultiOptionPolicy::TakeAll
               ? fmt::format("[{}]", value)
               : value;
}

std::string optionLines(const CLI::Option& option) {
    return fmt::format("\n# {}.\n#{} = {}\n", option.get_description(), option.get_lnames().at(0),
                       optionValue(option));
}

std::string meaning(const Parameter& parameter) {
    switch (parameter.type) {
    case DataType::integer:
        return parameter.range ? fmt::format("an integer from {} to {}", parameter.range->low,
                                             parameter.range->high)
                               : "an integer";
    case DataType::boolean:
        return "true or false";
    case DataType::string:
        break;
    }
    return "a text";
}

std::string settingLines(const Parameter& parameter) {
    const Json& value = parameter.defaultValue;
    const std::string text = value.is_string() ? value.get<std::string>() : value.dump();
    return fmt::format("\n# {}{}\n{}{} = {}\n", meaning(parameter),
                       parameter.hidden ? "; seldom of use" : "", isWritable(text) ? "" : "#",
                       parameter.key,
                       isWritable(text) && value.is_string() ? written(text) : toAscii(value));
}

} // namespace

std::string configTemplate(const CLI::App& run, const Schema& schema) {
    std::string text = introduction;
    for (const auto* option : run.get_options()) {
        if (option->get_configurable()) {
            text += optionLines(*option);
        }
    }
    text += settingsIntroduction;
    for (const auto& parameter : schema) {
        text += settingLines(parameter);
    }
    return text;
}

} // namespace vantelhost
