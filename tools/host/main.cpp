// vantel-host: loads the boundary clock plug-in and shows what it reports.

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <exception>
#include <fstream>
#include <iostream>
#include <iterator>
#include <optional>
#include <string>

#include <fmt/format.h>

#include "CommandLine.h"
#include "Run.h"
#include "SchemaTable.h"
#include "StopSignal.h"
#include "Text.h"
#include "UsageError.h"

namespace {

using namespace vantelhost;

[[noreturn]] void refuse(const std::string& name) {
    throw UsageError(fmt::format("cannot read {}: {}", name, std::strerror(errno)));
}

std::string readAll(std::istream& stream, const std::string& name) {
    try {
        return std::string(std::istreambuf_iterator<char>(stream), {});
    } catch (const std::ios_base::failure&) { // a folder, for example
        refuse(name);
    }
}

std::optional<std::string> readConfig(const std::string& name) {
    if (name.empty()) {
        return std::nullopt;
    }
    if (name == "-") {
        return readAll(std::cin, "the standard input");
    }
    std::ifstream file(name, std::ios::binary);
    if (!file) {
        refuse(name);
    }
    return readAll(file, name);
}

/// Reads the settings before the signals are blocked: Ctrl-C still ends a wait for typed ones.
int run(const RunOptions& options) {
    auto configText = readConfig(options.configFile);
    const StopSignal stopSignal;
    return Run(options, std::move(configText), stopSignal).execute();
}

int dispatch(int argc, char** argv) {
    const auto command = readCommandLine(argc, argv);
    if (const auto* options = std::get_if<RunOptions>(&command)) {
        return run(*options);
    }
    if (const auto* options = std::get_if<SchemaOptions>(&command)) {
        return showSchema(*options);
    }
    return std::get<int>(command);
}

} // namespace

int main(int argc, char** argv) {
    try {
        return dispatch(argc, argv);
    } catch (const UsageError& error) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(error.what()));
        return exitUsage;
    } catch (const std::exception& error) {
        fmt::print(stderr, "vantel-host: {}\n", onOneLine(error.what()));
        return exitFailed;
    }
}
