#include "FetchClient.h"

#include <stdexcept>

// Some daemons let the first poll run into a time-out, on purpose: see pad-octet in
// docs/oddities.md.
FetchClient::FetchClient(const std::string& daemon) : Client("fetch"), fetcher_(daemon, 0) {
    if (!succeeds()) {
        FetchClient::poll();
    }
}

bool FetchClient::succeeds() {
    zekelVantel::tTimeStatus timeStatus;
    zekelVantel::tPtp4lMetaData metaData;
    return fetcher_.fetch(timeStatus, metaData) == 0;
}

void FetchClient::poll() {
    if (!succeeds()) {
        throw std::runtime_error("the fetch failed");
    }
}
