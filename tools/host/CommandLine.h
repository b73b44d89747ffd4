/// @file
/// The program's command line. A subcommand is a row of main.cpp's table and a file pair with the
/// function that the row names.
#pragma once

#include <functional>
#include <vector>

namespace CLI {
class App;
}

namespace vantelhost {

struct Subcommand {
    const char* name;
    const char* description;

    /// Adds the subcommand's options to its part of the command line.
    /// @return what to do once they are read; gives the program's exit status, may throw
    /// UsageError.
    std::function<int()> (*prepare)(CLI::App& command);
};

/// Reads the command line and does what it says.
/// @return the exit status; exitUsage after a complaint about the command line.
int execute(const std::vector<Subcommand>& subcommands, int argc, const char* const* argv);

} // namespace vantelhost
