/// @file
/// linuxptp's own client, which prints every answer.
#pragma once

#include <cstdint>

#include "Client.h"
#include "support/Child.h"

/// One process of pmc for all polls. It gets the next command when all answers to the one before
/// are printed.
class OpenPmc : public Client {
public:
    OpenPmc(const std::string& daemon, std::uint16_t ports);

    void poll() override;
    double cpuSeconds() const override { return child_.cpuSeconds(); }

private:
    Child child_;
    std::uint16_t ports_;
};

/// One process of pmc for each poll, with all six commands. It waits 100 ms for more answers before
/// it ends.
class PmcPerPoll : public Client {
public:
    PmcPerPoll(const std::string& daemon, std::uint16_t ports);

    void poll() override;
    double cpuSeconds() const override { return cpuSeconds_; }

private:
    std::string daemon_;
    std::uint16_t ports_;
    double cpuSeconds_ = 0;
};
