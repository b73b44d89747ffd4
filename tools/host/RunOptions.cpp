#include "RunOptions.h"

#include <algorithm>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Numbers.h"
#include "RotatedName.h"

namespace vantelhost {

namespace {

[[noreturn]] void refuse(const std::string& option, const std::string& expected,
                         const std::string& text) {
    throw CLI::ValidationError(option, fmt::format("must be {}, not \"{}\"", expected, text));
}

std::int64_t integer(const std::string& option, const std::string& text) {
    const auto value = parseInteger(text);
    if (!value) {
        refuse(option, "an integer of nanoseconds", text);
    }
    return *value;
}

/// @return nothing for the kernel's.
std::optional<std::int64_t> taiOffset(const std::string& text) {
    constexpr std::int64_t most = 1000;
    const auto seconds = parseInteger(text);
    if (text != "kernel" && (!seconds || *seconds < 0 || *seconds > most)) {
        refuse("--tai-offset", "kernel, or an integer of seconds from 0 to 1000", text);
    }
    return seconds;
}

TimedOffset timedOffset(const std::string& option, const std::string& text) {
    const auto colon = text.find(':');
    const auto seconds = parseSeconds(text.substr(0, colon));
    const auto offset =
        colon == std::string::npos ? std::nullopt : parseInteger(text.substr(colon + 1));
    if (!seconds || !offset) {
        refuse(option, "SECONDS:NS", text);
    }
    return {*seconds, *offset};
}

void addBehaviour(CLI::App& command, RunOptions& options) {
    command
        .add_option_function<std::string>(
            "--seconds",
            [&options](const std::string& text) {
                options.seconds = parseSeconds(text);
                if (!options.seconds) {
                    refuse("--seconds", "a number of seconds", text);
                }
            },
            "Stop after this time; else at SIGINT, SIGTERM, SIGHUP or SIGQUIT")
        ->type_name("N");
    command.add_flag("--restart", options.restart,
                     "Begin a new session, after 1 s to 60 s, when ptp4l has ended or is given up");
    command
        .add_option_function<std::string>(
            "--give-up-after",
            [&options](const std::string& text) {
                const auto seconds = parseSeconds(text);
                if (!seconds) {
                    refuse("--give-up-after", "a number of seconds", text);
                }
                options.giveUpAfter = *seconds;
            },
            "With --restart: give a session up that is lost for so long; 0 is never")
        ->type_name("N")
        ->default_str("60");
    command.add_flag("--refuse-while-stopping", options.refuseWhileStopping,
                     "Refuse the plug-in's calls while stopping");
    command.add_flag("--force", options.force,
                     "Run also when somebody listens at udsAddress, and take the socket away");
}

void addRecord(CLI::App& command, RunOptions& options) {
    auto* record = command
                       .add_option("--record", options.recordFile,
                                   "Write every event to this file, as JSON Lines; an old one is "
                                   "replaced")
                       ->type_name("FILE");
    command
        .add_flag("--record-append", options.recordRules.append,
                  "Write behind what is in the record, rather than replace it")
        ->needs(record);
    auto* size = command
                     .add_option("--record-size", options.recordRules.size,
                                 "Begin a new file before one is larger than this, in octets, or "
                                 "with K, M or G; 0: never. The old one becomes FILE.1")
                     ->transform(CLI::AsSizeValue(false))
                     ->type_name("SIZE")
                     ->needs(record);
    command
        .add_option("--record-keep", options.recordRules.keep,
                    "How many old files there may be, up to FILE.N")
        ->check(CLI::Range(1U, mostRotated))
        ->type_name("N")
        ->capture_default_str()
        ->needs(size);
}

void addOutput(CLI::App& command, RunOptions& options) {
    auto* json = command.add_flag("--json", options.jsonLines, "Print JSON Lines");
    command
        .add_flag("--plain", options.plain,
                  "Print a line per event also on a terminal, not the live view")
        ->excludes(json);
    command.add_flag("--quiet", options.quiet, "Print no lines for time pairs and metadata")
        ->excludes(json);
    addRecord(command, options);
    command
        .add_option("--chrony", options.chronySocket,
                    "Hand time pairs to chronyd's reference clock (refclock SOCK) here")
        ->type_name("SOCKET");
    command
        .add_option_function<std::string>(
            "--clock",
            [&options](const std::string& text) {
                if (text != "realtime" && text != "auto" && text[0] != '/') {
                    refuse("--clock", R"("realtime", "auto" or the path of a device)", text);
                }
                options.clock = text;
            },
            "Whose time the local times of pairs are: \"realtime\"; that of a PTP clock, by its "
            "device; or \"auto\", the PTP clock of the first interface, if it has one")
        ->type_name("CLOCK")
        ->default_str("auto");
    command
        .add_option_function<std::string>(
            "--tai-offset",
            [&options](const std::string& text) { options.taiOffset = taiOffset(text); },
            "TAI minus UTC, for chronyd, where the grandmaster keeps TAI and a PTP clock stamps; "
            "kernel: as that knows it")
        ->type_name("SECONDS|kernel")
        ->default_str("kernel");
    command
        .add_option("--status-socket", options.statusSocket,
                    "Answer \"vantel-host status\" here, who may write to it: mode 0660")
        ->type_name("PATH");
    command
        .add_option_function<std::string>(
            "--metrics",
            [&options](const std::string& text) {
                options.metrics = parseListenAddress(text);
                if (!options.metrics) {
                    refuse("--metrics", "ADDRESS:PORT or [IPV6]:PORT, in numbers", text);
                }
            },
            "Serve metrics to Prometheus here, over HTTP; port 0 is any that is free")
        ->type_name("ADDRESS:PORT");
}

void addFifo(CLI::App& command, RunOptions& options) {
    command.add_option("--fifo", options.fifo, "The FIFO of epoch offsets")
        ->type_name("PATH")
        ->capture_default_str();
    command.add_flag("--create-fifo", options.createFifo,
                     "Create the FIFO if it is absent, and remove it at the end");
    command
        .add_option_function<std::string>(
            "--epoch-offset",
            [&options](const std::string& text) {
                options.epochOffset = integer("--epoch-offset", text);
            },
            "Write this epoch offset before the start")
        ->type_name("NS");
    command
        .add_option_function<std::vector<std::string>>(
            "--epoch-offset-at",
            [&options](const std::vector<std::string>& texts) {
                for (const auto& text : texts) {
                    options.timedOffsets.push_back(timedOffset("--epoch-offset-at", text));
                }
            },
            "Write an epoch offset some time after the start; repeatable")
        ->type_name("SECONDS:NS")
        ->expected(1)
        ->take_all();
}

void finish(RunOptions& options, bool fifoNamed) {
    options.useFifo = fifoNamed || options.createFifo || options.writesFifo();
    std::stable_sort(options.timedOffsets.begin(), options.timedOffsets.end(),
                     [](const auto& a, const auto& b) { return a.seconds < b.seconds; });
}

} // namespace

void addRunOptions(CLI::App& command, RunOptions& options) {
    addSettingsOptions(command, options);
    addBehaviour(command, options);
    addOutput(command, options);
    addFifo(command, options);
    command.footer(
        "Exit status: 0 after a clean run; 1 when the plug-in reported an error or broke the rules "
        "of\nthe interface, ptp4l ended unasked, no time pair came that is of use, chronyd took "
        "none, or the\noutput was lost; 2 for a bad option, setting, library or FIFO, or when "
        "udsAddress is in use.");
    command.final_callback([&command, &options] { finish(options, command.count("--fifo") > 0); });
}

} // namespace vantelhost
