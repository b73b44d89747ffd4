/// @file
#pragma once

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "errors/Exception.h"
#include "protocolConfig.h"
#include "support/SyslogCapture.h"
#include "support/TemporaryFolder.h"

/// Reads a protocol configuration, at first that of the schema's defaults, in a folder of its own.
class ProtocolConfigFixture : public testing::Test {
protected:
    /// Gives a key a value, as JSON text.
    void set(const std::string& key, const std::string& value) {
        const auto member = std::find_if(members_.begin(), members_.end(),
                                         [&](const auto& entry) { return entry.first == key; });
        if (member == members_.end()) {
            members_.emplace_back(key, value);
        } else {
            member->second = value;
        }
    }

    void remove(const std::string& key) {
        members_.erase(std::remove_if(members_.begin(), members_.end(),
                                      [&](const auto& entry) { return entry.first == key; }),
                       members_.end());
    }

    std::string text() const {
        std::string text;
        for (const auto& [key, value] : members_) {
            text += (text.empty() ? "\"" : ",\"") + key + "\":" + value;
        }
        return "{" + text + "}";
    }

    void read() { zekelVantel::readProtocolConfig(session, text()); }

    /// Reads a configuration and records its failure in `status`.
    void readToFailure(const std::string& configText) {
        try {
            zekelVantel::readProtocolConfig(session, configText);
            ADD_FAILURE() << "nothing thrown";
        } catch (...) {
            zeerr::statusFromCurrentException(status);
        }
        EXPECT_EQ(written(), "");
    }

    void readToFailure() { readToFailure(text()); }

    std::string written() const { return readFile("ptp4l_bc.conf"); }

    bool writtenHasLine(const std::string& line) const {
        return ("\n" + written()).find("\n" + line + "\n") != std::string::npos;
    }

    const TemporaryFolder folder;
    const SyslogCapture log;
    zekelVantel::tProtocolConfig session;
    zeerr::LocalStatus status;

private:
    std::vector<std::pair<std::string, std::string>> members_{
        {"neighborPropDelayThreshold", "20000000"},
        {"logAnnounceInterval", "1"},
        {"logSyncInterval", "0"},
        {"priority1", "128"},
        {"priority2", "128"},
        {"offsetScaledLogVariance", "65535"},
        {"udsAddress", "\"/var/run/ptp4l_bc\""},
        {"transportSpecific", "\"0x0\""},
        {"syncReceiptTimeout", "0"},
        {"assumeTwoStep", "false"},
        {"pathTraceEnabled", "false"},
        {"followUpInfo", "false"},
        {"networkTransport", "\"UDPv4RAW\""},
        {"delayMechanism", "\"E2E\""},
        {"ptpDstMac", "\"01:00:5e:00:01:81\""},
        {"configFile", "\"ptp4l_bc.conf\""},
        {"interface", "[\"eth0\",\"eth1\"]"}};
};
