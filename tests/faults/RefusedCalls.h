/// @file
/// Functions of the C library that stand in this program and fail on demand, in all threads but the
/// first.
#pragma once

/// Lets socket(2) and open(2) fail while this object lives.
class RefusedCalls {
public:
    /// @param error errno of each call.
    explicit RefusedCalls(int error);
    ~RefusedCalls();
    RefusedCalls(const RefusedCalls&) = delete;
    RefusedCalls& operator=(const RefusedCalls&) = delete;
};
