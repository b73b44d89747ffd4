#include "Schema.h"

#include <algorithm>
#include <limits>

#include <fmt/format.h>

#include "Numbers.h"
#include "Text.h"

namespace vantelhost {

namespace {

/// The integer that a value is; nothing when it is none, or one of more than 63 bits.
std::optional<std::int64_t> integerOf(const Json& value) {
    if (value.is_number_unsigned()) {
        const auto number = value.get<std::uint64_t>();
        const bool fits = number <= std::numeric_limits<std::int64_t>::max();
        return fits ? std::optional(static_cast<std::int64_t>(number)) : std::nullopt;
    }
    return value.is_number_integer() ? std::optional(value.get<std::int64_t>()) : std::nullopt;
}

DataType typeFrom(const Json& value) {
    for (const auto type : {DataType::integer, DataType::string, DataType::boolean}) {
        if (value == nameOf(type)) {
            return type;
        }
    }
    throw SchemaError(fmt::format("unknown dataType {}", shown(value)));
}

Range rangeFrom(const Json& value) {
    if (value.is_array() && value.size() == 2) {
        const auto low = integerOf(value[0]);
        const auto high = integerOf(value[1]);
        if (low && high && *low <= *high) {
            return {*low, *high};
        }
    }
    throw SchemaError(fmt::format("bad range {}", shown(value)));
}

Parameter parameterFrom(const std::string& key, const Json& description) {
    if (!description.is_object()) {
        throw SchemaError("not an object");
    }
    Parameter parameter{key, typeFrom(description.at("dataType")), std::nullopt,
                        description.at("default"), description.value("hidden", false)};
    if (description.contains("range")) {
        parameter.range = rangeFrom(description["range"]);
    }
    const std::string problem = complaint(parameter, parameter.defaultValue);
    if (!problem.empty()) {
        throw SchemaError("default " + problem);
    }
    return parameter;
}

const char* expected(DataType type) {
    switch (type) {
    case DataType::integer:
        return "an integer";
    case DataType::boolean:
        return "true or false";
    case DataType::string:
        break;
    }
    return "a string";
}

bool hasType(const Json& value, DataType type) {
    switch (type) {
    case DataType::integer:
        return value.is_number_integer();
    case DataType::boolean:
        return value.is_boolean();
    case DataType::string:
        break;
    }
    return value.is_string();
}

bool isInside(const Json& value, const Range& range) {
    const auto number = integerOf(value);
    return number && *number >= range.low && *number <= range.high;
}

} // namespace

Schema parseSchema(const std::string& text) {
    const Json object = Json::parse(text, nullptr, false);
    if (!object.is_object()) {
        throw SchemaError("the schema is not a JSON object");
    }
    Schema schema;
    for (const auto& [key, description] : object.items()) {
        try {
            schema.push_back(parameterFrom(key, description));
        } catch (const std::exception& error) {
            throw SchemaError(fmt::format("the schema of \"{}\": {}", key, error.what()));
        }
    }
    return schema;
}

const Parameter* find(const Schema& schema, const std::string& key) {
    const auto found = std::find_if(schema.begin(), schema.end(),
                                    [&](const Parameter& each) { return each.key == key; });
    return found == schema.end() ? nullptr : &*found;
}

const char* nameOf(DataType type) {
    switch (type) {
    case DataType::integer:
        return "int";
    case DataType::boolean:
        return "bool";
    case DataType::string:
        break;
    }
    return "string";
}

std::string complaint(const Parameter& parameter, const Json& value) {
    if (!hasType(value, parameter.type)) {
        return fmt::format("must be {}, not {}", expected(parameter.type), shown(value));
    }
    if (parameter.range && !isInside(value, *parameter.range)) {
        return fmt::format("{} is out of range, {} to {} is allowed", shown(value),
                           parameter.range->low, parameter.range->high);
    }
    if (value.is_string() && value.get_ref<const std::string&>().find('\0') != std::string::npos) {
        return "must not contain the character 0";
    }
    return {};
}

Json valueFromText(const Parameter& parameter, const std::string& text) {
    if (parameter.type == DataType::integer) {
        if (const auto number = parseInteger(text)) {
            return *number;
        }
    }
    if (parameter.type == DataType::boolean && (text == "true" || text == "false")) {
        return text == "true";
    }
    return text;
}

} // namespace vantelhost
