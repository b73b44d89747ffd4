// One whole poll of ptp4l, six requests and all their answers, through the management client,
// beside a bare client that makes the same sendto, select and recvfrom calls and nothing else. Both
// run in turns against the same in-process daemon. What counts is the CPU time of the client's
// thread.

#include <algorithm>
#include <array>
#include <ctime>
#include <stdexcept>
#include <vector>

#include <benchmark/benchmark.h>
#include <sched.h>
#include <sys/select.h>
#include <sys/socket.h>

#include "support/StubDaemon.h"
#include "support/TemporaryFolder.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"
#include "tUdsMsgInterface.h"

using namespace zekelVantel;

namespace {

constexpr char daemonPath[] = "daemon";
constexpr std::array<std::uint16_t, 6> managementIds{0xC000, 0x2002, 0x2000,
                                                     0x2004, 0xC002, 0xC004};

void check(bool holds) {
    if (!holds) {
        throw std::runtime_error("the poll failed");
    }
}

double threadCpuSeconds() {
    timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

class ManagementClient {
public:
    ManagementClient() {
        zeerr::LocalStatus status;
        interface_.open("client", status);
        check(zeerr::isClean(status));
    }

    void poll() {
        zeerr::LocalStatus status;
        tPtp4lTimeStatusMgmtTlv timeStatus;
        node_.getSingle(interface_, remote_, timeStatus, status);
        tPtp4lParentDataSetMgmtTlv parent;
        node_.getSingle(interface_, remote_, parent, status);
        tPtp4lDefaultDataSetMgmtTlv defaults;
        node_.getSingle(interface_, remote_, defaults, status);
        std::vector<tPortDataSet> dataSets;
        std::vector<tPortDataSetNp> dataSetsNp;
        std::vector<tPortProperties> properties;
        const std::uint32_t ports = defaults.numberPorts();
        node_.getFromPorts<tPtp4lPortDataSetMgmtTlv>(interface_, remote_, ports, dataSets, status);
        node_.getFromPorts<tPtp4lPortDataSetNpMgmtTlv>(interface_, remote_, ports, dataSetsNp,
                                                       status);
        node_.getFromPorts<tPtp4lPortPropertiesMgmtTlv>(interface_, remote_, ports, properties,
                                                        status);
        check(zeerr::isClean(status));
        benchmark::DoNotOptimize(properties.data());
    }

private:
    tUdsMsgInterface interface_;
    tUdsMsgAddress remote_{daemonPath};
    tPtpMgmtNode node_{tPtpPortIdentity(tPtpClockIdentity(), 1), 0};
};

class BareClient {
public:
    BareClient(const StubDaemon& daemon, std::size_t ports) {
        for (const std::uint16_t id : managementIds) {
            // A request is as long as a fixed-length answer; that for names has room for a pad.
            Octets octets = daemon.answersTo(id).front();
            octets.resize(id == 0xC004 ? 68 : octets.size());
            const bool perPort = id == 0x2004 || id == 0xC002 || id == 0xC004;
            requests_.push_back({octets, perPort ? ports : 1});
        }
    }

    void poll() const {
        for (const Request& request : requests_) {
            check(sendto(socket_.descriptor(), request.octets.data(), request.octets.size(), 0,
                         remote_.sendAddress(),
                         remote_.length()) == static_cast<ssize_t>(request.octets.size()));
            for (std::size_t answer = 0; answer < request.answers; ++answer) {
                receive();
            }
        }
    }

private:
    struct Request {
        Octets octets;
        std::size_t answers;
    };

    void receive() const {
        fd_set readable;
        FD_ZERO(&readable);
        FD_SET(socket_.descriptor(), &readable);
        timeval timeout{2, 0};
        check(select(socket_.descriptor() + 1, &readable, nullptr, nullptr, &timeout) == 1);
        std::uint8_t octets[1500];
        sockaddr_un source{};
        socklen_t length = sizeof(source);
        check(recvfrom(socket_.descriptor(), octets, sizeof(octets), 0,
                       reinterpret_cast<sockaddr*>(&source), &length) > 0);
        benchmark::DoNotOptimize(octets);
    }

    DatagramSocket socket_{"bare"};
    tUdsMsgAddress remote_{daemonPath};
    std::vector<Request> requests_;
};

template <typename Client>
double cpuSecondsOf(Client& client, int polls) {
    const double before = threadCpuSeconds();
    for (int poll = 0; poll < polls; ++poll) {
        client.poll();
    }
    return (threadCpuSeconds() - before) / polls;
}

double median(std::vector<double> values) {
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    return *middle;
}

/// One iteration is one round: a batch of polls of each client, in alternating order.
void wholePoll(benchmark::State& state) {
    const TemporaryFolder folder;
    const auto ports = static_cast<std::uint16_t>(state.range(0));
    const StubDaemon daemon(daemonPath, ports);
    ManagementClient client;
    BareClient bare(daemon, ports);
    const int polls = 4000 / (ports + 4);
    cpuSecondsOf(client, polls / 4);
    cpuSecondsOf(bare, polls / 4);
    std::vector<double> own;
    std::vector<double> other;
    std::vector<double> ratios;
    for ([[maybe_unused]] auto round : state) {
        const bool bareFirst = own.size() % 2 == 1;
        const double first = bareFirst ? cpuSecondsOf(bare, polls) : cpuSecondsOf(client, polls);
        const double second = bareFirst ? cpuSecondsOf(client, polls) : cpuSecondsOf(bare, polls);
        own.push_back(bareFirst ? second : first);
        other.push_back(bareFirst ? first : second);
        ratios.push_back(own.back() / other.back());
        state.SetIterationTime(own.back());
    }
    state.counters["client_us"] = median(own) * 1e6;
    state.counters["bare_us"] = median(other) * 1e6;
    state.counters["ratio"] = median(ratios);
}

BENCHMARK(wholePoll)
    ->ArgName("ports")
    ->Arg(1)
    ->Arg(8)
    ->Arg(64)
    ->Iterations(25)
    ->UseManualTime()
    ->Unit(benchmark::kMicrosecond);

} // namespace

// Client and daemon share one processor: then neither waits for the other to be woken elsewhere,
// and the figures are the work alone.
int main(int argc, char** argv) {
    cpu_set_t one;
    CPU_ZERO(&one);
    CPU_SET(0, &one);
    sched_setaffinity(0, sizeof(one), &one);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
