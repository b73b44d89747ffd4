#include "FaultWindow.h"

#include <fmt/format.h>

namespace {

using namespace std::string_literals;

// Half of the requests are hit, so that polls fail at every one of their exchanges.
constexpr std::array selectors{"any",
                               "any",
                               "TIME_STATUS_NP",
                               "PARENT_DATA_SET",
                               "DEFAULT_DATA_SET",
                               "PORT_DATA_SET",
                               "PORT_DATA_SET_NP",
                               "PORT_PROPERTIES_NP"};
constexpr std::array lengths{"+1", "-1", "+100", "-60", "0", "1", "1500", "1501", "9000"};
constexpr std::array answers{"+1", "+2", "+20", "-1", "0"};
constexpr std::array garbage{"0", "1", "48", "54", "74", "86", "104", "1500", "1501", "5000"};

} // namespace

struct FaultWindow::Kind {
    const char* name;
    void (*add)(FaultWindow&);
};

using W = FaultWindow;

const std::array<FaultWindow::Kind, FaultWindow::kinds> FaultWindow::table{{
    {"silence", [](W& w) { w.onRequests("silence"); }},
    {"delay", [](W& w) { w.delay(); }},
    {"drop", [](W& w) { w.onRequests("drop "s + (w.dice_.below(2) == 0 ? "all" : "1")); }},
    {"duplicate", [](W& w) { w.onRequests("duplicate"); }},
    {"reorder", [](W& w) { w.onRequests("reorder"); }},
    {"length", [](W& w) { w.onRequests("length "s + w.dice_.pick(lengths)); }},
    {"answers", [](W& w) { w.onRequests("answers "s + w.dice_.pick(answers)); }},
    {"garbage", [](W& w) { w.onRequests("garbage "s + w.dice_.pick(garbage)); }},
    {"error", [](W& w) { w.onRequests("error " + std::to_string(1 + w.dice_.below(7))); }},
    {"other-port", [](W& w) { w.onRequests("other-port"); }},
    {"flood", [](W& w) { w.onRequests("flood " + std::to_string(2 + w.dice_.below(300))); }},
    {"late", [](W& w) { w.onRequests("late"); }},
    {"gm off",
     [](W& w) {
         w.at(w.from_, "gm off");
         w.at(w.until_, "gm on");
     }},
    {"clock-step", [](W& w) { w.clockStep(); }},
    {"stop-reading",
     [](W& w) { w.at(w.from_, fmt::format("stop-reading {:.2f}", w.until_ - w.from_)); }},
    {"unbind",
     [](W& w) {
         w.at(w.from_, "unbind");
         w.at(w.until_, "rebind");
     }},
    {"rebind", [](W& w) { w.at(w.from_, "rebind"); }},
    {"SIGSTOP", [](W& w) { w.between(Deed::What::freezeDaemon, Deed::What::thawDaemon); }},
    {"host error", [](W& w) { w.host(HostFault::error); }},
    {"host stopping", [](W& w) { w.host(HostFault::stopping); }},
    {"host warning", [](W& w) { w.host(HostFault::warning); }},
    {"host throws",
     [](W& w) {
         w.host(w.dice_.below(2) == 0 ? HostFault::exception : HostFault::foreignException);
     }},
    {"host blocks", [](W& w) { w.host(HostFault::block); }},
    {"FIFO gone", [](W& w) { w.between(Deed::What::removeFifo, Deed::What::createFifo); }},
    {"FIFO full",
     [](W& w) {
         w.plan_.deeds.push_back({w.from_, Deed::What::fillFifo});
     }},
    {"FIFO torn", [](W& w) { w.between(Deed::What::tearFifo, Deed::What::mendFifo); }},
}};

FaultWindow::FaultWindow(SessionPlan& plan, Dice& dice, double from, double until)
    : plan_(plan), dice_(dice), from_(from), until_(until) {}

void FaultWindow::add(std::size_t kind) {
    table.at(kind).add(*this);
    plan_.faults.push_back({table.at(kind).name, until_});
}

void FaultWindow::onRequests(const std::string& action) {
    plan_.script += fmt::format("on {} from {:.2f} until {:.2f} do {}\n", dice_.pick(selectors),
                                from_, until_, action);
}

void FaultWindow::at(double time, const std::string& action) {
    plan_.script += fmt::format("at {:.2f} do {}\n", time, action);
}

void FaultWindow::between(Deed::What begin, Deed::What end) {
    plan_.deeds.push_back({from_, begin});
    plan_.deeds.push_back({until_, end});
}

void FaultWindow::host(HostFault fault) {
    plan_.deeds.push_back({from_, Deed::What::misbehave, fault});
    plan_.deeds.push_back({until_, Deed::What::misbehave, HostFault::none});
}

// Below the limit of 2 s a poll only takes longer; not so long that it outlives the session.
void FaultWindow::delay() {
    onRequests(fmt::format("delay {:.2f}",
                           dice_.below(2) == 0 ? dice_.between(0.01, 0.3) : dice_.between(2.1, 3)));
}

void FaultWindow::clockStep() {
    at(from_, fmt::format("clock-step {:.2f}", dice_.between(0, 20) - 10));
}
