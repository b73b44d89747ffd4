#include "ProgramArguments.h"

#include <map>
#include <utility>

#include <unistd.h>

ProgramArguments::ProgramArguments(std::vector<std::string> texts) : texts_(std::move(texts)) {
    for (auto& text : texts_) {
        pointers_.push_back(text.data());
    }
    pointers_.push_back(nullptr);
}

std::vector<std::string> environmentWith(const std::vector<std::string>& variables) {
    std::map<std::string, std::string> byName;
    const auto set = [&](const std::string& variable) {
        byName[variable.substr(0, variable.find('='))] = variable;
    };
    for (char** variable = environ; *variable != nullptr; ++variable) {
        set(*variable);
    }
    for (const auto& variable : variables) {
        set(variable);
    }
    std::vector<std::string> result;
    for (const auto& [name, variable] : byName) {
        result.push_back(variable);
    }
    return result;
}
