#include "ConfigValue.h"

#include <fmt/format.h>

#include "Text.h"

namespace vantelhost {

namespace {

bool isBlank(char character) {
    return character == ' ' || character == '\t';
}

bool isQuote(char character) {
    return character == '"' || character == '\'';
}

/// Whether a word may hold it.
bool isWordCharacter(char character) {
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
           (character >= '0' && character <= '9') ||
           std::string_view("+-_.:/").find(character) != std::string_view::npos;
}

} // namespace

std::string ConfigValue::add(std::string_view line) {
    for (const char character : line) {
        if (character == '#' && place_ != Place::inQuotes) {
            break;
        }
        auto problem = take(character);
        if (!problem.empty()) {
            return problem;
        }
    }
    if (place_ == Place::inQuotes) {
        return fmt::format("a quote {} is not closed", quote_);
    }
    if (place_ == Place::inWord) {
        place_ = Place::afterValue;
    }
    return place_ == Place::beforeValue && !isArray_ ? "has no value" : "";
}

bool ConfigValue::isComplete() const {
    return place_ == (isArray_ ? Place::closed : Place::afterValue);
}

std::string ConfigValue::take(char character) {
    return place_ == Place::inQuotes ? takeInQuotes(character) : takeOutside(character);
}

std::string ConfigValue::takeInQuotes(char character) {
    if (character == '\\' && quote_ == '"') {
        return "a text with a backslash stands in single quotes";
    }
    text_ += character;
    if (character == quote_) {
        place_ = Place::afterValue;
    }
    return {};
}

std::string ConfigValue::takeOutside(char character) {
    if (isBlank(character)) {
        if (place_ == Place::inWord) {
            place_ = Place::afterValue;
        }
        return {};
    }
    bool fits = false;
    if (isQuote(character)) {
        fits = beginValue(Place::inQuotes);
        quote_ = character;
    } else if (isWordCharacter(character)) {
        fits = place_ == Place::inWord || beginValue(Place::inWord);
    } else if (takePunctuation(character)) {
        return {};
    }
    text_ += character;
    return fits ? "" : "an unexpected " + shown(std::string(1, character));
}

/// @return whether it is punctuation of an array, and in its place.
bool ConfigValue::takePunctuation(char character) {
    if (character == '[' && text_.empty()) {
        isArray_ = true;
        text_ = "[";
        return true;
    }
    if (!isArray_ || place_ == Place::closed) {
        return false;
    }
    if (character == ']') {
        place_ = Place::closed;
        text_ += ']';
        return true;
    }
    const bool isComma = character == ',' && place_ != Place::beforeValue;
    if (isComma) {
        place_ = Place::beforeValue;
        commaIsDue_ = true;
    }
    return isComma;
}

bool ConfigValue::beginValue(Place place) {
    if (place_ != Place::beforeValue) {
        return false;
    }
    place_ = place;
    if (commaIsDue_) {
        text_ += ',';
        commaIsDue_ = false;
    }
    return true;
}

} // namespace vantelhost
