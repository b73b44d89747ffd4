/// @file
/// The plug-in's parameters, as it describes them itself.
#pragma once

#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include "Json.h"

namespace vantelhost {

enum class DataType { integer, string, boolean };

/// Both ends are allowed.
struct Range {
    std::int64_t low;
    std::int64_t high;
};

struct Parameter {
    std::string key;
    DataType type;
    std::optional<Range> range;
    Json defaultValue;
    bool hidden;
};

/// In the order of the schema's text.
using Schema = std::vector<Parameter>;

/// The plug-in's schema makes no sense.
class SchemaError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// Throws SchemaError.
Schema parseSchema(const std::string& text);

/// The parameter of that name, or null.
const Parameter* find(const Schema& schema, const std::string& key);

/// The type's name in the schema.
const char* nameOf(DataType type);

/// What is wrong with a value of a parameter; empty when nothing is.
std::string complaint(const Parameter& parameter, const Json& value);

/// The value that a typed text means for a parameter. A text that cannot be read as the parameter's
/// type stays a string, about which complaint() then complains.
Json valueFromText(const Parameter& parameter, const std::string& text);

} // namespace vantelhost
