/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <utility>

#include "errors/Exception.h"

/// Code and text of the error that an action throws; 0 and "" when it throws none.
inline std::pair<std::int32_t, std::string> errorOf(const std::function<void()>& action) {
    try {
        action();
    } catch (zeerr::Exception& exception) {
        return {exception.status().code, exception.what()};
    }
    return {0, ""};
}

inline const std::pair<std::int32_t, std::string> typeMismatch{
    -52004, R"({"error_constant":"jsonErrorsTypeMismatch","file":"cJSONUtils","line":305,)"
            R"("component":"vantel_bc"})"};
inline const std::pair<std::int32_t, std::string> notAnArray{
    -52004, R"({"error_constant":"jsonErrorsNotAnArray","file":"cJSONUtils","line":83,)"
            R"("component":"vantel_bc"})"};
inline const std::pair<std::int32_t, std::string> invalidJson{
    -52005, R"({"error_constant":"jsonErrorsInvalidJSON","file":"CppJson","line":34,)"
            R"("component":"vantel_bc"})"};
inline const std::pair<std::int32_t, std::string> outOfBounds{
    -52006, R"({"error_constant":"jsonErrorsArrayItemOutOfBounds","file":"ArrayIterator",)"
            R"("line":102,"component":"vantel_bc"})"};
