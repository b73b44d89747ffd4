// Arbitrary text as a host's protocol configuration: ends in a configuration file or in an error
// that a host can read.

#include <set>

#include <unistd.h>

#include "FuzzInput.h"
#include "errors/Exception.h"
#include "protocolConfig.h"
#include "support/TemporaryFolder.h"

#include <cjson/cJSON.h>

namespace {

using Document = std::unique_ptr<cJSON, decltype(&cJSON_Delete)>;

constexpr char defaultFile[] = "ptp4l.conf";

const std::string* nameOf(const cJSON* item, std::string& storage) {
    return cJSON_IsString(item) ? &(storage = item->valuestring) : nullptr;
}

/// Only plain names: nothing outside the working folder is ever written.
bool leavesTheFolder(const std::string& text) {
    const Document document(cJSON_Parse(text.c_str()), &cJSON_Delete);
    std::string storage;
    const std::string* const name =
        nameOf(cJSON_GetObjectItem(document.get(), "configFile"), storage);
    return name != nullptr && name->find('/') != std::string::npos;
}

bool endsWith(const std::string& text, const std::string& end) {
    return text.size() >= end.size() &&
           text.compare(text.size() - end.size(), end.size(), end) == 0;
}

void checkError(const zeerr::Status& status, const std::string& text) {
    static const std::set<std::int32_t> codes{-52003, -52004, -52005};
    require(codes.count(status.code) == 1, "the code is one of those that a host is promised");
    require(status.json != nullptr, "an error has a text");
    const Document error(cJSON_ParseWithOpts(status.json, nullptr, 1), &cJSON_Delete);
    require(cJSON_IsObject(error.get()), "the text of an error is a JSON object");
    const cJSON* const component = cJSON_GetObjectItemCaseSensitive(error.get(), "component");
    require(cJSON_IsString(component) && component->valuestring == std::string("vantel_bc"),
            "an error names its component");
    if (const cJSON* const debug = cJSON_GetObjectItemCaseSensitive(error.get(), "zesync_debug")) {
        const cJSON* const json = cJSON_GetObjectItemCaseSensitive(debug, "JSON");
        require(cJSON_IsString(json) && json->valuestring == text,
                "a type error quotes the configuration");
    }
}

} // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const TemporaryFolder folder;
    const std::string text(std::string(data, data + size).c_str());
    if (leavesTheFolder(text)) {
        return 0;
    }
    zekelVantel::tProtocolConfig session;
    session.configFile = defaultFile;
    zeerr::LocalStatus status;
    try {
        zekelVantel::readProtocolConfig(session, text);
    } catch (...) {
        zeerr::statusFromCurrentException(status);
        checkError(status, text);
    }
    const std::string written = readFile(session.configFile);
    if (!written.empty()) {
        require(zeerr::isClean(status), "an error leaves no file");
        require(written.compare(0, 9, "[global]\n") == 0, "the file begins as the template");
        require(endsWith(written, "\nboundary_clock_jbod  0\n"), "the file ends as the template");
    }
    unlink(session.configFile.c_str());
    return 0;
}
