/// @file
#pragma once

#include <vector>

#include "Client.h"

/// A client, and how many polls a round of it has.
struct Contestant {
    Client& client;
    int polls;
};

/// What one poll of a client took, in seconds, round by round.
struct Costs {
    std::vector<double> cpu;
    std::vector<double> wall;
};

/// Lets clients poll in turns, after one round that does not count. Each round begins with another
/// one.
/// @return the costs in the order of the contestants.
std::vector<Costs> race(const std::vector<Contestant>& contestants, int rounds);

/// Keeps this process, and those that it starts from now on, on one processor: then nobody waits to
/// be woken on another one, and the figures are the work alone. Throws when that is not possible.
void useOneProcessor();
