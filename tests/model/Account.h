/// @file
/// What the documents promise of one thread's calls, held against what it did: Promise.h.
#pragma once

#include <array>
#include <vector>

#include "Model.h"
#include "WatchedHost.h"

/// Of start, in the host's thread.
/// @param answers of the host, by function
void expectStartsCalls(const Events& events, const std::array<Answer, 4>& answers);

/// Of the threads of a session that has ended: at most a worker and a watchdog.
void expectThreadsCalls(const std::vector<Events>& threads, const Session& session);
