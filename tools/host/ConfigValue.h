/// @file
#pragma once

#include <string>
#include <string_view>

namespace vantelhost {

/// A value of a configuration file, line by line: a word, a text in quotes, or an array of such,
/// which may go over several lines. Comments and blanks outside of quotes are left out, so that
/// what remains means the same to every version of CLI11's reader, which is lenient.
class ConfigValue {
public:
    /// Takes the first line, or one more of an array.
    /// @return what is wrong with it; empty when nothing is. Then the value is of no use.
    std::string add(std::string_view line);

    /// False as long as an array is not closed.
    bool isComplete() const;

    bool isArray() const { return isArray_; }
    bool isEmptyArray() const { return text_ == "[]"; }
    const std::string& text() const { return text_; }

private:
    enum class Place { beforeValue, inWord, inQuotes, afterValue, closed };

    std::string take(char character);
    std::string takeInQuotes(char character);
    std::string takeOutside(char character);
    bool takePunctuation(char character);
    bool beginValue(Place place);

    Place place_ = Place::beforeValue;
    char quote_ = '\0';
    bool isArray_ = false;
    bool commaIsDue_ = false; ///< not yet in the text: one behind the last element is left out
    std::string text_;
};

} // namespace vantelhost
