#include "errors/JsonScanner.h"

#include <cstddef>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

namespace {

constexpr std::ptrdiff_t none = -1;

/// Where the closing bracket of a text stands, with nothing behind the text that may be read.
std::ptrdiff_t closingIn(std::string_view text) {
    const std::unique_ptr<char[]> copy(new char[text.size()]);
    text.copy(copy.get(), text.size());
    const char* const bracket = zeerr::closingBracket({copy.get(), text.size()});
    return bracket == nullptr ? none : bracket - copy.get();
}

/// Of a text that ends with its bracket.
std::ptrdiff_t endOf(std::string_view text) {
    return static_cast<std::ptrdiff_t>(text.size()) - 1;
}

std::string nested(std::size_t depth, const std::string& open, char close) {
    std::string text;
    for (std::size_t level = 0; level < depth; ++level) {
        text += open;
    }
    return text + std::string(depth, close);
}

TEST(JsonBlankTest, AreFour) {
    for (int octet = 0; octet < 256; ++octet) {
        const bool blank = octet == 0x20 || octet == 0x09 || octet == 0x0a || octet == 0x0d;
        EXPECT_EQ(zeerr::isJsonBlank(static_cast<char>(octet)), blank) << octet;
    }
}

TEST(JsonScannerTest, PositionIsThatOfTheClosingBracket) {
    EXPECT_EQ(closingIn("{}"), 1);
    EXPECT_EQ(closingIn("[]"), 1);
    EXPECT_EQ(closingIn("{\"a\":1}"), 6);
    EXPECT_EQ(closingIn("[{},[]]"), 6);
    EXPECT_EQ(closingIn(" { } "), 3);
    EXPECT_EQ(closingIn("{\"a\":{\"b\":[]}}"), 13);
}

TEST(JsonScannerTest, PositionPointsIntoTheText) {
    const char text[] = "{\"a\":[1]} }";
    EXPECT_EQ(zeerr::closingBracket(text), text + 8);
}

TEST(JsonScannerTest, ObjectsAndArraysScan) {
    for (const char* const text :
         {R"({})", R"([])", R"({"a":1})", R"([1])", R"([1,2,3])", R"({"a":1,"b":2})", R"({"a":{}})",
          R"({"a":[]})", R"([[],{}])", R"([{"a":[{"b":null}]}])", R"({"":""})", R"({"a":1,"a":2})",
          R"([true,false,null])", R"(["a","b"])"}) {
        EXPECT_EQ(closingIn(text), endOf(text)) << text;
    }
}

TEST(JsonScannerTest, WhatIsNeitherObjectNorArrayDoesNotScan) {
    for (const char* const text : {"", " ", "1", "true", "null", "\"{}\"", "}", "]", ",", ":",
                                   "x{}", "1{}", "\"\"{}", "(", "\xef\xbb\xbf{}"}) {
        EXPECT_EQ(closingIn(text), none) << text;
    }
    EXPECT_EQ(zeerr::closingBracket({}), nullptr);
}

TEST(JsonScannerTest, WhatIsNotWellFormedDoesNotScan) {
    for (const char* const text :
         {R"({]})",       R"([})",       R"({"a"})",     R"({"a":})",      R"({"a":1,})",
          R"([1,])",      R"([,1])",     R"([,])",       R"({,})",         R"({1:2})",
          R"({a:1})",     R"({"a" 1})",  R"({"a"::1})",  R"({"a":1 "b"})", R"([1 2])",
          R"(["a" "b"])", R"([[]1])",    R"({"a":1;})",  R"({'a':1})",     R"({"a":"b'})",
          R"([1:2])",     R"({"a":{]})", R"([[1})",      R"({null:1})",    R"([}])",
          R"([/**/])",    R"({[]:1})",   R"({"a","b"})", R"([1,,2])",      R"([")",
          R"([1})",       R"({"a":1])",  R"([})",        R"({])",          R"({:1})"}) {
        EXPECT_EQ(closingIn(text), none) << text;
    }
}

TEST(JsonScannerTest, BlanksMayStandBetweenAllTokens) {
    for (const std::string blank : {" ", "\t", "\n", "\r", " \t\r\n \n"}) {
        std::string text;
        for (const char* const token :
             {"{", "\"a\"", ":", "[", "1", ",", "\"b\"", ",",     "true", ",",
              "[", "]",     ",", "{", "}", "]", ",",     "\"c\"", ":",    "null"}) {
            text += blank + token;
        }
        text += blank + "}";
        EXPECT_EQ(closingIn(text), endOf(text)) << text;
    }
}

TEST(JsonScannerTest, NothingElseIsABlank) {
    for (int octet = 0; octet < 256; ++octet) {
        const std::string other(1, static_cast<char>(octet));
        const bool blank = octet == 0x20 || octet == 0x09 || octet == 0x0a || octet == 0x0d;
        if (std::string("[]{}").find(other) == std::string::npos) {
            EXPECT_EQ(closingIn(other + "{}"), blank ? 2 : none) << octet;
            EXPECT_EQ(closingIn("{" + other + "}"), blank ? 2 : none) << octet;
            EXPECT_EQ(closingIn("[[]" + other + "]"), blank ? 4 : none) << octet;
        }
    }
}

