#include "Commands.h"

#include <array>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include <rapidcheck.h>

namespace {

using Phase = Model::Phase;
using What = Event::What;

bool hasSession(const Model& model) {
    return model.phase != Phase::none;
}

/// What may be done at one time, without a choice.
struct Deed {
    const char* name;
    bool (*isAllowed)(const Model& model);
    void (*apply)(Model& model);
    void (*run)(const Model& model, LiveHost& host);
};

void nothing(Model& /*model*/) {}

bool daemonRuns(const Model& model) {
    return model.phase == Phase::running && !model.session.daemonEnds();
}

const std::array deeds{
    Deed{"ask", [](const Model&) { return true; }, nothing,
         [](const Model&, LiveHost& host) { host.ask(); }},
    Deed{"ask in vain", [](const Model&) { return true; }, nothing,
         [](const Model&, LiveHost& host) { host.askInVain(); }},
    Deed{"finalize", [](const Model& model) { return model.phase != Phase::running; },
         [](Model& model) { model.phase = Phase::none; },
         [](const Model&, LiveHost& host) { host.finalise(); }},
    Deed{"start with an error on entry",
         [](const Model& model) { return model.phase == Phase::ready; }, nothing,
         [](const Model&, LiveHost& host) { host.startWithAnErrorOnEntry(); }},
    Deed{"initialize with an error on entry", [](const Model&) { return true; }, nothing,
         [](const Model&, LiveHost& host) { host.initialiseWithAnErrorOnEntry(); }},
    Deed{"write an epoch offset", [](const Model& model) { return model.hasFifo; }, nothing,
         [](const Model&, LiveHost& host) { host.writeOffset(); }},
    Deed{"create the FIFO", [](const Model& model) { return !model.hasFifo; },
         [](Model& model) { model.hasFifo = model.session.fifoWasThere = true; },
         [](const Model&, LiveHost& host) { host.createFifo(); }},
    Deed{"remove the FIFO", [](const Model& model) { return model.hasFifo; },
         [](Model& model) {
             model.hasFifo = false;
             model.session.fifoWasMissing = true;
         },
         [](const Model&, LiveHost& host) { host.removeFifo(); }},
    Deed{"kill the daemon", daemonRuns,
         [](Model& model) {
             model.session.daemonWasKilled = true;
             model.daemonIsFrozen = false;
         },
         [](const Model&, LiveHost& host) { host.killDaemon(); }},
    Deed{"freeze the daemon",
         [](const Model& model) { return daemonRuns(model) && !model.daemonIsFrozen; },
         [](Model& model) { model.daemonIsFrozen = true; },
         [](const Model&, LiveHost& host) { host.freezeDaemon(); }},
    Deed{"thaw the daemon", [](const Model& model) { return model.daemonIsFrozen; },
         [](Model& model) { model.daemonIsFrozen = false; },
         [](const Model&, LiveHost& host) { host.thawDaemon(); }},
    Deed{"remove the library's socket",
         [](const Model& model) { return model.phase == Phase::running && !model.ownPathIsTaken; },
         nothing, [](const Model&, LiveHost& host) { host.removeOwnSocket(); }},
    Deed{"put a folder in the place of the library's socket",
         [](const Model& model) { return model.phase == Phase::running && !model.ownPathIsTaken; },
         [](Model& model) { model.ownPathIsTaken = model.session.ownPathWasTaken = true; },
         [](const Model&, LiveHost& host) { host.takeOwnPath(); }},
    Deed{"take that folder away", [](const Model& model) { return model.ownPathIsTaken; },
         [](Model& model) { model.ownPathIsTaken = false; },
         [](const Model&, LiveHost& host) { host.freeOwnPath(); }},
    Deed{"interrupt the library's threads",
         [](const Model& model) { return model.phase == Phase::running; }, nothing,
         [](const Model&, LiveHost& host) { host.interruptThreads(); }},
    Deed{"await a poll", [](const Model& model) { return model.pollsSucceed(); }, nothing,
         [](const Model&, LiveHost& host) { host.awaitPoll(); }},
    Deed{"await a poll that fails", [](const Model& model) { return model.pollsFail(); }, nothing,
         [](const Model&, LiveHost& host) { host.awaitFailure(); }},
    Deed{"await a time pair", [](const Model& model) { return model.pairsCome(); }, nothing,
         [](const Model&, LiveHost& host) { host.awaitPair(); }},
    Deed{"await the daemon's death", [](const Model& model) { return model.deathIsTold(); },
         nothing,
         [](const Model& model, LiveHost& host) {
             host.awaitDeath(model.answersWell(What::setTRQuality));
         }},
};

class Do : public Command {
public:
    explicit Do(const Model& model) : deed_(*rc::gen::elementOf(allowedIn(model))) {}

