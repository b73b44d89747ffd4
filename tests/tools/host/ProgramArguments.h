/// @file
#pragma once

#include <string>
#include <vector>

/// Texts as execve(2) takes them.
class ProgramArguments {
public:
    explicit ProgramArguments(std::vector<std::string> texts);
    ProgramArguments(const ProgramArguments&) = delete;
    ProgramArguments& operator=(const ProgramArguments&) = delete;

    char* const* get() const { return pointers_.data(); }

private:
    std::vector<std::string> texts_;
    std::vector<char*> pointers_;
};

/// This process's environment, in which some variables are set anew, each "NAME=value". No name is
/// there twice: programs differ in which one they take.
std::vector<std::string> environmentWith(const std::vector<std::string>& variables);
