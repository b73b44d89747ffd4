// Sessions of the plug-in with random faults, for as long as one likes. See docs/testing.md.

#include <csignal>
#include <exception>
#include <iostream>

#include <CLI/CLI.hpp>

#include "Plan.h"
#include "Soak.h"

namespace {

volatile int interrupted = 0;

void interrupt(int /*signal*/) {
    interrupted = 1;
}

void printPlan(const Soak::Options& options) {
    Plan plan(options.seed, options.seconds);
    SessionPlan session;
    for (int number = 1; plan.next(session); ++number) {
        std::cout << "# session " << number << '\n' << textOf(session) << '\n';
    }
}

} // namespace

int main(int argc, char** argv) {
    Soak::Options options;
    options.plugIn = VANTEL_BC_LIBRARY;
    options.daemon = VANTEL_SIMPTP4L;
    bool planOnly = false;

    CLI::App app("Runs sessions of the plug-in with random faults.");
    app.add_option("--seconds", options.seconds, "how long")->check(CLI::Range(10, 1000000));
    app.add_option("--seed", options.seed, "the same seed and time: the same faults");
    app.add_option("--skip-memory", options.skipMemory, "do not judge memory, for this reason");
    app.add_flag("--plan", planOnly, "only print what would go wrong");
    CLI11_PARSE(app, argc, argv);
    try {
        if (planOnly) {
            printPlan(options);
            return 0;
        }
        std::signal(SIGINT, interrupt);
        std::signal(SIGTERM, interrupt);
        return Soak(options, interrupted).run() ? 0 : 1;
    } catch (const std::exception& error) {
        std::cerr << "soak: " << error.what() << '\n';
        return 2;
    }
}
