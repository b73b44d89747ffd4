#include "json/ArrayIterator.h"

#include <gtest/gtest.h>

#include "JsonErrors.h"
#include "json/CppJson.h"

using zekelVantel::ArrayIterator;
using zekelVantel::CppJson;

namespace {

TEST(ArrayIteratorTest, WalksTheElementsInOrder) {
    const CppJson json("[10,20,30]");
    ArrayIterator element(json.root());
    for (const int expected : {10, 20, 30}) {
        ASSERT_FALSE(element.atEnd());
        EXPECT_EQ((*element)->valueint, expected);
        ++element;
    }
    EXPECT_TRUE(element.atEnd());
}

TEST(ArrayIteratorTest, EmptyArrayIsAtItsEnd) {
    const CppJson json("[]");
    const ArrayIterator element(json.root());
    EXPECT_TRUE(element.atEnd());
    EXPECT_EQ(errorOf([&] { *element; }), outOfBounds);
}

TEST(ArrayIteratorTest, PastTheLastElementIsOutOfBoundsAndStaysThere) {
    const CppJson json("[1]");
    ArrayIterator element(json.root());
    ++element;
    EXPECT_EQ(errorOf([&] { *element; }), outOfBounds);
    ++element;
    EXPECT_TRUE(element.atEnd());
    EXPECT_EQ(errorOf([&] { *element; }), outOfBounds);
}

TEST(ArrayIteratorTest, ItemThatIsNoArrayIsRefused) {
    for (const char* const text : {"{}", "{\"a\":1}", "1", "\"a\"", "null", "true", "false"}) {
        const CppJson json(text);
        EXPECT_EQ(errorOf([&] { const ArrayIterator element(json.root()); }), notAnArray) << text;
    }
}

} // namespace
