/// @file
/// What a check says.
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace vantelhost {

enum class Verdict {
    ok,
    warn, ///< works, but not as one would wish, or not for sure
    fail, ///< would not work
    skip  ///< cannot be told
};

struct Finding {
    Verdict verdict;
    std::string found; ///< for people; may hold any characters
    std::string mend;  ///< what to do about it; may be empty
};

inline Finding good(std::string found) {
    return {Verdict::ok, std::move(found), {}};
}

inline Finding doubtful(std::string found, std::string mend) {
    return {Verdict::warn, std::move(found), std::move(mend)};
}

inline Finding bad(std::string found, std::string mend) {
    return {Verdict::fail, std::move(found), std::move(mend)};
}

inline Finding skipped(std::string why) {
    return {Verdict::skip, std::move(why), {}};
}

struct CheckResult {
    std::string check; ///< its name
    Finding finding;
};

using CheckResults = std::vector<CheckResult>;

} // namespace vantelhost
