// The measurements that scripts/bench.sh runs, in one program: it is optimised with the whole
// plug-in.

#include "Measurements.h"
#include "Program.h"

int main(int argc, char** argv) {
    Program program;
    addPollCost(program);
    addPollLine(program);
    addPollInstructions(program);
    addInitializeCost(program);
    addSessionTimes(program);
    addHostFootprint(program);
    addDelay(program);
    addReportCost(program);
    return program.run(argc, argv);
}
