/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace CLI {
class App;
} // namespace CLI

/// The options and the end of a program that measures. Only this knows the library that reads the
/// options, which takes long to compile.
class Program {
public:
    explicit Program(const std::string& purpose);
    ~Program();
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    // Each takes the variable that holds the value, at first the default.
    void option(const std::string& name, int& value, const std::string& help);
    void option(const std::string& name, std::vector<std::uint16_t>& values,
                const std::string& help);
    void option(const std::string& name, std::string& value,
                const std::vector<std::string>& choices, const std::string& help);
    void flag(const std::string& name, bool& value, const std::string& help);

    /// Reads the options, then measures. What is thrown goes to the standard error.
    /// @return the program's status.
    int run(int argc, char** argv, const std::function<void()>& measure);

private:
    std::unique_ptr<CLI::App> app_;
};
