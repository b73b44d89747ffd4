/// @file
/// A host that runs sessions of the built library in a folder of its own.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "contract/PluginFixture.h"
#include "support/EpochFifo.h"
#include "support/FakePtp4l.h"
#include "support/Processes.h"
#include "support/RecordingHost.h"
#include "support/SimulatedDaemon.h"
#include "support/SyslogCapture.h"
#include "support/TemporaryFolder.h"

/// The simulated daemon that was built beside these tests.
extern const char simulatorProgram[];

/// The metadata of a session that knows nothing.
extern const char defaultMetaData[];

/// A protocol configuration for the daemon's files in the working folder.
/// @param interfaces a JSON array.
std::string sessionConfiguration(const std::string& interfaces = "[]",
                                 const std::string& transportSpecific = "0x0");

/// One session slot. What was begun in it is ended with this object.
class Session {
public:
    Session() = default;
    ~Session();
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    /// These expect success.
    void initialise(const std::string& configuration = sessionConfiguration());
    void start();

    void start(zeerr_Status& status);
    void stop();

    /// Expects that the slot keeps its value, and then empties it.
    void finalise();

    void** slot() { return &slot_; }

private:
    void* slot_ = nullptr;
};

/// The part of a quality call that says what the host was told.
struct QualityReport {
    std::string reason;
    bool usable;
    bool operator==(const QualityReport& other) const {
        return reason == other.reason && usable == other.usable;
    }
};

/// For readable failures.
void PrintTo(const QualityReport& report, std::ostream* out);

/// Of start, and of a grandmaster that appears and goes.
inline const QualityReport waiting{"Waiting for ptp4l status", false};
inline const QualityReport usable{"PTP role has changed.", true};
inline const QualityReport noRole{"PTP role has changed.", false};

class SessionTest : public testing::Test {
protected:
    using Function = RecordingHost::Function;
    using Calls = std::vector<RecordingHost::Call>;

    SessionTest();

    /// Initialises and starts the session with a daemon that follows a script. The first poll comes
    /// 125 ms after the daemon is ready, however slow the machine or its emulation is.
    void begin(const std::string& script, const std::string& interfaces = "[]");

    /// Initialises and starts the session with measurements of the test, poll by poll.
    void beginMeasured(std::vector<FakePtp4l::Measurement> polls);

    /// Waits until a function has been called so often. @return false after the deadline.
    bool waitForCalls(Function function, std::size_t count);

    /// Waits until there is a line in the log, so often. @return false after the deadline.
    bool waitForLog(const std::string& text, int count = 1);

    std::vector<QualityReport> qualities() const;
    std::vector<std::string> metaData() const;

    /// Calls a function once for each zekel_getTime, with its number from 0: between the worker's
    /// look at the daemon and its report to the host.
    void onEachPoll(const std::function<void(int poll)>& action);

    /// Expects that there are so many threads besides those of before the test. Waits for it: the
    /// system lists a thread for a moment after it was joined.
    void expectOwnThreads(int count) const;

    /// The plug-in's own socket.
    static std::string socketPath();

    const TemporaryFolder folder;
    SyslogCapture log;
    RecordingHost host;
    const SimulatedDaemon daemon;
    const FormerThreads threadsBefore;

    // There is one, but for tests that take it away. What a reaction of the host uses must outlive
    // the session.
    std::optional<EpochFifo> fifo;
    std::unique_ptr<FakePtp4l> answers;
    Session session;
};
