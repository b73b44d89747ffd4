#include "Preparations.h"

#include <filesystem>
#include <system_error>

#include <fmt/format.h>

#include "Checks/PathChecks.h"
#include "UsageError.h"

namespace vantelhost {

namespace fs = std::filesystem;

void refuseSocketInUse(const Json& settings) {
    Subject subject;
    subject.settings = settings;
    const Finding finding = checkUdsInUse(subject);
    if (finding.verdict != Verdict::fail) {
        return;
    }
    throw UsageError(
        fmt::format("udsAddress {}; mend: {}; or --force", finding.found, finding.mend));
}

std::optional<std::string> makeConfigFolder(const Json& settings) {
    const auto found = settings.find("configFile");
    if (found == settings.end() || !found->is_string()) {
        return std::nullopt;
    }
    const fs::path folder = fs::path(found->get<std::string>()).parent_path();
    std::error_code error;
    if (folder.empty() || fs::exists(folder, error)) {
        return std::nullopt;
    }
    fs::create_directories(folder, error);
    if (error) {
        throw UsageError(fmt::format("cannot make the folder {} of configFile: {}", folder.string(),
                                     error.message()));
    }
    return folder.string();
}

std::optional<std::string> prepareChange(const Json& settings, const Json& before, bool force) {
    constexpr char socket[] = "udsAddress";
    const bool isOther = settings.value(socket, Json()) != before.value(socket, Json());
    if (isOther && !force) {
        refuseSocketInUse(settings);
    }
    return makeConfigFolder(settings);
}

} // namespace vantelhost
