#include "CheckCommand.h"

#include <algorithm>
#include <memory>
#include <string>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Checks/CheckText.h"
#include "Checks/Checks.h"
#include "Checks/PlugInTrial.h"
#include "Checks/Subject.h"
#include "OptionWords.h"
#include "RunConfig.h"
#include "SettingsOptions.h"
#include "Text.h"
#include "UsageError.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

struct CheckOptions : SettingsOptions {
    Subject subject; ///< with the paths that the user named
    bool json = false;
};

void addPath(CLI::App& command, const char* name, std::string& path, const char* description) {
    command.add_option(name, path, description)->type_name("PATH")->capture_default_str();
}

void addCheckOptions(CLI::App& command, CheckOptions& options) {
    addSettingsOptions(command, options);
    Subject& subject = options.subject;
    addPath(command, "--ptp4l", subject.daemon,
            "The daemon that the plug-in was built to start (VANTEL_PTP4L_PATH)");
    addPath(command, "--socket-prefix", subject.socketPrefix,
            "The plug-in's own socket as built, without the process id "
            "(VANTEL_LOCAL_SOCKET_PREFIX)");
    addPath(command, "--fifo", subject.fifo, "The FIFO of epoch offsets");
    command.add_flag("--create-fifo", subject.createFifo,
                     "The run will create the FIFO if it is absent");
    command.add_flag("--software", subject.software,
                     "The daemon will be a script that calls ptp4l with -S: time stamps in "
                     "software");
    command.add_flag("--json", options.json, "Print a JSON object")->configurable(false);
    command.footer(
        "A line for each check: \"ok\", \"FAIL\", \"warn\" or \"skip\", what was found, and how to "
        "mend it.\nNothing is started or left behind: the plug-in writes ptp4l's file into a "
        "temporary folder, and\nptp4l reads it without an interface.\nExit status: 0 when no check "
        "fails (warnings do not count); 1 when one does, or the output is\nlost; 2 for a bad "
        "option or configuration file.");
}

/// With what the configuration file adds to the command line.
CheckOptions withFile(const CLI::App& command, const ConfigFile& file) {
    Words words = wordsOf(command);
    const Words more = wordsToAdd(command, file.options);
    words.insert(words.end(), more.begin(), more.end());
    auto options = ParsedOptions(words, addCheckOptions).options;
    options.fileSettings = file.settings;
    return options;
}

/// Whether the file has the run write epoch offsets.
bool writesFifo(const ConfigFile& file) {
    return std::any_of(file.options.begin(), file.options.end(), [](const ConfigEntry& entry) {
        return entry.key == "epoch-offset" || entry.key == "epoch-offset-at";
    });
}

int check(const CLI::App& command, const CheckOptions& given) {
    Config config = readConfig(given);
    refuseBadFile(complaintsAbout(config.file));
    const CheckOptions options = withFile(command, config.file);
    PlugInTrial trial(options.pluginPath, userSettings(options, std::move(config.json)));
    CheckResults results = trial.run();
    Subject subject = options.subject;
    subject.writeFifo = writesFifo(config.file);
    subject.settings = trial.settings();
    subject.rendered = trial.rendered();
    subject.interfaces = subject.settings
                             ? subject.settings->at("interface").get<std::vector<std::string>>()
                             : options.interfaces;
    for (auto& result : checkMachine(subject)) {
        results.push_back(std::move(result));
    }
    writeOutput(options.json ? toAscii(checkJson(results)) + "\n" : checkLines(results));
    return allHold(results) ? exitClean : exitFailed;
}

} // namespace

std::function<int()> prepareCheck(CLI::App& command) {
    const auto options = std::make_shared<CheckOptions>();
    addCheckOptions(command, *options);
    return [options, &command] { return check(command, *options); };
}

} // namespace vantelhost
