#include "Completion.h"

#include <algorithm>
#include <map>
#include <vector>

#include <CLI/CLI.hpp>
#include <fmt/format.h>
#include <fmt/ranges.h>

namespace vantelhost {

namespace {

/// Before and behind the parts that are made of the command line's description.
constexpr char head[] = R"bash(# bash completion for vantel-host
_vantel_host() {
    local current=${COMP_WORDS[COMP_CWORD]} before=${COMP_WORDS[COMP_CWORD - 1]}
    local command=${COMP_WORDS[1]} values=none words=
    # "=" is a word of its own.
    if [[ $current == = ]]; then
        current= values=others
    elif [[ $before == = ]]; then
        before=${COMP_WORDS[COMP_CWORD - 2]} values=others
    fi
    if ((COMP_CWORD == 1)); then
        command=
        before=
    fi
)bash";

constexpr char tail[] = R"bash(    case $values in
        files)
            compopt -o filenames
            mapfile -t COMPREPLY < <(compgen -f -- "$current")
            return
            ;;
        interfaces) words=$(ls /sys/class/net) ;;
        parameters)
            compopt -o nospace
            words=$("${COMP_WORDS[0]}" schema 2>/dev/null | sed '1d; s/ .*/=/')
            ;;
        others) words= ;;
    esac
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$current")
}
complete -F _vantel_host vantel-host
)bash";

/// What a value is, as the script calls it.
std::string kindOf(const CLI::Option& option) {
    static const std::map<std::string, std::string> kinds = {
        {"FILE", "files"},      {"PATH", "files"},           {"SOCKET", "files"},
        {"NAME", "interfaces"}, {"KEY=VALUE", "parameters"},
    };
    const auto kind = kinds.find(option.get_type_name());
    return kind == kinds.end() ? "others" : kind->second;
}

/// All names, with their dashes.
std::vector<std::string> namesOf(const CLI::Option& option) {
    std::vector<std::string> names;
    for (const auto& name : option.get_snames()) {
        names.push_back("-" + name);
    }
    for (const auto& name : option.get_lnames()) {
        names.push_back("--" + name);
    }
    return names;
}

std::string wordsLine(const std::string& command, const std::vector<std::string>& words) {
    return fmt::format("        {}) words=\"{}\" ;;\n", command.empty() ? "\"\"" : command,
                       fmt::join(words, " "));
}

/// The words that may stand behind a command, and the kinds of their values.
class Command {
public:
    explicit Command(const CLI::App& app) {
        for (const auto* option : app.get_options()) {
            const auto names = namesOf(*option);
            words_.insert(words_.end(), names.begin(), names.end());
            if (names.empty()) {
                positional_ = kindOf(*option);
            } else if (option->get_expected_min() > 0) {
                auto& ofKind = names_[kindOf(*option)];
                ofKind.insert(ofKind.end(), names.begin(), names.end());
            }
        }
    }

    void addWord(const std::string& word) { words_.push_back(word); }

    const std::vector<std::string>& words() const { return words_; }

    /// Lines of "case $command:$before".
    std::string valueLines(const std::string& command) const {
        std::string lines;
        for (const auto& [kind, names] : names_) {
            std::string patterns;
            for (const auto& name : names) {
                patterns += fmt::format("{}{}:{}", patterns.empty() ? "" : " | ", command, name);
            }
            lines += fmt::format("        {}) values={} ;;\n", patterns, kind);
        }
        if (!positional_.empty()) {
            lines += fmt::format("        {}:*) [[ $current == -* ]] || values={} ;;\n", command,
                                 positional_);
        }
        return lines;
    }

private:
    std::vector<std::string> words_;
    std::map<std::string, std::vector<std::string>> names_; ///< of options by the kind of value
    std::string positional_;                                ///< the kind; empty without one
};

} // namespace

std::string bashCompletion(const CLI::App& program) {
    Command first(program);
    std::string words;
    std::string values;
    for (const auto* each : program.get_subcommands(nullptr)) {
        const Command command(*each);
        first.addWord(each->get_name());
        words += wordsLine(each->get_name(), command.words());
        values += command.valueLines(each->get_name());
    }
    words = wordsLine("", first.words()) + words;
    return fmt::format("{}    case $command in\n{}    esac\n    case $command:$before in\n{}    "
                       "esac\n{}",
                       head, words, values, tail);
}

} // namespace vantelhost
