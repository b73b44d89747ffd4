#include "Program.h"

#include <csignal>
#include <exception>
#include <iostream>

#include <CLI/CLI.hpp>

Program::Program(const std::string& purpose) : app_(std::make_unique<CLI::App>(purpose)) {}

Program::~Program() = default;

void Program::option(const std::string& name, int& value, const std::string& help) {
    app_->add_option(name, value, help);
}

void Program::option(const std::string& name, std::vector<std::uint16_t>& values,
                     const std::string& help) {
    app_->add_option(name, values, help)->delimiter(',');
}

void Program::option(const std::string& name, std::string& value,
                     const std::vector<std::string>& choices, const std::string& help) {
    app_->add_option(name, value, help)->check(CLI::IsMember(choices));
}

void Program::flag(const std::string& name, bool& value, const std::string& help) {
    app_->add_flag(name, value, help);
}

int Program::run(int argc, char** argv, const std::function<void()>& measure) {
    CLI11_PARSE(*app_, argc, argv);
    std::signal(SIGPIPE, SIG_IGN); // a client that is gone is told by what it does not print
    try {
        measure();
        return 0;
    } catch (const std::exception& error) {
        std::cerr << app_->get_name() << ": " << error.what() << '\n';
        return 1;
    }
}
