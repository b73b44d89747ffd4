// Random sequences of what hosts, daemons and machines do, against what the documents promise.

#include <iostream>
#include <utility>

#include <gtest/gtest.h>
#include <rapidcheck.h>
#include <rapidcheck/state.h>

#include "Commands.h"
#include "LiveHost.h"
#include "Model.h"
#include "OwnProcess.h"

namespace {

/// Of rapidcheck's sizes, from 0 to 100: sequences of up to 60 commands.
constexpr double lengthOfSequences = 0.6;

/// @param hasFailed whether one has: to find a short one takes time, so the first one is told at
/// once.
void anySequenceHolds(bool& hasFailed) {
    const auto commands =
        *rc::gen::scale(lengthOfSequences, rc::state::gen::commands(Model(), &anyCommand));
    Model last;
    rc::state::applyAll(commands, last);
    RC_CLASSIFY(last.sessions > 0, "with a session that ran");
    const std::string failure = failureInOwnProcess([&] {
        LiveHost host;
        rc::state::runAll(commands, Model(), host);
        host.end(last);
    });
    if (!failure.empty()) {
        if (!std::exchange(hasFailed, true)) {
            std::cerr << "Broken, and about to be made shorter:\n";
            rc::state::showValue(commands, std::cerr);
            std::cerr << failure << std::endl;
        }
        RC_FAIL(failure);
    }
}

TEST(SessionModelTest, HoldsInEveryOrderOfCallsAndFaults) {
    bool hasFailed = false;
    const bool holds =
        rc::check("what hosts are promised", [&hasFailed] { anySequenceHolds(hasFailed); });
    EXPECT_TRUE(holds) << "the sequence, and how to repeat it, are above";
}

} // namespace
