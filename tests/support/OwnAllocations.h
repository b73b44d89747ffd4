/// @file
#pragma once

/// What a thread allocates while such an object lives in it is the test's own, also below calls of
/// the plug-in: for programs in which the plug-in gets no memory.
class OwnAllocations {
public:
    OwnAllocations() { ++depth(); }
    ~OwnAllocations() { --depth(); }
    OwnAllocations(const OwnAllocations&) = delete;
    OwnAllocations& operator=(const OwnAllocations&) = delete;

    /// Whether there is one in this thread.
    static bool areMade() { return depth() > 0; }

private:
    static int& depth() {
        thread_local int depth = 0;
        return depth;
    }
};
