// A plug-in for the tests of the host. The words in its parameter "script" say what it does; what
// it was told and answered goes, line by line, into the file named by "record".

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <mutex>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include <csignal>
#include <fcntl.h>
#include <nlohmann/json.hpp>
#include <sys/wait.h>
#include <unistd.h>

#include <vantel_bc/zekel.h>
#include <vantel_bc/zekeltr.h>

#include "FakePlugIn.h"

#define EXPORT __attribute__((visibility("default")))

namespace {

using nlohmann::json;

constexpr char schema[] = R"({
   "count": {"dataType": "int", "range": [-5, 100], "default": 7, "hidden": false},
   "wide": {"dataType": "int", "range": [0, 4294967295], "default": 4294967295, "hidden": false},
   "twoStep": {"dataType": "bool", "default": false, "hidden": false},
   "script": {"dataType": "string", "default": "", "hidden": false},
   "record": {"dataType": "string", "default": "", "hidden": false},
   "fifo": {"dataType": "string", "default": "", "hidden": true}
})";

constexpr char metadata[] =
    R"({"gmClockId":"00:1B:21:FF:FE:0A:0B:0C","gmClockClass":6,"gmClockAccuracy":"WITHIN_100NS",)"
    R"("Port1":{"portState":"PTP_SLAVE","interface":"eth0"}})";

/// Whether SIGINT, SIGTERM and SIGPIPE were blocked when the library was loaded.
bool signalsWereBlocked() {
    sigset_t mask;
    pthread_sigmask(SIG_SETMASK, nullptr, &mask);
    return sigismember(&mask, SIGINT) == 1 && sigismember(&mask, SIGTERM) == 1 &&
           sigismember(&mask, SIGPIPE) == 1;
}
const bool blockedAtLoad = signalsWereBlocked();

bool resize(zeerr_Status* status, std::uint32_t size) {
    if (size == 0) {
        std::free(status->json);
        status->json = nullptr;
    } else {
        status->json = static_cast<char*>(std::realloc(status->json, size));
    }
    status->capacity = size;
    return true;
}

/// A status for one call of the host.
struct CallStatus {
    CallStatus() = default;
    CallStatus(const CallStatus&) = delete;
    CallStatus& operator=(const CallStatus&) = delete;
    ~CallStatus() { resize(&status, 0); }

    std::string text() const {
        return std::to_string(status.code) + " " + (status.json ? status.json : "-");
    }

    zeerr_Status status{0, 0, resize, nullptr};
};

void setStatus(zeerr_Status& status, std::int32_t code, const std::string& text) {
    status.code = code;
    const auto size = static_cast<std::uint32_t>(std::uint64_t{text.size()} + 1);
    if (status.resize(&status, size)) {
        std::memcpy(status.json, text.c_str(), size);
    }
}

class Session {
public:
    Session(void** context, const json& config)
        : context_(context),
          record_(config["record"]),
          script_(config["script"]),
          fifo_(config["fifo"]),
          child_(config.value("child", "")) {
        if (config.contains("configFile")) {
            std::ofstream(std::string(config["configFile"])) << config.value("content", "");
        }
    }

    bool does(const std::string& word) const {
        return (" " + script_ + " ").find(" " + word + " ") != std::string::npos;
    }

    void record(const std::string& line) const {
        if (!record_.empty()) {
            std::ofstream(record_, std::ios::app) << line << "\n";
        }
    }

    void play() {
        startChild();
        openFifo();
        playData();
        playMistakes();
        if (does("concurrent")) {
            playConcurrently();
        }
    }

    void stop() {
        if (does("late")) {
            quality({-2.0, -2.0, -1.0}, "late");
        }
        if (fifoDescriptor_ >= 0) {
            readFifo();
            ::close(fifoDescriptor_);
        }
        if (childPid_ > 0) {
            ::kill(childPid_, SIGTERM);
            if (!does("leaves-child")) {
                ::waitpid(childPid_, nullptr, 0);
            }
        }
        record("stop");
    }

private:
    using Values = std::vector<double>;

    void quality(const Values& values, const char* reason) {
        CallStatus call;
        zekel_setTRQuality(context_, values.data(), reason, &call.status);
        record("answer quality " + call.text());
    }

    void pair(std::uint64_t reference, std::uint64_t local) {
        CallStatus call;
        zekel_adjustTime(context_, reference, local, &call.status);
    }

    std::uint64_t hostTime() {
        CallStatus call;
        std::uint64_t time = 0;
        zekel_getTime(context_, &time, &call.status);
        return time;
    }

    void update(const char* text) {
        CallStatus call;
        zekel_updateMetaData(context_, text, &call.status);
    }

