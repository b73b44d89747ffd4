/// @file
#pragma once

#include <memory>

#include <rapidcheck/state.h>

#include "LiveHost.h"
#include "Model.h"

/// One thing that a host, a daemon or the machine does.
using Command = rc::state::Command<Model, LiveHost>;

/// Anything that may happen in a state.
rc::Gen<std::shared_ptr<const Command>> anyCommand(const Model& model);
