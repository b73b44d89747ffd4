#include "ReportCommand.h"

#include <cerrno>
#include <filesystem>
#include <fstream>
#include <memory>
#include <stdexcept>
#include <string>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "RecordFile.h"
#include "Report/Page.h"
#include "Report/RecordingReader.h"
#include "Text.h"
#include "UsageError.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

struct ReportOptions {
    std::string recording;
    std::string page;
};

Recording readRecording(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    if (!file) {
        throw UsageError(fmt::format("cannot read {}: {}", path, errorText(errno)));
    }
    return RecordingReader::read(file, path);
}

constexpr const char* standardOutput = "-";

void writePage(const std::string& path, const std::string& page) {
    if (path == standardOutput) {
        writeOutput(page);
    } else if (const RecordFile file(path); !writeAll(file.descriptor(), page)) {
        throw std::runtime_error(fmt::format("cannot write {}: {}", path, errorText(errno)));
    }
}

/// The page is complete before the file is touched.
int makeReport(const ReportOptions& options) {
    std::error_code ignored;
    if (options.page != standardOutput &&
        std::filesystem::equivalent(options.recording, options.page, ignored)) {
        throw UsageError("the page would replace the recording " + options.recording);
    }
    const auto name = std::filesystem::path(options.recording).filename().string();
    writePage(options.page, reportPage(readRecording(options.recording), name));
    return exitClean;
}

} // namespace

std::function<int()> prepareReport(CLI::App& command) {
    const auto options = std::make_shared<ReportOptions>();
    command.add_option("recording", options->recording, "What 'run --record' has written")
        ->type_name("FILE")
        ->required();
    command
        .add_option("-o,--output", options->page,
                    "The HTML page to write; - is the standard output")
        ->type_name("FILE")
        ->required();
    return [options] { return makeReport(*options); };
}

} // namespace vantelhost
