#include "ReportCommand.h"

#include <cerrno>
#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>
#include <system_error>
#include <vector>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "RecordFile.h"
#include "Report/Limits.h"
#include "Report/Page.h"
#include "Report/RecordFiles.h"
#include "Report/RecordingReader.h"
#include "Report/ReportJson.h"
#include "Text.h"
#include "UsageError.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

struct ReportOptions {
    std::vector<std::string> recordings;
    std::string page;
    std::string limits; ///< empty: none
    bool json = false;
};

/// One file is open at a time: there may be more of them than descriptors.
Recording readRecords(const std::vector<std::string>& paths) {
    RecordingReader reader;
    for (const auto& path : paths) {
        std::ifstream stream = openRecord(path);
        reader.read(stream, path);
    }
    return reader.finish();
}

void refuseToReplace(const std::vector<std::string>& paths, const std::string& page) {
    for (const auto& path : paths) {
        std::error_code ignored;
        if (std::filesystem::equivalent(path, page, ignored)) {
            throw UsageError("the page would replace the recording " + path);
        }
    }
}

/// What the page is called: the only recording's name, with how many more there are.
std::string nameOf(const std::vector<std::string>& recordings) {
    const std::filesystem::path first(recordings.front());
    // That of a folder may end with a slash.
    const auto last = first.has_filename() ? first.filename() : first.parent_path().filename();
    const auto more = recordings.size() - 1;
    return last.string() + (more == 0 ? "" : fmt::format(" and {} more", more));
}

constexpr const char* standardOutput = "-";

void writePage(const std::string& path, const std::string& page) {
    if (path == standardOutput) {
        writeOutput(page);
        return;
    }
    const RecordFile file(path);
    file.begin();
    if (!writeAll(file.descriptor(), page)) {
        throw std::runtime_error(fmt::format("cannot write {}: {}", path, errorText(errno)));
    }
}

std::string textOf(const Recording& recording, const ReportOptions& options) {
    const auto name = nameOf(options.recordings);
    const auto* limits = findLimits(options.limits);
    return options.json ? toAscii(reportJson(recording, name, limits)) + "\n"
                        : reportPage(recording, name, limits);
}

/// The page is complete before the file is touched.
int makeReport(const ReportOptions& options) {
    const auto paths = findRecords(options.recordings);
    if (options.page != standardOutput) {
        refuseToReplace(paths, options.page);
    }
    writePage(options.page, textOf(readRecords(paths), options));
    return exitClean;
}

} // namespace

std::function<int()> prepareReport(CLI::App& command) {
    const auto options = std::make_shared<ReportOptions>();
    command
        .add_option("recording", options->recordings,
                    "What 'run --record' has written: files, in any order, or folders of them")
        ->type_name("FILE")
        ->required();
    command
        .add_option("-o,--output", options->page,
                    "The HTML page to write; - is the standard output, which is where the JSON "
                    "text goes by default")
        ->type_name("FILE");
    command
        .add_option("--limits", options->limits,
                    "Judge the time error by the limits of ITU-T G.8273.2 for this class of clocks")
        ->check(CLI::IsMember(limitNames()));
    command.add_flag("--json", options->json, "Write the figures as JSON, and no page");
    command.callback([options] {
        if (options->page.empty()) {
            if (!options->json) {
                throw CLI::RequiredError("--output");
            }
            options->page = standardOutput;
        }
    });
    return [options] { return makeReport(*options); };
}

} // namespace vantelhost
