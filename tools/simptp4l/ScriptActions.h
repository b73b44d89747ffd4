/// @file
/// The actions of rules and of timed lines.
#pragma once

#include "Script.h"
#include "ScriptWords.h"

namespace simptp4l {

/// Takes an action and its argument up to the end of the line. Throws ScriptError.
/// @param timed the action is to happen at a time and not on a request
Action takeAction(ScriptWords& words, bool timed);

} // namespace simptp4l
