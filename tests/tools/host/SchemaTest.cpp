#include "Schema.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::HasSubstr;

namespace {

constexpr char good[] = R"({
    "z": {"dataType": "int", "range": [-5, 100], "default": 7, "hidden": false},
    "a": {"dataType": "string", "default": "text", "hidden": true},
    "m": {"dataType": "bool", "default": true},
    "n": {"dataType": "int", "default": -9000000000}
})";

std::string problemOf(const std::string& text) {
    try {
        parseSchema(text);
    } catch (const SchemaError& error) {
        return error.what();
    }
    return {};
}

} // namespace

TEST(Schema, ParametersKeepTheirOrderAndMembers) {
    const Schema schema = parseSchema(good);
    ASSERT_EQ(schema.size(), 4U);
    EXPECT_EQ(schema[0].key, "z");
    EXPECT_EQ(schema[0].type, DataType::integer);
    EXPECT_EQ(schema[0].range->low, -5);
    EXPECT_EQ(schema[0].range->high, 100);
    EXPECT_EQ(schema[0].defaultValue, 7);
    EXPECT_FALSE(schema[0].hidden);
    EXPECT_EQ(schema[1].key, "a");
    EXPECT_EQ(schema[1].type, DataType::string);
    EXPECT_FALSE(schema[1].range);
    EXPECT_TRUE(schema[1].hidden);
    EXPECT_EQ(schema[2].type, DataType::boolean);
    EXPECT_FALSE(schema[2].hidden);
}

TEST(Schema, AnEmptySchemaHasNoParameters) {
    EXPECT_TRUE(parseSchema("{}").empty());
}

TEST(Schema, AParameterIsFoundByItsExactName) {
    const Schema schema = parseSchema(good);
    EXPECT_EQ(find(schema, "m"), &schema[2]);
    EXPECT_EQ(find(schema, "M"), nullptr);
}

TEST(Schema, NonsenseIsRefusedAndNamesTheParameter) {
    EXPECT_THAT(problemOf("{"), HasSubstr("not a JSON object"));
    EXPECT_THAT(problemOf("[]"), HasSubstr("not a JSON object"));
    for (const char* description : {
             R"(3)",
             R"({"default": 1})",
             R"({"dataType": "int"})",
             R"({"dataType": "float", "default": 1})",
             R"({"dataType": 1, "default": 1})",
             R"({"dataType": "int", "default": "1"})",
             R"({"dataType": "int", "default": 1.5})",
             R"({"dataType": "bool", "default": 0})",
             R"({"dataType": "string", "default": null})",
             R"({"dataType": "int", "range": [1], "default": 1})",
             R"({"dataType": "int", "range": [2, 1], "default": 1})",
             R"({"dataType": "int", "range": ["a", 1], "default": 1})",
             R"({"dataType": "int", "range": 5, "default": 1})",
             R"({"dataType": "int", "range": [0, 4], "default": 5})",
             R"({"dataType": "int", "default": 1, "hidden": "no"})",
         }) {
        const auto text = std::string("{\"key\": ") + description + "}";
        EXPECT_THAT(problemOf(text), HasSubstr("\"key\"")) << description;
    }
}

TEST(Schema, ValuesOfTheRightTypeInsideTheRangeAreFine) {
    const Schema schema = parseSchema(good);
    for (const int value : {-5, 0, 100}) {
        EXPECT_EQ(complaint(schema[0], value), "");
    }
    EXPECT_EQ(complaint(schema[1], ""), "");
    EXPECT_EQ(complaint(schema[2], false), "");
    EXPECT_EQ(complaint(schema[3], 123456789012345), "");
}

TEST(Schema, ValuesOutsideTheRangeAreNot) {
    const Schema schema = parseSchema(good);
    EXPECT_EQ(complaint(schema[0], -6), "-6 is out of range, -5 to 100 is allowed");
    EXPECT_EQ(complaint(schema[0], 101), "101 is out of range, -5 to 100 is allowed");
    const std::uint64_t huge = 18446744073709551615U; // -1 in 64 bits
    EXPECT_THAT(complaint(schema[0], huge), HasSubstr("out of range"));
}

TEST(Schema, ValuesOfAnotherTypeAreNot) {
    const Schema schema = parseSchema(good);
    for (const Json& value : {Json("7"), Json(7.5), Json(7.0), Json(true), Json(nullptr),
                              Json(Json::value_t::array), Json(Json::value_t::object)}) {
        EXPECT_THAT(complaint(schema[0], value), HasSubstr("must be an integer, not ")) << value;
    }
    EXPECT_EQ(complaint(schema[1], 1), "must be a string, not 1");
    EXPECT_EQ(complaint(schema[2], 1), "must be true or false, not 1");
    EXPECT_EQ(complaint(schema[2], "true"), "must be true or false, not \"true\"");
}

TEST(Schema, AStringThatWouldEndEarlyIsNotFine) {
    const Schema schema = parseSchema(good);
    EXPECT_THAT(complaint(schema[1], std::string("a\0b", 3)), HasSubstr("character 0"));
}

TEST(Schema, TypedTextBecomesAValueOfTheParametersType) {
    const Schema schema = parseSchema(good);
    EXPECT_EQ(valueFromText(schema[0], "-4"), -4);
    EXPECT_EQ(valueFromText(schema[0], "4x"), "4x");
    EXPECT_EQ(valueFromText(schema[1], "4"), "4");
    EXPECT_EQ(valueFromText(schema[2], "true"), true);
    EXPECT_EQ(valueFromText(schema[2], "false"), false);
    EXPECT_EQ(valueFromText(schema[2], "1"), "1");
}
