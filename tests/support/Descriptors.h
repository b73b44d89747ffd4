/// @file
#pragma once

#include <string>
#include <vector>

#include <sys/resource.h>

/// How many descriptors this process has open.
int openDescriptors();

/// The descriptor of this process's socket that is bound to the path; -1 when there is none.
int descriptorBoundTo(const std::string& path);

/// Changes how many descriptors this process may open, while this object lives.
class DescriptorLimit {
public:
    /// @param limit cut to what the system allows.
    explicit DescriptorLimit(rlim_t limit);
    ~DescriptorLimit();
    DescriptorLimit(const DescriptorLimit&) = delete;
    DescriptorLimit& operator=(const DescriptorLimit&) = delete;

private:
    rlimit before_{};
};

/// Leaves descriptor 0 free, which the next that is opened gets, while this object lives.
class FreeDescriptorZero {
public:
    FreeDescriptorZero();
    ~FreeDescriptorZero();
    FreeDescriptorZero(const FreeDescriptorZero&) = delete;
    FreeDescriptorZero& operator=(const FreeDescriptorZero&) = delete;

private:
    int before_;
};

/// Holds every descriptor below a number, while this object lives.
class OccupiedDescriptors {
public:
    explicit OccupiedDescriptors(int below);
    ~OccupiedDescriptors();
    OccupiedDescriptors(const OccupiedDescriptors&) = delete;
    OccupiedDescriptors& operator=(const OccupiedDescriptors&) = delete;

    /// Whether this process can open one more.
    bool leaveRoom() const;

private:
    DescriptorLimit limit_;
    std::vector<int> descriptors_;
};