TEST(JsonScannerTest, BracketsAndSeparatorsInStringsDoNotCount) {
    for (const char* const text :
         {R"({"a":"}"})", R"({"}":"]"})", R"(["[","]","{","}"])", R"({"a,b":"c:d"})", R"(["\"]"])",
          R"({"\"}":"\"}"})", R"(["\\"])", R"(["\\\"]"])", R"({"a\\":"}\\"})",
          R"(["\n\t\b\f\r\/"])", R"(["\u005d\u0022"])", "[\"\xc3\xa4\xff\"]"}) {
        EXPECT_EQ(closingIn(text), endOf(text)) << text;
    }
}

TEST(JsonScannerTest, StringThatDoesNotEndDoesNotScan) {
    for (const char* const text : {R"({"a)", R"({"a":"b})", R"({"a":"b\"})", R"(["\)", R"(["\")",
                                   R"(["\\\"])", R"(["a\\\"])", R"(["])"}) {
        EXPECT_EQ(closingIn(text), none) << text;
    }
}

TEST(JsonScannerTest, ZerosBelongToStringsOnly) {
    using namespace std::string_view_literals;
    EXPECT_EQ(closingIn("[\"\0]\"]"sv), 5);
    EXPECT_EQ(closingIn("[\0]"sv), none);
    EXPECT_EQ(closingIn("\0{}"sv), none);
    EXPECT_EQ(closingIn("{}\0}"sv), 1);
}

TEST(JsonScannerTest, NumbersScan) {
    for (const std::string number : {"0", "9", "-0", "1", "-1", "12345678901234567890", "0.5",
                                     "-12.75", "1e5", "1E5", "1e+5", "1.5E-300", "-2147483648"}) {
        EXPECT_EQ(closingIn("[" + number + "]"), endOf("[" + number + "]")) << number;
        EXPECT_EQ(closingIn("{\"a\":" + number + "}"), endOf("{\"a\":" + number + "}")) << number;
    }
}

TEST(JsonScannerTest, OtherWordsDoNotScan) {
    for (const std::string word : {"+1", ".5", "e5", "True", "TRUE", "tru", "truefalse", "nul",
                                   "nulll", "NaN", "nan", "Infinity", "undefined", "a", "#"}) {
        EXPECT_EQ(closingIn("[" + word + "]"), none) << word;
        EXPECT_EQ(closingIn("{\"a\":" + word + "}"), none) << word;
    }
}

TEST(JsonScannerTest, TextBehindTheClosingBracketIsIgnored) {
    for (const char* const rest : {" ", "}", "]", "{", "x", "{}", " and more }", "\"", ",1]"}) {
        EXPECT_EQ(closingIn(std::string("{\"a\":[1]}") + rest), 8) << rest;
        EXPECT_EQ(closingIn(std::string("[1]") + rest), 2) << rest;
    }
}

TEST(JsonScannerTest, NoBeginningOfATextScans) {
    const std::string text =
        " {\"error_constant\":\"zeoskerr_osFault\",\"file\":\"a\\\"}\\\\\",\"line\":-12.5e+3,\r\n"
        "\t\"zesync_debug\" : { \"list\":[true , false,null,[],{},\"]\"], \"\\u0041\":\"\" } }";
    for (std::size_t length = 0; length < text.size(); ++length) {
        EXPECT_EQ(closingIn(text.substr(0, length)), none) << length;
    }
    EXPECT_EQ(closingIn(text), endOf(text));
}

TEST(JsonScannerTest, ThousandLevelsScanAndOneMoreDoesNot) {
    const std::string arrays = nested(1000, "[", ']');
    EXPECT_EQ(closingIn(arrays), 1999);
    EXPECT_EQ(closingIn("[" + arrays + "]"), none);
    EXPECT_EQ(closingIn("{\"a\":" + arrays + "}"), none);
    EXPECT_EQ(closingIn("[" + nested(999, "[", ']') + "," + nested(999, "[", ']') + "]"), 3998);
}

TEST(JsonScannerTest, ObjectsCountAsLevelsToo) {
    const std::string objects = nested(999, "{\"a\":", '}');
    EXPECT_EQ(closingIn(objects), none);
    std::string text = nested(999, "{\"a\":", '}');
    text.insert(std::size_t{999} * 5, "{}");
    EXPECT_EQ(closingIn(text), endOf(text));
    text.insert(std::size_t{999} * 5, "{\"a\":");
    text += '}';
    EXPECT_EQ(closingIn(text), none);
}

TEST(JsonScannerTest, HundredThousandLevelsAreRefused) {
    EXPECT_EQ(closingIn(std::string(100000, '[')), none);
    EXPECT_EQ(closingIn(nested(100000, "{\"a\":", '}')), none);
}

} // namespace
