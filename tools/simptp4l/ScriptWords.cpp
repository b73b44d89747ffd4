#include "ScriptWords.h"

#include <charconv>
#include <cmath>
#include <optional>
#include <sstream>
#include <string_view>

namespace simptp4l {
namespace {

/// The longest time a script can name, in seconds.
constexpr double longest = 1e6;

std::optional<std::uint64_t> readUnsigned(std::string_view text) {
    const bool isHex = text.substr(0, 2) == "0x" || text.substr(0, 2) == "0X";
    if (isHex) {
        text.remove_prefix(2);
    }
    std::uint64_t value = 0;
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, value, isHex ? 16 : 10);
    if (result.ec != std::errc() || result.ptr != end) {
        return std::nullopt;
    }
    return value;
}

/// A number with an optional sign, as magnitude and sign.
struct Signed {
    std::uint64_t magnitude = 0;
    bool negative = false;
};

std::optional<Signed> readSigned(std::string_view text) {
    Signed number;
    if (!text.empty() && (text[0] == '-' || text[0] == '+')) {
        number.negative = text[0] == '-';
        text.remove_prefix(1);
    }
    const std::optional<std::uint64_t> magnitude = readUnsigned(text);
    if (!magnitude) {
        return std::nullopt;
    }
    number.magnitude = *magnitude;
    return number;
}

[[noreturn]] void refuse(const std::string& what, const std::string& word) {
    throw ScriptError("bad " + what + ": " + word);
}

} // namespace

ScriptWords::ScriptWords(const std::string& line) {
    std::istringstream stream(line);
    for (std::string word; stream >> word && word[0] != '#';) {
        words_.push_back(word);
    }
}

bool ScriptWords::accept(const std::string& word) {
    const bool matches = !atEnd() && words_[next_] == word;
    if (matches) {
        ++next_;
    }
    return matches;
}

std::string ScriptWords::take(const std::string& what) {
    if (atEnd()) {
        throw ScriptError("missing " + what);
    }
    return words_[next_++];
}

std::int64_t ScriptWords::takeInteger(const std::string& what, std::int64_t min, std::int64_t max) {
    const std::string word = take(what);
    const std::optional<Signed> number = readSigned(word);
    const auto limit = static_cast<std::uint64_t>(INT64_MAX);
    if (!number || number->magnitude > limit) {
        refuse(what, word);
    }
    const auto magnitude = static_cast<std::int64_t>(number->magnitude);
    const std::int64_t value = number->negative ? -magnitude : magnitude;
    if (value < min || value > max) {
        refuse(what, word);
    }
    return value;
}

std::uint64_t ScriptWords::takeIdentity(const std::string& what) {
    const std::string word = take(what);
    const std::optional<std::uint64_t> value = readUnsigned("0x" + word);
    if (word.size() != 16 || !value) {
        refuse(what, word);
    }
    return *value;
}

std::uint64_t ScriptWords::takeRaw(const std::string& what, unsigned width) {
    const std::string word = take(what);
    const std::optional<Signed> number = readSigned(word);
    const std::uint64_t max = UINT64_MAX >> (64 - 8 * width);
    if (!number || number->magnitude > (number->negative ? max / 2 + 1 : max)) {
        refuse(what, word);
    }
    return (number->negative ? 0 - number->magnitude : number->magnitude) & max;
}

double ScriptWords::takeNumber(const std::string& what) {
    const std::string word = take(what);
    double value = 0;
    const char* begin = word.data() + (word[0] == '+' ? 1 : 0);
    const char* end = word.data() + word.size();
    const auto result = std::from_chars(begin, end, value);
    if (result.ec != std::errc() || result.ptr != end || !std::isfinite(value)) {
        refuse(what, word);
    }
    return value;
}

std::int64_t ScriptWords::takeDuration(const std::string& what) {
    const std::int64_t value = takeSeconds(what);
    if (value < 0) {
        refuse(what, words_[next_ - 1]);
    }
    return value;
}

std::int64_t ScriptWords::takeSeconds(const std::string& what) {
    const double seconds = takeNumber(what);
    if (std::abs(seconds) > longest) {
        refuse(what, words_[next_ - 1]);
    }
    return std::llround(seconds * 1e9);
}

bool ScriptWords::nextHasSign() const {
    return !atEnd() && (words_[next_][0] == '+' || words_[next_][0] == '-');
}

void ScriptWords::expectEnd() const {
    if (!atEnd()) {
        throw ScriptError("too much: " + words_[next_]);
    }
}

} // namespace simptp4l
