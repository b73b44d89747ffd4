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

/// A measurement's options.
class Options {
public:
    explicit Options(CLI::App& command) : command_(command) {}

    // Each takes the variable that holds the value, at first the default.
    void add(const std::string& name, int& value, const std::string& help);
    void add(const std::string& name, std::vector<std::uint16_t>& values, const std::string& help);
    void add(const std::string& name, std::string& value, const std::vector<std::string>& choices,
             const std::string& help);
    void addFlag(const std::string& name, bool& value, const std::string& help);

private:
    CLI::App& command_;
};

/// Measurements, each with a name that the command line begins with. Only this knows the library
/// that reads the options, which takes long to compile.
class Program {
public:
    Program();
    ~Program();
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    Options add(const std::string& name, const std::string& purpose,
                const std::function<void()>& measure);

    /// Reads the options, then measures. What is thrown goes to the standard error.
    /// @return the program's status.
    int run(int argc, char** argv);

private:
    std::unique_ptr<CLI::App> app_;
};
