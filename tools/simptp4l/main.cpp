#include "CommandLine.h"
#include "Config.h"
#include "Log.h"
#include "ScriptParser.h"
#include "Simulator.h"
#include "StartRecord.h"

#include <cerrno>
#include <exception>
#include <fstream>
#include <iostream>
#include <system_error>
#include <unistd.h>

namespace {

using namespace simptp4l;

constexpr int failure = 1;
constexpr int badScript = 2;

/// A failure that ends the program with this status.
struct Failure {
    int status;
    std::vector<std::string> texts;
};

/// A path in a script counts from the script's folder: the daemon's own may be anywhere.
std::string besideScript(const std::string& path, const std::string& script) {
    const std::size_t slash = script.rfind('/');
    return path[0] == '/' || slash == std::string::npos ? path : script.substr(0, slash + 1) + path;
}

Config loadConfig(const CommandLine& line) {
    if (!line.config) {
        return {};
    }
    std::vector<std::string> errors;
    Config config = readConfig(*line.config, errors);
    if (!errors.empty()) {
        throw Failure{failure, errors};
    }
    return config;
}

/// Opens the log as well, as soon as its path is known.
Script loadScript(const CommandLine& line, const StartRecord& record, Log& log) {
    if (!line.script && !line.config) {
        return {};
    }
    const std::string path = line.script ? *line.script : *line.config + ".sim";
    // Only the script that goes without saying may be missing.
    if (!line.script && access(path.c_str(), F_OK) != 0) {
        return {};
    }
    std::ifstream file(path);
    if (!file) {
        throw Failure{badScript, {path + ": " + std::generic_category().message(errno)}};
    }
    std::vector<LineError> errors;
    Script script = parseScript(file, errors);
    std::vector<std::string> texts;
    texts.reserve(errors.size());
    for (const LineError& error : errors) {
        texts.push_back(path + ":" + std::to_string(error.line) + ": " + error.text);
    }
    if (!line.check && !script.log.empty() && !log.open(besideScript(script.log, path))) {
        texts.push_back(path + ": log " + script.log + ": " +
                        std::generic_category().message(errno));
    }
    log.start(record);
    if (script.clock == ClockSource::steered) {
        script.steeredFile = besideScript(script.steeredFile, path);
    }
    if (!texts.empty()) {
        throw Failure{badScript, texts};
    }
    return script;
}

int run(const StartRecord& record, Log& log) {
    const CommandLine line =
        readCommandLine({record.argv.begin() + (record.argv.empty() ? 0 : 1), record.argv.end()});
    if (line.help) {
        std::cout << helpText();
        return 0;
    }
    if (!line.error.empty()) {
        throw Failure{failure, {line.error}};
    }
    const Script script = loadScript(line, record, log);
    if (script.exitAtOnce && !line.check) {
        return *script.exitAtOnce;
    }
    const Config config = loadConfig(line);
    if (line.check) {
        return 0;
    }
    return Simulator(config, script, line.interfaces, log).run();
}

int reportedRun(const StartRecord& record, Log& log) {
    try {
        return run(record, log);
    } catch (const Failure& caught) {
        for (const std::string& text : caught.texts) {
            std::cerr << "simptp4l: " << text << std::endl;
            log.error(text);
        }
        return caught.status;
    } catch (const std::exception& caught) {
        std::cerr << "simptp4l: " << caught.what() << std::endl;
        log.error(caught.what());
        return failure;
    }
}

} // namespace

int main(int argc, char** argv) {
    const StartRecord record = recordStart(argc, argv);
    Log log;
    const int status = reportedRun(record, log);
    log.exit(status);
    return status;
}
