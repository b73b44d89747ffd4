#include "Daemons.h"

#include <filesystem>
#include <stdexcept>

#include "StubDaemon.h"
#include "support/Child.h"
#include "support/Processes.h"
#include "support/TemporaryFolder.h"
#include "system/BoundaryClock.h"

namespace {

class Stub : public Daemon {
public:
    explicit Stub(std::uint16_t ports) : stub_("stub", ports) {}
    std::string socket() const override { return "stub"; }

private:
    StubDaemon stub_;
};

class Simulator : public Daemon {
public:
    explicit Simulator(std::uint16_t ports) : child_(start(ports)) {
        if (!waitUntil([this] { return std::filesystem::exists(socket()); })) {
            throw std::runtime_error("the simulated daemon does not start");
        }
    }
    std::string socket() const final { return "simulator.sock"; }

private:
    static std::vector<std::string> start(std::uint16_t ports) {
        writeFile("simulator.conf", "[global]\nuds_address simulator.sock\n");
        writeFile("simulator.conf.sim", "ports " + std::to_string(ports) + '\n');
        return {VANTEL_SIMPTP4L, "-f", "simulator.conf"};
    }

    Child child_;
};

class RealDaemon : public Daemon {
public:
    explicit RealDaemon(std::uint16_t ports) {
        if (clock_.ports() != ports) {
            throw std::runtime_error("the scene has another number of ports");
        }
    }
    std::string socket() const override { return clock_.socket(); }

private:
    BoundaryClock clock_;
};

} // namespace

std::unique_ptr<Daemon> Daemon::make(const std::string& kind, std::uint16_t ports) {
    if (kind == "stub") {
        return std::make_unique<Stub>(ports);
    }
    if (kind == "simptp4l") {
        return std::make_unique<Simulator>(ports);
    }
    return std::make_unique<RealDaemon>(ports);
}
