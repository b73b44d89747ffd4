#include "Session.h"

#include <filesystem>
#include <stdexcept>

#include <vantel_bc/zekeltr.h>

#include "errors/Status.h"
#include "support/TemporaryFolder.h"
#include "system/Scene.h"

namespace {

void link(const std::string& daemon) {
    std::filesystem::remove("ptp4l");
    std::filesystem::create_symlink(daemon, "ptp4l");
}

void check(const zeerr::Status& status) {
    if (status.code < 0) {
        throw std::runtime_error(status.json == nullptr ? "a session fails" : status.json);
    }
}

} // namespace

std::string useSimulator(const std::string& script) {
    link(VANTEL_SIMPTP4L);
    writeFile("ptp4l.conf.sim", script);
    return R"({"neighborPropDelayThreshold":20000000,"logAnnounceInterval":1,)"
           R"("logSyncInterval":-3,"priority1":127,"priority2":126,)"
           R"("offsetScaledLogVariance":65535,"udsAddress":"ptp4l.sock",)"
           R"("transportSpecific":"0x0","syncReceiptTimeout":0,"assumeTwoStep":false,)"
           R"("pathTraceEnabled":false,"followUpInfo":false,"networkTransport":"UDPv4",)"
           R"("delayMechanism":"E2E","configFile":"ptp4l.conf",)"
           R"("ptpDstMac":"01:00:5e:00:01:81","interface":["eth0"]})";
}

std::string useRealDaemon() {
    link("/usr/bin/ptp4l");
    return sceneConfiguration();
}

Session::Session(const std::string& configuration) {
    zeerr::LocalStatus status;
    zekeltr_initialize(&slot_, configuration.c_str(), &status);
    check(status);
}

Session::~Session() {
    stop();
    zekeltr_finalize(&slot_);
}

void Session::start() {
    zeerr::LocalStatus status;
    zekeltr_start(&slot_, &status);
    check(status);
}

void Session::stop() {
    zekeltr_stop(&slot_);
}
