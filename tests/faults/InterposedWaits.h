/// @file
/// Where the plug-in waits for its daemon: functions of the C library that stand in this program.
#pragma once

/// How often select(2) has been called by this process so far: the plug-in's waits for an answer.
int answersAwaited();

/// How often sendto(2) has been called so far with the plug-in's own socket.
int requestsSent();
