#include "Program.h"

#include <csignal>
#include <exception>
#include <iostream>

#include <CLI/CLI.hpp>

void Options::add(const std::string& name, int& value, const std::string& help) {
    command_.add_option(name, value, help);
}

void Options::add(const std::string& name, std::vector<std::uint16_t>& values,
                  const std::string& help) {
    command_.add_option(name, values, help)->delimiter(',');
}

void Options::add(const std::string& name, std::string& value,
                  const std::vector<std::string>& choices, const std::string& help) {
    command_.add_option(name, value, help)->check(CLI::IsMember(choices));
}

void Options::addFlag(const std::string& name, bool& value, const std::string& help) {
    command_.add_flag(name, value, help);
}

Program::Program() : app_(std::make_unique<CLI::App>("Measures; scripts/bench.sh runs it all.")) {
    app_->require_subcommand(1);
    app_->option_defaults()->always_capture_default();
}

Program::~Program() = default;

Options Program::add(const std::string& name, const std::string& purpose,
                     const std::function<void()>& measure) {
    CLI::App* command = app_->add_subcommand(name, purpose);
    command->final_callback(measure);
    return Options(*command);
}

int Program::run(int argc, char** argv) {
    std::signal(SIGPIPE, SIG_IGN); // a client that is gone is told by what it does not print
    try {
        CLI11_PARSE(*app_, argc, argv);
        return 0;
    } catch (const std::exception& error) {
        std::cerr << argv[1] << ": " << error.what() << '\n';
        return 1;
    }
}
