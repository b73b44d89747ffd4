// The command "schema".

#include "SchemaTable.h"
#include "Tool.h"
#include "support/Child.h"

using testing::HasSubstr;
using vantelhost::Json;

namespace {

Result printedSchema(const std::vector<std::string>& options,
                     const std::vector<std::string>& environment = {}) {
    std::vector<std::string> words{HOST_TOOL, "schema"};
    words.insert(words.end(), options.begin(), options.end());
    Child child(words, environment);
    const int status = child.wait();
    return {status, child.output(), child.errors()};
}

} // namespace

TEST(SchemaTable, HasALineForEachParameterUnderAHeading) {
    const auto parameters = vantelhost::parseSchema(R"({
        "count": {"dataType": "int", "range": [-5, 100], "default": 7, "hidden": false},
        "name": {"dataType": "string", "default": "a\nb", "hidden": true},
        "flag": {"dataType": "bool", "default": true}
    })");
    EXPECT_EQ(vantelhost::schemaTable(parameters), "key    type    range      default  hidden\n"
                                                   "count  int     -5 to 100  7        no\n"
                                                   "name   string             \"a\\nb\"   yes\n"
                                                   "flag   bool               true     no\n");
}

TEST(SchemaCommand, ShowsThePlugInsParameters) {
    const auto result = printedSchema({"--library", FAKE_PLUGIN});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, HasSubstr("wide     int     0 to 4294967295  4294967295  no\n"));
    EXPECT_EQ(result.errors, "");
}

TEST(SchemaCommand, ShowsTheRawTextUnchanged) {
    const auto result =
        printedSchema({"--library", FAKE_PLUGIN, "--json"}, {"FAKE_SCHEMA= { \"odd\" : 1 }\n"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.output, " { \"odd\" : 1 }\n");
}

TEST(SchemaCommand, AnOutputThatIsLostIsTold) {
    for (const std::string options : {"", " --json"}) {
        Child child({"/bin/sh", "-c", "exec \"$0\" schema --library \"$1\" >/dev/full" + options,
                     HOST_TOOL, FAKE_PLUGIN});
        EXPECT_EQ(child.wait(), 1);
        EXPECT_EQ(child.errors(),
                  "vantel-host: cannot write the standard output: No space left on device\n");
    }
}

TEST(SchemaCommand, FailsWithThePlugIn) {
    const auto result = printedSchema({"--library", FAKE_PLUGIN}, {"FAKE_SCHEMA=fails"});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.errors, HasSubstr("code -52000, zeoskerr_memoryFull at fake:2"));
}

TEST(SchemaCommand, FailsOnASchemaThatMakesNoSense) {
    const auto result = printedSchema({"--library", FAKE_PLUGIN}, {"FAKE_SCHEMA={\"a\":3}"});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.errors, HasSubstr("the schema of \"a\": not an object"));
}

TEST(SchemaCommand, RefusesALibraryThatIsNoPlugIn) {
    EXPECT_EQ(printedSchema({"--library", "/nowhere/none.so"}).status, 2);
    EXPECT_EQ(printedSchema({"--library", FAKE_PLUGIN_VERSION3}).status, 2);
}
