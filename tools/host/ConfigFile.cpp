#include "ConfigFile.h"

#include <algorithm>
#include <map>
#include <sstream>
#include <string_view>
#include <utility>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "ConfigValue.h"
#include "Text.h"

namespace vantelhost {

namespace {

constexpr char settingsHeader[] = "[settings]";
constexpr char blanks[] = " \t\r";

std::string trimmed(const std::string& text) {
    const auto begin = text.find_first_not_of(blanks);
    return begin == std::string::npos
               ? ""
               : text.substr(begin, text.find_last_not_of(blanks) + 1 - begin);
}

bool isName(const std::string& text) {
    return !text.empty() &&
           text.find_first_not_of("abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ"
                                  "0123456789_-") == std::string::npos;
}

bool hasControlCharacter(const std::string& text) {
    return std::any_of(text.begin(), text.end(), [](char each) {
        return (static_cast<unsigned char>(each) < ' ' && each != '\t') || each == '\x7F';
    });
}

/// Finds the lines of keys, and lets CLI11 read one after the other: it knows nothing of lines.
class ConfigReader {
public:
    ConfigReader(const std::string& text, std::string name)
        : lines_(text), name_(std::move(name)) {}

    ConfigFile run() {
        for (std::string line; next(line);) {
            if (line.front() == '[') {
                openSection(line);
            } else {
                readEntry(line);
            }
        }
        return std::move(file_);
    }

private:
    /// The next line that says something, without blanks around it.
    bool next(std::string& line) {
        while (std::getline(lines_, line)) {
            ++number_;
            line = trimmed(line);
            if (hasControlCharacter(line) || !isUtf8(line)) {
                error("is not text in UTF-8");
            } else if (!line.empty() && line.front() != '#') {
                return true;
            }
        }
        return false;
    }

    std::string place(std::size_t line) const { return fmt::format("{}:{}", name_, line); }

    void error(const std::string& problem) { error(number_, problem); }

    void error(std::size_t line, const std::string& problem) {
        file_.errors.push_back({line, fmt::format("{}: {}", place(line), problem)});
    }

    void openSection(const std::string& line) {
        const std::string header = trimmed(line.substr(0, line.find('#')));
        inSettings_ = header == settingsHeader;
        inUnknown_ = !inSettings_;
        if (inUnknown_) {
            error(fmt::format("{}: there is no such section, only {}", header, settingsHeader));
        } else {
            isNew(header, header, number_);
        }
    }

    void readEntry(const std::string& line) {
        const std::size_t first = number_;
        const auto equals = line.find('=');
        const std::string key = trimmed(line.substr(0, equals));
        if (equals == std::string::npos || !isName(key)) {
            error(fmt::format("must be key = value, not {}", shown(line)));
            return;
        }
        ConfigValue value;
        std::string problem = value.add(line.substr(equals + 1));
        std::string more;
        while (problem.empty() && !value.isComplete() && next(more)) {
            problem = value.add(more);
        }
        if (!problem.empty()) {
            error(fmt::format("{}: {}", key, problem));
        } else if (!value.isComplete()) {
            error(first, fmt::format("{}: the array is not closed", key));
        } else if (!inUnknown_ && isNew(inSettings_ ? settingsHeader + key : key, key, first)) {
            store(key, value, first);
        }
    }

    void store(const std::string& key, const ConfigValue& value, std::size_t line) {
        std::istringstream statement(fmt::format("{}={}\n", key, value.text()));
        // Comments are gone: what looks like one is part of a text.
        CLI::ConfigTOML format;
        format.comment('\x01');
        ConfigEntry entry{key, {}, value.isArray(), line, place(line)};
        for (const auto& item : format.from_config(statement)) {
            entry.values = item.inputs;
        }
        if (value.isEmptyArray()) {
            entry.values.clear();
        }
        (inSettings_ ? file_.settings : file_.options).push_back(std::move(entry));
    }

    bool isNew(const std::string& what, const std::string& shownAs, std::size_t line) {
        const auto [before, inserted] = lineOf_.insert({what, line});
        if (!inserted) {
            error(line,
                  fmt::format("{}: is given twice, first in line {}", shownAs, before->second));
        }
        return inserted;
    }

    std::istringstream lines_;
    std::string name_;
    std::size_t number_ = 0;
    bool inSettings_ = false;
    bool inUnknown_ = false;
    std::map<std::string, std::size_t> lineOf_; ///< of sections and keys
    ConfigFile file_;
};

} // namespace

ConfigFile readConfigFile(const std::string& text, const std::string& name) {
    return ConfigReader(text, name).run();
}

bool isJsonText(const std::string& text) {
    const auto first = text.find_first_not_of(" \t\r\n");
    return first != std::string::npos && text[first] == '{';
}

} // namespace vantelhost