    void checkPreconditions(const Model& model) const override { RC_PRE(deed_.isAllowed(model)); }
    void apply(Model& model) const override { deed_.apply(model); }
    void run(const Model& model, LiveHost& host) const override { deed_.run(model, host); }
    void show(std::ostream& out) const override { out << deed_.name; }

private:
    static std::vector<Deed> allowedIn(const Model& model) {
        // Without waits, most sequences would be over before the library has done anything.
        constexpr std::size_t sharesOfWaits = 4;
        std::vector<Deed> allowed;
        for (const Deed& deed : deeds) {
            if (deed.isAllowed(model)) {
                const bool isWait = std::string(deed.name).rfind("await", 0) == 0;
                allowed.insert(allowed.end(), isWait ? sharesOfWaits : 1, deed);
            }
        }
        return allowed;
    }

    Deed deed_;
};

/// A configuration that is no good, and what initialize says of it.
struct BadConfiguration {
    const char* name;
    const char* text;
    Refusal refusal;
    const char* logLine;
};

const std::array badConfigurations{
    BadConfiguration{"null",
                     nullptr,
                     {-52005, R"({"error_constant":"zeoskerr_invalidParameter",)"
                              R"("file":"tPtp4lTimeRef","line":56,"component":"vantel_bc"})"},
                     ""},
    BadConfiguration{"no JSON",
                     "{",
                     {-52005, R"({"error_constant":"jsonErrorsInvalidJSON","file":"CppJson",)"
                              R"("line":34,"component":"vantel_bc"})"},
                     ""},
    BadConfiguration{"without keys",
                     "{}",
                     {-52005, R"({"error_constant":"zeoskerr_invalidParameter",)"
                              R"("file":"tPtp4lTimeRef","line":337,"component":"vantel_bc"})"},
                     "Key neighborPropDelayThreshold not found in protocol config for vantel"},
    BadConfiguration{"a number out of range",
                     R"({"neighborPropDelayThreshold":4294967296})",
                     {-52003,
                      R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
                      R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
                      R"("std_exception_what":"bad numeric conversion: positive overflow"})"},
                     ""},
};

class InitialiseInVain : public Command {
public:
    explicit InitialiseInVain(const Model& /*model*/)
        : bad_(*rc::gen::elementOf(badConfigurations)) {}

    void checkPreconditions(const Model& model) const override { RC_PRE(!hasSession(model)); }
    void run(const Model& /*model*/, LiveHost& host) const override {
        host.initialiseInVain(bad_.text, bad_.refusal, bad_.logLine);
    }
    void show(std::ostream& out) const override { out << "initialize with " << bad_.name; }

private:
    BadConfiguration bad_;
};

class Initialise : public Command {
public:
    explicit Initialise(const Model& /*model*/)
        : interfaces_(
              *rc::gen::element<std::string>(R"(["sim0"])", "[]", R"(["sim0","sim1","sim2"])")) {}

    void checkPreconditions(const Model& model) const override { RC_PRE(!hasSession(model)); }
    void apply(Model& model) const override { model.phase = Phase::ready; }
    void run(const Model& /*model*/, LiveHost& host) const override {
        host.initialise(interfaces_);
    }
    void show(std::ostream& out) const override { out << "initialize with " << interfaces_; }

private:
    std::string interfaces_;
};

/// Each passes by itself.
std::string anyFault() {
    static const std::vector<std::string> selectors{
        "any",           "TIME_STATUS_NP",   "PARENT_DATA_SET",   "DEFAULT_DATA_SET",
        "PORT_DATA_SET", "PORT_DATA_SET_NP", "PORT_PROPERTIES_NP"};
    static const std::vector<std::string> actions{
        "silence",   "delay 0.002", "delay 0.07",   "drop 1",           "duplicate",
        "reorder",   "length +1",   "length -1",    "length 0",         "answers +1",
        "answers 0", "garbage 1",   "late",         "error 2",          "other-port",
        "flood 40",  "rebind",      "garbage 1501", "stop-reading 0.03"};
    return "on " + *rc::gen::elementOf(selectors) + " after " +
           std::to_string(*rc::gen::inRange(0, 6)) + " times " +
           std::to_string(*rc::gen::inRange(1, 3)) + " do " + *rc::gen::elementOf(actions);
}

Script anyScript() {
    using Grandmaster = Script::Grandmaster;
    using Life = Script::Life;
    Script script;
    script.grandmaster = *rc::gen::weightedElement<Grandmaster>(
        {{4, Grandmaster::present}, {1, Grandmaster::absent}, {2, Grandmaster::comesAndGoes}});
    script.life = *rc::gen::weightedElement<Life>(
        {{8, Life::stays}, {1, Life::noProgram}, {1, Life::exitsAtOnce}, {1, Life::exitsLater}});
    script.ignoresSigterm = *rc::gen::weightedElement<bool>({{9, false}, {1, true}});
    script.strictPadding = *rc::gen::weightedElement<bool>({{5, false}, {1, true}});
    script.losesSocket = *rc::gen::weightedElement<bool>({{9, false}, {1, true}});
    const int faults = *rc::gen::weightedElement<int>({{3, 0}, {2, 1}, {1, 2}});
    for (int fault = 0; fault < faults; ++fault) {
        script.faults.push_back(anyFault());
    }
    return script;
}

class Start : public Command {
public:
    explicit Start(const Model& /*model*/)
        : script_(anyScript()), inAnotherThread_(*rc::gen::arbitrary<bool>()) {}

