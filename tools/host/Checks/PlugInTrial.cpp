#include "Checks/PlugInTrial.h"

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <system_error>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "Events.h"
#include "HostStatus.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

namespace fs = std::filesystem;

std::string makeFolder() {
    std::string path = (fs::temp_directory_path() / "vantel-host.XXXXXX").string();
    if (::mkdtemp(path.data()) == nullptr) {
        throw std::system_error(errno, std::system_category(), path);
    }
    return path;
}

std::string shownStatus(const char* operation, const HostStatus& status) {
    return statusEvent(operation, status.code(), status.text()).text;
}

std::string joined(const std::vector<std::string>& lines) {
    return fmt::format("{}", fmt::join(lines, "; "));
}

} // namespace

PlugInTrial::PlugInTrial(std::string library, UserSettings user)
    : library_(std::move(library)), user_(std::move(user)), folder_(makeFolder()) {}

PlugInTrial::~PlugInTrial() {
    std::error_code ignored;
    fs::remove_all(folder_, ignored);
}

CheckResults PlugInTrial::run() {
    static constexpr struct {
        const char* name;
        Finding (PlugInTrial::*check)();
    } steps[] = {
        {"plug-in", &PlugInTrial::load},
        {"schema", &PlugInTrial::readSchema},
        {"settings", &PlugInTrial::complete},
        {"initialise", &PlugInTrial::initialise},
    };
    CheckResults results;
    bool goesOn = true;
    for (const auto& step : steps) {
        const Finding finding = goesOn ? (this->*step.check)() : skipped("see above");
        goesOn = goesOn && finding.verdict != Verdict::fail;
        results.push_back({step.name, finding});
    }
    return results;
}

Finding PlugInTrial::load() {
    try {
        plugIn_.emplace(library_);
    } catch (const UsageError& error) {
        return bad(error.what(), "install the plug-in, or name its file with --library");
    }
    return good(fmt::format("\"{}\", API version {}, {}", plugIn_->name(), plugIn_->apiVersion(),
                            library_));
}

Finding PlugInTrial::readSchema() {
    HostStatus status;
    const std::string text = plugIn_->schema(status);
    const std::string mend = "install a plug-in that is whole";
    if (status.isError()) {
        return bad(shownStatus("getParameterValidationData", status), mend);
    }
    try {
        schema_ = parseSchema(text);
    } catch (const SchemaError& error) {
        return bad(error.what(), mend);
    }
    return good(fmt::format("{} parameters", schema_->size()));
}

Finding PlugInTrial::complete() {
    const Settings settings = completeSettings(*schema_, user_);
    const std::string mend = "\"vantel-host schema\" shows types and ranges";
    if (!settings.errors.empty()) {
        return bad(joined(settings.errors), mend);
    }
    settings_ = settings.values;
    return settings.warnings.empty() ? good("complete") : doubtful(joined(settings.warnings), mend);
}

/// With the machine's own paths left alone.
Json PlugInTrial::harmlessSettings() const {
    Json settings = *settings_;
    settings["configFile"] = folder_ + "/ptp4l.conf";
    settings["udsAddress"] = folder_ + "/ptp4l";
    return settings;
}

Finding PlugInTrial::initialise() {
    HostStatus status;
    void* slot = nullptr;
    plugIn_->initialise(&slot, harmlessSettings().dump(), status);
    if (status.isError()) {
        settings_.reset();
        return bad(shownStatus("initialize", status), "correct the settings that it names");
    }
    plugIn_->finalise(&slot);
    if (!rendered()) {
        return bad("the plug-in wrote no configuration file", "install a plug-in that is whole");
    }
    return status.isWarning() ? doubtful(shownStatus("initialize", status), "")
                              : good("the plug-in takes the settings");
}

std::optional<std::string> PlugInTrial::rendered() const {
    const std::string path = folder_ + "/ptp4l.conf";
    std::error_code ignored;
    return fs::is_regular_file(path, ignored) ? std::optional(path) : std::nullopt;
}

} // namespace vantelhost
