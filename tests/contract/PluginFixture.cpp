#include "PluginFixture.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <stdexcept>

#include <dlfcn.h>

namespace {

void* library() {
    static void* const handle = dlopen(VANTEL_BC_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    if (handle == nullptr) {
        throw std::runtime_error(dlerror());
    }
    return handle;
}

template <typename Function>
void load(Function& function, const char* name) {
    void* const address = dlsym(library(), name);
    if (address == nullptr) {
        throw std::runtime_error(name);
    }
    static_assert(sizeof(function) == sizeof(address), "a function pointer of POSIX");
    std::memcpy(&function, &address, sizeof(function));
}

bool hostResize(zeerr_Status* status, std::uint32_t size) {
    if (size == 0) {
        std::free(status->json);
        status->json = nullptr;
        status->capacity = 0;
        return true;
    }
    char* const text = static_cast<char*>(std::malloc(size));
    std::memset(text, 0xa5, size);
    if (status->json != nullptr) {
        std::memcpy(text, status->json, std::min(size, status->capacity));
    }
    std::free(status->json);
    status->json = text;
    status->capacity = size;
    return true;
}

} // namespace

Plugin::Plugin() {
    load(getAPIVersion, "zekeltr_getAPIVersion");
    load(initialize, "zekeltr_initialize");
    load(finalize, "zekeltr_finalize");
    load(start, "zekeltr_start");
    load(stop, "zekeltr_stop");
    load(getName, "zekeltr_getName");
    load(getParameterValidationData, "zekeltr_getParameterValidationData");
}

HostStatus::HostStatus(std::int32_t initialCode)
    : zeerr_Status{initialCode, 0, &hostResize, nullptr} {}

HostStatus::HostStatus(std::int32_t initialCode, const std::string& text)
    : HostStatus(initialCode) {
    hostResize(this, static_cast<std::uint32_t>(text.size() + 1));
    std::strcpy(json, text.c_str());
}

HostStatus::~HostStatus() {
    hostResize(this, 0);
}

const Plugin& PluginFixture::plugin() {
    static const Plugin loaded;
    return loaded;
}

std::string PluginFixture::configuration(const std::string& part, const std::string& replacement) {
    std::string text = R"({"neighborPropDelayThreshold":20000000,"logAnnounceInterval":1,)"
                       R"("logSyncInterval":0,"priority1":128,"priority2":128,)"
                       R"("offsetScaledLogVariance":65535,"udsAddress":"/var/run/ptp4l_bc",)"
                       R"("transportSpecific":"0x0","syncReceiptTimeout":0,"assumeTwoStep":false,)"
                       R"("pathTraceEnabled":false,"followUpInfo":false,)"
                       R"("networkTransport":"UDPv4RAW","delayMechanism":"E2E",)"
                       R"("configFile":"ptp4l_bc.conf","ptpDstMac":"01:00:5e:00:01:81",)"
                       R"("interface":["eth0"]})";
    if (!part.empty()) {
        text.replace(text.find(part), part.size(), replacement);
    }
    return text;
}
