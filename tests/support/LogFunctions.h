/// @file
/// The C library's functions that write to the system log, in front of its own.
#pragma once

/// Takes a line that this process, or a library in it, logs. Called from any thread.
using LogTaker = void (*)(int priority, const char* line);

/// From now on lines go there: before, and with a null pointer, nowhere.
void setLogTaker(LogTaker taker);
