#include "Settings.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

namespace {

const Schema schema = parseSchema(R"({
    "count": {"dataType": "int", "range": [0, 10], "default": 7},
    "name": {"dataType": "string", "default": "x"},
    "flag": {"dataType": "bool", "default": false}
})");

UserSettings user(const std::string& text) {
    UserSettings settings;
    settings.text = text;
    settings.textName = "a.json";
    settings.interfaces = {"eth0"};
    return settings;
}

UserSettings assigned(const std::vector<std::string>& assignments) {
    UserSettings settings;
    settings.assignments = assignments;
    settings.interfaces = {"eth0"};
    return settings;
}

std::string valuesOf(const UserSettings& settings) {
    const Settings completed = completeSettings(schema, settings);
    EXPECT_THAT(completed.errors, IsEmpty());
    return completed.values.dump();
}

std::vector<std::string> errorsOf(const UserSettings& settings) {
    return completeSettings(schema, settings).errors;
}

} // namespace

TEST(Settings, DefaultsAreFilledInFromTheSchema) {
    EXPECT_EQ(valuesOf(assigned({})),
              R"({"count":7,"name":"x","flag":false,"interface":["eth0"]})");
}

TEST(Settings, GivenValuesReplaceDefaults) {
    EXPECT_EQ(valuesOf(user(R"({"flag":true,"count":10})")),
              R"({"count":10,"name":"x","flag":true,"interface":["eth0"]})");
}

TEST(Settings, AssignmentsWinOverTheTextAndTheLastOneWins) {
    auto settings = user(R"({"count":1,"name":"file"})");
    settings.assignments = {"count=2", "count=3", "name=a=b", "flag=true"};
    EXPECT_EQ(valuesOf(settings), R"({"count":3,"name":"a=b","flag":true,"interface":["eth0"]})");
}

TEST(Settings, AnAssignmentRepairsABadValue) {
    auto settings = user(R"({"count":"bad"})");
    settings.assignments = {"count=2"};
    EXPECT_THAT(errorsOf(settings), IsEmpty());
}

TEST(Settings, EveryBadKeyGetsOneLine) {
    EXPECT_THAT(errorsOf(user(R"({"flag":1,"count":11,"name":null})")),
                ElementsAre("a.json:1: count: 11 is out of range, 0 to 10 is allowed",
                            "a.json:1: name: must be a string, not null",
                            "a.json:1: flag: must be true or false, not 1"));
}

TEST(Settings, BadKeysOfAFileNameTheirLine) {
    auto settings =
        user("{\"flag\":\n1,\n\n\"count\":11, \"other\":{\n\"name\":4},\n \"name\" : 5}");
    EXPECT_THAT(errorsOf(settings),
                ElementsAre(StartsWith("a.json:4: count: "), StartsWith("a.json:6: name: "),
                            StartsWith("a.json:1: flag: ")));
    settings.assignments = {"count=12"};
    EXPECT_THAT(errorsOf(settings),
                ElementsAre(StartsWith("count: "), StartsWith("a.json:6: name: "),
                            StartsWith("a.json:1: flag: ")));
}

TEST(Settings, AFileThatIsNoJsonNamesTheLine) {
    EXPECT_THAT(errorsOf(user("{\"count\":1,\n\"name\":\n}")),
                ElementsAre(StartsWith("a.json:3: ")));
    EXPECT_THAT(errorsOf(user("{\n\"count\":1e999}")), ElementsAre(StartsWith("a.json:2: ")));
}

TEST(Settings, AKeyGivenTwiceIsRefused) {
    EXPECT_THAT(errorsOf(user("{\"count\":1,\"name\":\"y\",\n\"count\":99}")),
                ElementsAre("a.json:2: count: is given twice"));
}

TEST(Settings, TextThatIsNotAnObjectIsRefused) {
    for (const char* text : {"", "{", "[]", "3", "null", "{} {}", "{\"name\":\"\xFF\"}"}) {
        EXPECT_THAT(errorsOf(user(text)), ElementsAre(StartsWith("a.json:1: "))) << text;
    }
}

TEST(Settings, AnAssignmentNeedsAKeyAndAnEqualsSign) {
    EXPECT_THAT(
        errorsOf(assigned({"count", "=3", ""})),
        ElementsAre("count: must be key=value", "=3: must be key=value", ": must be key=value"));
}

TEST(Settings, AnAssignmentThatIsNotUtf8IsRefused) {
    EXPECT_THAT(errorsOf(assigned({"name=\xFF"})), ElementsAre("\"name\": is not UTF-8 text"));
}

TEST(Settings, UnknownKeysArePassedOnLastWithAWarning) {
    auto settings = user(R"({"other":[1],"Count":5})");
    settings.assignments = {"more=12", "text=1 2"};
    const Settings completed = completeSettings(schema, settings);
    EXPECT_THAT(completed.errors, IsEmpty());
    EXPECT_EQ(completed.values.dump(), R"({"count":7,"name":"x","flag":false,"interface":["eth0"],)"
                                       R"("other":[1],"Count":5,"more":12,"text":"1 2"})");
    EXPECT_THAT(
        completed.warnings,
        ElementsAre(
            "a.json:1: other: is unknown to the plug-in, passed on as it is",
            "a.json:1: Count: is unknown to the plug-in (\"count\" is meant?), passed on as it is",
            "more: is unknown to the plug-in, passed on as it is",
            "text: is unknown to the plug-in, passed on as it is"));
}

TEST(Settings, InterfacesOfTheCommandLineReplaceThoseOfTheText) {
    auto settings = user(R"({"interface":["a","b"]})");
    settings.interfaces = {};
    EXPECT_EQ(completeSettings(schema, settings).values["interface"], Json({"a", "b"}));
    settings.interfaces = {"c"};
    EXPECT_EQ(completeSettings(schema, settings).values["interface"], Json::array({"c"}));
}

TEST(Settings, InterfacesMustBeNames) {
    for (const char* text :
         {R"({})", R"({"interface":[]})", R"({"interface":"eth0"})", R"({"interface":null})",
          R"({"interface":[1]})", R"({"interface":["a",""]})", R"({"interface":{"a":"b"}})"}) {
        auto settings = user(text);
        settings.interfaces = {};
        EXPECT_THAT(errorsOf(settings), ElementsAre(testing::HasSubstr("interface: "))) << text;
    }
}

TEST(Settings, InterfacesAreNotAssigned) {
    EXPECT_THAT(errorsOf(assigned({"interface=eth1"})),
                ElementsAre("interface: is set with --interface"));
}

TEST(Settings, WithoutInterfacesTheListIsEmpty) {
    UserSettings settings;
    settings.interfacesRequired = false;
    EXPECT_EQ(completeSettings(schema, settings).values["interface"], Json::array());
    EXPECT_THAT(errorsOf(settings), IsEmpty());
    settings.text = R"({"interface":"eth0"})";
    EXPECT_THAT(errorsOf(settings), ElementsAre(testing::HasSubstr("interface: ")));
}
