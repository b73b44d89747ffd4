/// @file
#pragma once

#include <string>

#include <gtest/gtest.h>
#include <unistd.h>

#include "support/FakePtp4l.h"
#include "support/TemporaryFolder.h"
#include "tGetDataFromPtp4l.h"

/// A fetcher and the daemon that it asks.
class FetcherTest : public testing::Test {
protected:
    /// One fetch into fresh objects.
    std::int32_t fetch() {
        timeStatus = {};
        metaData = {};
        return fetcher.fetch(timeStatus, metaData);
    }

    /// The requests for one data set.
    std::vector<FakePtp4l::Request> requestsFor(std::uint16_t managementId) const {
        std::vector<FakePtp4l::Request> chosen;
        for (const auto& request : daemon.requests()) {
            if (request.managementId() == managementId) {
                chosen.push_back(request);
            }
        }
        return chosen;
    }

    const TemporaryFolder folder;
    const std::string localPath = "./ptp4lTimeRef." + std::to_string(getpid());
    FakePtp4l daemon{"./ptp4l_bc"};
    zekelVantel::tGetDataFromPtp4l fetcher{"./ptp4l_bc", 0};
    zekelVantel::tTimeStatus timeStatus;
    zekelVantel::tPtp4lMetaData metaData;
};

inline void answerNothing(const FakePtp4l::Request& /*request*/, FakePtp4l::Answers& answers) {
    answers.clear();
}
