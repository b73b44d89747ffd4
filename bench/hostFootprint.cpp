// What a host that has nothing but the plug-in pays for it: time to load, and memory. A fresh
// process each time; once a host in C++, which has its libraries already, once one in C.

#include <sstream>
#include <stdexcept>

#include "Measurements.h"
#include "Program.h"
#include "Row.h"
#include "Session.h"
#include "Statistics.h"
#include "support/Child.h"
#include "support/TemporaryFolder.h"

namespace {

struct Footprints {
    std::vector<double> loadNanoseconds;
    std::vector<double> residentKib;
    std::vector<double> writtenKib;

    void add(const std::string& program, const std::string& configuration) {
        Child child({program, VANTEL_BC_TEST_LIBRARY, configuration});
        child.wait();
        std::istringstream line(child.output());
        double load = 0;
        double resident = 0;
        double written = 0;
        if (!(line >> load >> resident >> written)) {
            throw std::runtime_error("no session in " + program + ": " + child.errors());
        }
        loadNanoseconds.push_back(load);
        residentKib.push_back(resident);
        writtenKib.push_back(written);
    }

    void print(const std::string& host) const {
        ::print({"library load, " + host, "", median(loadNanoseconds) * 1e-3, "us"});
        ::print({"memory added besides thread stacks, " + host + ": resident", "",
                 median(residentKib), "KiB", std::nullopt, 512});
        ::print({"memory added besides thread stacks, " + host + ": private, written to", "",
                 median(writtenKib), "KiB"});
    }
};

void measure(int rounds) {
    const TemporaryFolder folder;
    const EpochFifo fifo;
    const std::string configuration = useSimulator("sync-interval 0.125\n");
    Footprints bare;
    Footprints withCxx;
    for (int round = 0; round < rounds; ++round) {
        bare.add(VANTEL_BARE_HOST, configuration);
        withCxx.add(VANTEL_BARE_CXX_HOST, configuration);
    }
    withCxx.print("host in C++");
    bare.print("host in C");
}

} // namespace

void addHostFootprint(Program& program) {
    const auto rounds = std::make_shared<int>(9);
    Options options = program.add(
        "host_footprint", "Prints what a host pays for the plug-in in load time and memory.",
        [rounds] { measure(*rounds); });
    options.add("--rounds", *rounds, "fresh processes");
}
