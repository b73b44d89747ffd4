#include "json/CppJson.h"

#include <type_traits>

#include <gtest/gtest.h>

#include "JsonErrors.h"

using zekelVantel::CppJson;

namespace {

static_assert(!std::is_copy_constructible_v<CppJson>, "one owner of a document");
static_assert(!std::is_copy_assignable_v<CppJson>, "one owner of a document");

TEST(CppJsonTest, TextsThatDoNotParseAreInvalid) {
    for (const char* const text : {"", "{", "}", " ", "nul", "{\"a\":}", "[1,]", "\"open"}) {
        EXPECT_EQ(errorOf([&] { const CppJson json(text); }), invalidJson) << text;
    }
}

TEST(CppJsonTest, DocumentOfEveryKindParses) {
    for (const char* const text : {"{}", "[]", "1", "null", "true", "false", "\"a\"", " {} "}) {
        const CppJson json(text);
        EXPECT_NE(json.root(), nullptr) << text;
    }
}

TEST(CppJsonTest, NestingBeyondAllMeasureIsInvalid) {
    EXPECT_EQ(errorOf([&] { const CppJson json(std::string(100000, '[')); }), invalidJson);
}

TEST(CppJsonTest, TextBehindTheDocumentIsIgnored) {
    const CppJson json("{\"a\":1} and more");
    EXPECT_NE(cJSON_GetObjectItem(json.root(), "a"), nullptr);
}

TEST(CppJsonTest, RootIsHandedOutAndStaysOwned) {
    const CppJson json(R"({"a":"b"})");
    const cJSON* const item = cJSON_GetObjectItem(json.root(), "a");
    ASSERT_NE(item, nullptr);
    EXPECT_STREQ(item->valuestring, "b");
    EXPECT_EQ(json.root(), json.root());
}

TEST(CppJsonTest, MembersAreFoundWhateverTheirCase) {
    const CppJson json(R"({"priority1":1})");
    const cJSON* const item = cJSON_GetObjectItem(json.root(), "Priority1");
    ASSERT_NE(item, nullptr);
    EXPECT_EQ(item->valueint, 1);
}

TEST(CppJsonTest, AbsentMemberIsNullAndNoError) {
    const CppJson json(R"({"priority1":1})");
    EXPECT_EQ(cJSON_GetObjectItem(json.root(), "priority2"), nullptr);
}

TEST(CppJsonTest, ResetReleasesTheDocument) {
    CppJson json("{}");
    json.reset();
    EXPECT_EQ(json.root(), nullptr);
    json.reset();
    EXPECT_EQ(json.root(), nullptr);
}

} // namespace