    void checkPreconditions(const Model& model) const override {
        RC_PRE(model.phase == Phase::ready);
    }
    void apply(Model& model) const override {
        if (model.refusalOfStart().code < 0) {
            return;
        }
        model.phase = Phase::running;
        model.daemonIsFrozen = false;
        model.session = {script_, model.hasFifo, !model.hasFifo, false, model.ownPathIsTaken};
        ++model.sessions;
    }
    void run(const Model& model, LiveHost& host) const override {
        host.start(model, script_, inAnotherThread_);
    }
    void show(std::ostream& out) const override {
        out << "start" << (inAnotherThread_ ? " in another thread" : "")
            << (script_.life == Script::Life::noProgram ? ", without a program" : "") << ", with\n"
            << script_.text();
    }

private:
    Script script_;
    bool inAnotherThread_;
};

class StartWithoutThread : public Command {
public:
    explicit StartWithoutThread(const Model& /*model*/) : allowed_(*rc::gen::inRange(0, 2)) {}

    void checkPreconditions(const Model& model) const override {
        RC_PRE(model.phase == Phase::ready && model.refusalOfStart().code == 0);
    }
    void run(const Model& model, LiveHost& host) const override {
        host.startWithoutThread(model, allowed_);
    }
    void show(std::ostream& out) const override {
        out << "start with room for threads: " << allowed_;
    }

private:
    int allowed_;
};

class Stop : public Command {
public:
    explicit Stop(const Model& /*model*/) : inAnotherThread_(*rc::gen::arbitrary<bool>()) {}

    void checkPreconditions(const Model& model) const override { RC_PRE(hasSession(model)); }
    void apply(Model& model) const override {
        model.phase = model.phase == Phase::running ? Phase::stopped : model.phase;
        model.daemonIsFrozen = false;
    }
    void run(const Model& model, LiveHost& host) const override {
        host.stop(model, inAnotherThread_);
    }
    void show(std::ostream& out) const override {
        out << "stop" << (inAnotherThread_ ? " in another thread" : "");
    }

private:
    bool inAnotherThread_;
};

class HostAnswers : public Command {
public:
    explicit HostAnswers(const Model& /*model*/)
        : function_(*rc::gen::element(What::getTime, What::adjustTime, What::setTRQuality,
                                      What::updateMetaData)),
          answer_(*rc::gen::weightedOneOf<Answer>(
              {{1, rc::gen::just(Answer::well)},
               {1, rc::gen::element(Answer::warning, Answer::slowly, Answer::questions)},
               {1,
                rc::gen::element(Answer::error, Answer::errorWithText, Answer::stopping,
                                 Answer::exception, Answer::otherException, Answer::noMemory)}})) {}

    void apply(Model& model) const override {
        model.answers.at(static_cast<std::size_t>(function_)) = answer_;
    }
    void run(const Model& /*model*/, LiveHost& host) const override {
        host.answer(function_, answer_);
    }
    void show(std::ostream& out) const override {
        static constexpr std::array names{"getTime", "adjustTime", "setTRQuality",
                                          "updateMetaData"};
        out << "host answers " << names.at(static_cast<std::size_t>(function_)) << ' '
            << nameOf(answer_);
    }

private:
    What function_;
    Answer answer_;
};

} // namespace

// Most sequences are to come to a session that runs, and stay in it for a while.
rc::Gen<std::shared_ptr<const Command>> anyCommand(const Model& model) {
    using rc::state::gen::execOneOfWithArgs;
    switch (model.phase) {
    case Phase::none:
        return execOneOfWithArgs<Initialise, Initialise, InitialiseInVain, Do>()(model);
    case Phase::ready:
        return execOneOfWithArgs<Start, Start, Start, Start, StartWithoutThread, Stop, HostAnswers,
                                 Do>()(model);
    case Phase::running:
        return execOneOfWithArgs<Stop, HostAnswers, Do, Do, Do, Do>()(model);
    case Phase::stopped:
        return execOneOfWithArgs<Stop, HostAnswers, Do, Do>()(model);
    }
    return execOneOfWithArgs<Do>()(model);
}
