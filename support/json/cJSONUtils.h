/// @file
/// Typed access to the items of a JSON document.
///
/// The getters throw zeerr::Exception "jsonErrorsTypeMismatch" when the item is of another type.
/// The integer getters cut the fraction off and throw boost::numeric::negative_overflow or
/// positive_overflow when the whole number does not fit.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include <cjson/cJSON.h>

namespace zekelVantel {

bool isNull(const cJSON* item);
bool isNumber(const cJSON* item);
bool isString(const cJSON* item);
bool isBool(const cJSON* item);
bool isArray(const cJSON* item);

std::string getString(const cJSON* item);
bool getBool(const cJSON* item);
std::int32_t getInt32(const cJSON* item);
std::uint32_t getUInt32(const cJSON* item);

/// The strings of an array, in order.
/// @throws zeerr::Exception "jsonErrorsNotAnArray", or "jsonErrorsTypeMismatch" for an element.
std::vector<std::string> toStringList(const cJSON* arrayItem);

} // namespace zekelVantel
