#include "Report/PairLine.h"

#include <algorithm>
#include <charconv>

namespace vantelhost {

namespace {

/// A text that is taken off from its beginning. What it does not begin with fails it for good.
class Cutter {
public:
    explicit Cutter(std::string_view text) : text_(text) {}

    bool isDone() const { return isGood_ && text_.empty(); }

    bool begins(std::string_view word) const { return text_.substr(0, word.size()) == word; }

    void skip(std::string_view word) {
        isGood_ = isGood_ && begins(word);
        text_.remove_prefix(std::min(word.size(), text_.size()));
    }

    template <typename Number>
    void take(Number& number) {
        const char* const end = text_.data() + text_.size();
        const auto [next, error] = std::from_chars(text_.data(), end, number);
        isGood_ = isGood_ && error == std::errc();
        text_.remove_prefix(static_cast<std::size_t>(next - text_.data()));
    }

    std::string_view takeUntil(char last) {
        const auto length = std::min(text_.find(last), text_.size());
        const auto word = text_.substr(0, length);
        text_.remove_prefix(length);
        return word;
    }

private:
    std::string_view text_;
    bool isGood_ = true;
};

bool isDigit(char character) {
    return character >= '0' && character <= '9';
}

/// Digits, a point, digits: JSON, which from_chars takes more than.
bool isPlain(std::string_view number) {
    const auto point = number.find('.');
    const auto part = number.substr(0, point);
    const auto rest = point == std::string_view::npos ? "0" : number.substr(point + 1);
    const bool hasZeroInFront = part.size() > 1 && part.front() == '0';
    return !part.empty() && !rest.empty() && !hasZeroInFront &&
           std::all_of(part.begin(), part.end(), isDigit) &&
           std::all_of(rest.begin(), rest.end(), isDigit);
}

} // namespace

std::optional<PairLine> parsePairLine(std::string_view text) {
    PairLine line;
    Cutter cutter(text);
    if (!cutter.begins(R"({"event":"pair",)")) {
        return std::nullopt;
    }
    std::uint64_t reference = 0;
    cutter.skip(R"({"event":"pair","t":)");
    const auto seconds = cutter.takeUntil(',');
    std::from_chars(seconds.data(), seconds.data() + seconds.size(), line.t);
    cutter.skip(R"(,"time":)");
    cutter.take(line.time);
    cutter.skip(R"(,"reference":)");
    cutter.take(reference);
    cutter.skip(R"(,"local":)");
    cutter.take(line.local);
    cutter.skip(R"(,"offset":)");
    cutter.take(line.offset);
    if (cutter.begins(R"(,"leftOut":")")) {
        cutter.skip(R"(,"leftOut":")");
        line.leftOut = cutter.takeUntil('"');
        cutter.skip("\"");
    }
    if (cutter.begins(R"(,"realtime":)")) {
        std::uint64_t uncertainty = 0;
        cutter.skip(R"(,"realtime":)");
        cutter.take(line.realtime.emplace());
        cutter.skip(R"(,"uncertainty":)");
        cutter.take(uncertainty);
    }
    cutter.skip("}");
    if (!cutter.isDone() || !isPlain(seconds)) {
        return std::nullopt;
    }
    return line;
}

std::optional<PairKind> judgementOf(std::string_view leftOut) {
    const auto kind = kindOfWord(leftOut);
    return kind == PairKind::unhealthy ? PairKind::measured : kind;
}

} // namespace vantelhost
