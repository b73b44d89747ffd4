#include "json/cJSONUtils.h"

#include <string>
#include <vector>

#include <boost/numeric/conversion/cast.hpp>
#include <gtest/gtest.h>

#include "JsonErrors.h"
#include "json/CppJson.h"

using boost::numeric::negative_overflow;
using boost::numeric::positive_overflow;
using zekelVantel::CppJson;

namespace {

constexpr const char* kinds[] = {"null", "1", "\"a\"", "true", "false", "[]", "{}"};

std::int32_t int32Of(const std::string& text) {
    const CppJson json(text);
    return zekelVantel::getInt32(json.root());
}

std::uint32_t uint32Of(const std::string& text) {
    const CppJson json(text);
    return zekelVantel::getUInt32(json.root());
}

std::vector<std::string> listOf(const std::string& text) {
    const CppJson json(text);
    return zekelVantel::toStringList(json.root());
}

/// Checks that a predicate holds for the given kinds and for no others.
void expectOnly(bool (*predicate)(const cJSON*), const std::vector<std::string>& expected) {
    std::vector<std::string> matching;
    for (const char* const text : kinds) {
        const CppJson json(text);
        if (predicate(json.root())) {
            matching.emplace_back(text);
        }
    }
    EXPECT_EQ(matching, expected);
}

/// Checks that a getter refuses every kind but the given ones.
template <typename Getter>
void expectMismatchBut(Getter getter, const std::vector<std::string>& accepted) {
    std::vector<std::string> passed;
    for (const char* const text : kinds) {
        const CppJson json(text);
        const auto error = errorOf([&] { getter(json.root()); });
        if (error.first == 0) {
            passed.emplace_back(text);
        } else {
            EXPECT_EQ(error, typeMismatch) << text;
        }
    }
    EXPECT_EQ(passed, accepted);
}

TEST(JsonPredicatesTest, EachHoldsForItsOwnKindOnly) {
    expectOnly(&zekelVantel::isNull, {"null"});
    expectOnly(&zekelVantel::isNumber, {"1"});
    expectOnly(&zekelVantel::isString, {"\"a\""});
    expectOnly(&zekelVantel::isBool, {"true", "false"});
    expectOnly(&zekelVantel::isArray, {"[]"});
}

TEST(JsonGettersTest, EveryOtherKindIsATypeMismatch) {
    expectMismatchBut(&zekelVantel::getString, {"\"a\""});
    expectMismatchBut(&zekelVantel::getBool, {"true", "false"});
    expectMismatchBut(&zekelVantel::getInt32, {"1"});
    expectMismatchBut(&zekelVantel::getUInt32, {"1"});
}

TEST(JsonGettersTest, StringIsACopyOfTheDecodedText) {
    std::string text;
    {
        const CppJson json(R"("a\"\u00e4\n")");
        text = zekelVantel::getString(json.root());
    }
    EXPECT_EQ(text, "a\"\xc3\xa4\n");
}

TEST(JsonGettersTest, BoolIsTrueForTrueOnly) {
    const CppJson yes("true");
    const CppJson no("false");
    EXPECT_TRUE(zekelVantel::getBool(yes.root()));
    EXPECT_FALSE(zekelVantel::getBool(no.root()));
}

TEST(JsonGettersTest, BoolOfTheNumberOneIsATypeMismatch) {
    const CppJson json("1");
    EXPECT_EQ(errorOf([&] { zekelVantel::getBool(json.root()); }), typeMismatch);
}

TEST(JsonNumbersTest, Int32IsCutTowardsZero) {
    EXPECT_EQ(int32Of("12.9"), 12);
    EXPECT_EQ(int32Of("-12.9"), -12);
    EXPECT_EQ(int32Of("0.999"), 0);
    EXPECT_EQ(int32Of("-0.999"), 0);
    EXPECT_EQ(int32Of("1e3"), 1000);
}

TEST(JsonNumbersTest, Int32ReachesItsBoundsWithAFraction) {
    EXPECT_EQ(int32Of("2147483647"), 2147483647);
    EXPECT_EQ(int32Of("2147483647.9"), 2147483647);
    EXPECT_EQ(int32Of("-2147483648"), INT32_MIN);
    EXPECT_EQ(int32Of("-2147483648.5"), INT32_MIN);
}

TEST(JsonNumbersTest, Int32BeyondItsBoundsOverflows) {
    EXPECT_THROW(int32Of("2147483648.0"), positive_overflow);
    EXPECT_THROW(int32Of("1e300"), positive_overflow);
    EXPECT_THROW(int32Of("1e999"), positive_overflow);
    EXPECT_THROW(int32Of("-2147483649.0"), negative_overflow);
    EXPECT_THROW(int32Of("-1e300"), negative_overflow);
}

TEST(JsonNumbersTest, UInt32IsCutTowardsZero) {
    EXPECT_EQ(uint32Of("-0.5"), 0U);
    EXPECT_EQ(uint32Of("-0.999"), 0U);
    EXPECT_EQ(uint32Of("20000000.7"), 20000000U);
    EXPECT_EQ(uint32Of("4294967295"), 4294967295U);
    EXPECT_EQ(uint32Of("4294967295.9"), 4294967295U);
}

TEST(JsonNumbersTest, UInt32BeyondItsBoundsOverflows) {
    EXPECT_THROW(uint32Of("-1.0"), negative_overflow);
    EXPECT_THROW(uint32Of("-1e300"), negative_overflow);
    EXPECT_THROW(uint32Of("4294967296.0"), positive_overflow);
    EXPECT_THROW(uint32Of("1e300"), positive_overflow);
}

TEST(JsonStringListTest, KeepsTheOrder) {
    EXPECT_EQ(listOf(R"(["eth1","eth0",""])"), (std::vector<std::string>{"eth1", "eth0", ""}));
}

TEST(JsonStringListTest, EmptyArrayGivesAnEmptyList) {
    EXPECT_TRUE(listOf("[]").empty());
}

TEST(JsonStringListTest, ElementThatIsNoStringIsATypeMismatch) {
    EXPECT_EQ(errorOf([] { listOf(R"(["a",1])"); }), typeMismatch);
    EXPECT_EQ(errorOf([] { listOf("[null]"); }), typeMismatch);
}

TEST(JsonStringListTest, ItemThatIsNoArrayIsRefused) {
    EXPECT_EQ(errorOf([] { listOf("\"eth0\""); }), notAnArray);
    EXPECT_EQ(errorOf([] { listOf("{\"a\":\"b\"}"); }), notAnArray);
}

} // namespace
