#include "ServiceManager.h"

#include <systemd/sd-daemon.h>

#include "Text.h"

namespace vantelhost {

void ServiceManager::isReady() const {
    ::sd_notify(0, "READY=1");
}

void ServiceManager::isStopping() const {
    ::sd_notify(0, "STOPPING=1");
}

void ServiceManager::status(const std::string& text) {
    if (text != status_) {
        status_ = text;
        ::sd_notify(0, ("STATUS=" + onOneLine(text)).c_str());
    }
}

void ServiceManager::feedWatchdog() const {
    ::sd_notify(0, "WATCHDOG=1");
}

} // namespace vantelhost
