/// @file
#pragma once

/// Whether this program was built to run in an emulator: one system call of it may be several, and
/// the emulator is part of the process. What cannot hold there is skipped with its reason.
constexpr bool runsEmulated() {
#ifdef VANTEL_EMULATED
    return true;
#else
    return false;
#endif
}
