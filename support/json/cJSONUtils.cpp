#include "json/cJSONUtils.h"

#include <boost/numeric/conversion/cast.hpp>

#include "errors/Exception.h"
#include "json/ArrayIterator.h"

namespace zekelVantel {
namespace {

void requireType(bool matches) {
    if (!matches) {
        zeerr::throwError(zeerr::site::jsonTypeMismatch);
    }
}

template <typename Integer>
Integer getInteger(const cJSON* item) {
    requireType(isNumber(item));
    return boost::numeric_cast<Integer>(item->valuedouble);
}

std::size_t count(const cJSON* arrayItem) {
    std::size_t elements = 0;
    for (ArrayIterator element(arrayItem); !element.atEnd(); ++element) {
        ++elements;
    }
    return elements;
}

} // namespace

bool isNull(const cJSON* item) {
    return item->type == cJSON_NULL;
}

bool isNumber(const cJSON* item) {
    return item->type == cJSON_Number;
}

bool isString(const cJSON* item) {
    return item->type == cJSON_String;
}

bool isBool(const cJSON* item) {
    return item->type == cJSON_False || item->type == cJSON_True;
}

bool isArray(const cJSON* item) {
    return item->type == cJSON_Array;
}

std::string getString(const cJSON* item) {
    requireType(isString(item));
    return item->valuestring;
}

bool getBool(const cJSON* item) {
    requireType(isBool(item));
    return item->type == cJSON_True;
}

std::int32_t getInt32(const cJSON* item) {
    return getInteger<std::int32_t>(item);
}

std::uint32_t getUInt32(const cJSON* item) {
    return getInteger<std::uint32_t>(item);
}

std::vector<std::string> toStringList(const cJSON* arrayItem) {
    std::vector<std::string> strings;
    strings.reserve(count(arrayItem));
    for (ArrayIterator element(arrayItem); !element.atEnd(); ++element) {
        strings.push_back(getString(*element));
    }
    return strings;
}

} // namespace zekelVantel
