/// @file
#pragma once

#include <cjson/cJSON.h>

namespace zekelVantel {

/// Walks the elements of a JSON array.
class ArrayIterator {
public:
    /// @throws zeerr::Exception "jsonErrorsNotAnArray" when the item is no array.
    explicit ArrayIterator(const cJSON* array);

    bool atEnd() const { return current_ == nullptr; }

    /// @throws zeerr::Exception "jsonErrorsArrayItemOutOfBounds" past the last element.
    const cJSON* operator*() const;

    /// Goes on to the next element; past the last one it stays there.
    ArrayIterator& operator++();

private:
    const cJSON* current_ = nullptr;
};

} // namespace zekelVantel
