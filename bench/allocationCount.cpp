// How often a poll takes memory from the heap. This program's malloc counts, thread by thread.

#include <algorithm>
#include <array>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <stdexcept>
#include <vector>

#include "Host.h"
#include "Program.h"
#include "Row.h"
#include "Session.h"
#include "StubDaemon.h"
#include "support/TemporaryFolder.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtNode.h"
#include "tUdsMsgInterface.h"

namespace {

thread_local int allocations = 0;

} // namespace

extern "C" {

void* __libc_malloc(std::size_t size);
void* __libc_calloc(std::size_t count, std::size_t size);
void* __libc_realloc(void* memory, std::size_t size);

[[gnu::visibility("default")]] void* malloc(std::size_t size) {
    ++allocations;
    return __libc_malloc(size);
}

[[gnu::visibility("default")]] void* calloc(std::size_t count, std::size_t size) {
    ++allocations;
    return __libc_calloc(count, size);
}

[[gnu::visibility("default")]] void* realloc(void* memory, std::size_t size) {
    ++allocations;
    return __libc_realloc(memory, size);
}

} // extern "C"

namespace {

using namespace zekelVantel;

/// Counts on the worker's thread, from one poll to the next: the whole pass.
class CountingHost : public Host {
public:
    void polled() override {
        {
            const std::lock_guard<std::mutex> lock(mutex_);
            if (passes_ < counts_.size()) {
                counts_[passes_++] = allocations - before_;
            }
        }
        changed_.notify_all();
        before_ = allocations;
    }

    /// The most that one pass took, of the last half.
    int worstOfAll() {
        std::unique_lock<std::mutex> lock(mutex_);
        if (!changed_.wait_for(lock, std::chrono::seconds(60),
                               [&] { return passes_ == counts_.size(); })) {
            throw std::runtime_error("the polls do not come");
        }
        return *std::max_element(counts_.begin() + 8, counts_.end());
    }

private:
    std::mutex mutex_;
    std::condition_variable changed_;
    std::array<int, 16> counts_{};
    std::size_t passes_ = 0;
    int before_ = 0; ///< of the worker
};

template <typename Tlv>
int countOfSingleExchange() {
    const TemporaryFolder folder;
    const StubDaemon daemon("stub", 1);
    zeerr::LocalStatus status;
    tUdsMsgInterface interface;
    interface.open("client", status);
    const tUdsMsgAddress remote("stub");
    tPtpMgmtNode node(tPtpPortIdentity(tPtpClockIdentity(), 1), 0);
    Tlv tlv;
    const int before = allocations;
    node.getSingle(interface, remote, tlv, status);
    if (!zeerr::isClean(status)) {
        throw std::runtime_error("the exchange failed");
    }
    return allocations - before;
}

int countOfPass(std::uint16_t ports) {
    CountingHost host;
    Session session(useSimulator("ports " + std::to_string(ports) + "\nsync-interval 0.0625\n"));
    session.start();
    const int count = host.worstOfAll();
    session.stop();
    return count;
}

void measure(const std::vector<std::uint16_t>& ports) {
    const TemporaryFolder folder;
    const int single = std::max({countOfSingleExchange<tPtp4lTimeStatusMgmtTlv>(),
                                 countOfSingleExchange<tPtp4lParentDataSetMgmtTlv>(),
                                 countOfSingleExchange<tPtp4lDefaultDataSetMgmtTlv>()});
    print({"allocations in a single-answer exchange", "", double(single), "", std::nullopt, 0});
    for (const std::uint16_t count : ports) {
        print({"allocations in a whole poll that reports a pair", std::to_string(count),
               double(countOfPass(count)), "", std::nullopt, 10.0 + 4 * count});
    }
}

} // namespace

int main(int argc, char** argv) {
    std::vector<std::uint16_t> ports = {1, 2, 8, 32, 64};
    Program program;
    Options options =
        program.add("allocation_count", "Prints how often a poll takes memory from the heap.",
                    [&] { measure(ports); });
    options.add("--ports", ports, "numbers of ports");
    return program.run(argc, argv);
}
