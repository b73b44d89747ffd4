/// @file
/// The words of one script line, and the values they stand for.
#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

namespace simptp4l {

/// What is wrong with a line; the text is meant for the script's writer.
class ScriptError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// Takes the words of a line one after another. Every `take` throws ScriptError when there is no
/// word, or when the word is not what is asked for; `what` names it in the message.
class ScriptWords {
public:
    /// Words are separated by blanks; one that begins with "#" ends the line.
    explicit ScriptWords(const std::string& line);

    bool atEnd() const { return next_ == words_.size(); }

    /// Takes the next word if it is this one.
    bool accept(const std::string& word);

    std::string take(const std::string& what);
    std::int64_t takeInteger(const std::string& what, std::int64_t min, std::int64_t max);

    /// 64 bits as 16 hexadecimal digits.
    std::uint64_t takeIdentity(const std::string& what);

    /// Any integer that fits into so many octets, signed or unsigned.
    std::uint64_t takeRaw(const std::string& what, unsigned width);

    /// A decimal fraction.
    double takeNumber(const std::string& what);

    /// Seconds, not negative; the result is nanoseconds.
    std::int64_t takeDuration(const std::string& what);

    /// Seconds of either sign; the result is nanoseconds.
    std::int64_t takeSeconds(const std::string& what);

    /// Whether the next word begins with a sign.
    bool nextHasSign() const;

    /// Throws when words are left over.
    void expectEnd() const;

private:
    std::vector<std::string> words_;
    std::size_t next_ = 0;
};

} // namespace simptp4l
