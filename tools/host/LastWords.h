/// @file
#pragma once

#include <deque>
#include <string>

namespace vantelhost {

/// What ptp4l writes to its standard error, which it inherits from this process: its complaints
/// before it opens its log. The last lines are kept.
class LastWords {
public:
    /// @param passOn a descriptor to which all is passed on; -1: nowhere.
    explicit LastWords(int passOn) : passOn_(passOn) {}
    ~LastWords();
    LastWords(const LastWords&) = delete;
    LastWords& operator=(const LastWords&) = delete;

    /// While it lives, this process's standard error goes there. Only one in the life of each
    /// LastWords. Where there is no standard error it does nothing.
    class Redirection {
    public:
        /// Throws std::system_error.
        explicit Redirection(LastWords& words);
        ~Redirection();
        Redirection(const Redirection&) = delete;
        Redirection& operator=(const Redirection&) = delete;

    private:
        int saved_;
    };

    /// Readable when there is something to take; -1 when nothing can come.
    int descriptor() const { return reading_; }

    /// Takes what has come. Never waits.
    void take();

    bool arePassedOn() const { return passOn_ >= 0; }

    /// At most three, oldest first.
    std::deque<std::string> lines() const;

private:
    void keep(const std::string& text);

    const int passOn_;
    int reading_ = -1;
    std::string kept_; ///< the end of all that came
};

} // namespace vantelhost