    void playData() {
        if (does("quality")) {
            quality({-2.0, -2.0, -1.0}, "Waiting");
            quality({2.5e-08, 1e-06, -1.0}, "role\nchanged \x01\xff.");
            quality({1.0, 2.0, 3.0}, "odd");
        }
        if (does("role")) {
            quality({2.5e-08, 1e-06, -1.0}, "PTP role has changed.");
        }
        if (does("pairs")) {
            pair(1000, 990);
            pair(2000, 2030);
            pair(0xFFFFFFFFFFFFFFFF, 1);
        }
        if (does("timely")) {
            for (std::uint64_t i = 1; i <= 3; ++i) {
                const std::uint64_t time = hostTime();
                pair(time - i, time);
            }
        }
        if (does("zeros")) {
            for (std::uint64_t i = 0; i < 20; ++i) {
                pair(i, i);
            }
        }
        if (does("metadata")) {
            update(metadata);
        }
        if (does("time")) {
            record("time " + std::to_string(hostTime()));
        }
    }

    void playMistakes() {
        if (does("bad-metadata")) {
            update("{\"gmClockId\":");
        }
        if (does("wrong-context")) {
            CallStatus call;
            void* elsewhere = nullptr;
            std::uint64_t time = 0;
            zekel_getTime(&elsewhere, &time, &call.status);
            record("answer time " + call.text());
        }
        if (does("null-data")) {
            CallStatus call;
            zekel_updateMetaData(context_, nullptr, &call.status);
            record("answer metadata " + call.text());
        }
    }

    void playConcurrently() {
        const auto work = [this] {
            for (std::uint64_t i = 0; i < 250; ++i) {
                pair(i + 5, i % 2 == 0 ? i : i + 10);
                update(metadata);
                CallStatus call;
                std::uint64_t time = 0;
                zekel_getTime(context_, &time, &call.status);
            }
        };
        std::thread other(work);
        work();
        other.join();
    }

    /// As ptp4l: with the host's descriptors, and no signal held back.
    void startChild() {
        if (child_.empty()) {
            return;
        }
        childPid_ = ::fork();
        if (childPid_ == 0) {
            sigset_t none;
            sigemptyset(&none);
            pthread_sigmask(SIG_SETMASK, &none, nullptr);
            ::execl("/bin/sh", "sh", "-c", child_.c_str(), nullptr);
            ::_exit(127);
        }
    }

    void openFifo() {
        if (!fifo_.empty()) {
            fifoDescriptor_ = ::open(fifo_.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
            readFifo();
        }
    }

    void readFifo() const {
        unsigned char octets[8];
        while (::read(fifoDescriptor_, octets, sizeof(octets)) == sizeof(octets)) {
            std::ostringstream line;
            line << "fifo";
            for (const unsigned octet : octets) {
                line << ' ' << octet;
            }
            record(line.str());
        }
    }

    void** context_;
    std::string record_;
    std::string script_;
    std::string fifo_;
    std::string child_; ///< a command for the shell; empty when there is none
    pid_t childPid_ = -1;
    int fifoDescriptor_ = -1;
};

Session* sessionIn(void** slot) {
    return static_cast<Session*>(*slot);
}

} // namespace

extern "C" {

EXPORT void zekeltr_getName(char* name) {
    std::memcpy(name, "Fake time referen", ZEKELTR_NAME_SIZE);
}

EXPORT void zekeltr_getParameterValidationData(zekeltr_Reallocate reallocate, char** buffer,
                                               zeerr_Status* status) {
    const char* replacement = std::getenv("FAKE_SCHEMA");
    const char* text = replacement == nullptr ? schema : replacement;
    if (std::strcmp(text, "fails") == 0) {
        setStatus(*status, -52000,
                  R"({"error_constant":"zeoskerr_memoryFull","file":"fake","line":2})");
        return;
    }
    *buffer = reallocate(*buffer, std::strlen(text) + 1);
    std::strcpy(*buffer, text);
}

EXPORT void zekeltr_initialize(void** slot, const char* config, zeerr_Status* status) {
    auto* session = new Session(slot, json::parse(config));
    session->record(std::string("initialise ") + config);
    session->record(std::string("blocked ") + (blockedAtLoad ? "yes" : "no"));
    if (session->does("initialise-fails")) {
        setStatus(*status, -52005,
                  R"({"error_constant":"zeoskerr_invalidParameter","file":"fake","line":7,)"
                  R"("component":"vantel_bc","additionalInfo":"no \u000asuch thing"})");
        delete session;
        return;
    }
    if (session->does("initialise-warns")) {
        setStatus(*status, 3, R"({"error_constant":"careful","file":"fake","line":8})");
    }
    *slot = session;
}

EXPORT void zekeltr_start(void** slot, zeerr_Status* status) {
    auto* session = sessionIn(slot);
    session->record("start");
    if (session->does("start-fails")) {
        setStatus(*status, -52010, "not JSON");
        return;
    }
    session->play();
}

EXPORT void zekeltr_finalize(void** slot) {
    if (*slot != nullptr) {
        sessionIn(slot)->record("finalise");
        delete sessionIn(slot);
    }
}

} // extern "C"

void stopFake(void** slot) {
    sessionIn(slot)->stop();
}
