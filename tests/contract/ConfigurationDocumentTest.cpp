// Keeps docs/configuration.md in step with the library's schema and the file that it writes.

#include <cstdlib>
#include <memory>
#include <sstream>

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include "NamedTests.h"
#include "PluginFixture.h"
#include "support/CommandOutput.h"
#include "support/Markdown.h"

namespace {

using Json = nlohmann::json;
using markdown::unquoted;
using testing::HasSubstr;

constexpr char file[] = "ptp4l_bc.conf";

/// A row of the table of parameters.
struct Parameter {
    std::string name, type, range, defaultValue, option;
};

bool operator==(const Parameter& left, const Parameter& right) {
    return left.name == right.name && left.type == right.type && left.range == right.range &&
           left.defaultValue == right.defaultValue && left.option == right.option;
}

void PrintTo(const Parameter& parameter, std::ostream* out) {
    *out << parameter.name << ", " << parameter.type << ", " << parameter.range << ", "
         << parameter.defaultValue << ", " << parameter.option;
}

std::string document() {
    return projectFile("docs/configuration.md");
}

std::vector<Parameter> documented() {
    std::vector<Parameter> parameters;
    for (const auto& row :
         markdown::tables(document(), {"parameter", "type", "range", "default", "option of ptp4l",
                                       "meaning, and when to change it"})) {
        parameters.push_back(
            {unquoted(row.at(0)), row.at(1), row.at(2), unquoted(row.at(3)), unquoted(row.at(4))});
        EXPECT_FALSE(row.at(5).empty()) << row.at(0);
    }
    return parameters;
}

std::string rangeOf(const Json& parameter) {
    if (parameter.contains("range")) {
        return parameter["range"][0].dump() + " to " + parameter["range"][1].dump();
    }
    return parameter["dataType"] == "bool" ? "false, true" : "any";
}

/// A value that is not the default.
Json otherValue(const Json& parameter) {
    const std::string type = parameter["dataType"];
    return type == "int" ? Json(7) : type == "bool" ? Json(true) : Json("0x5");
}

std::multiset<std::string> linesOf(const std::string& path) {
    std::istringstream content(readFile(path));
    std::multiset<std::string> lines;
    for (std::string line; std::getline(content, line);) {
        lines.insert(line);
    }
    return lines;
}

class ConfigurationDocumentTest : public PluginFixture {
protected:
    static nlohmann::ordered_json schema() {
        char* text = nullptr;
        HostStatus status;
        plugin().getParameterValidationData(
            [](char* buffer, std::size_t size) {
                return static_cast<char*>(std::realloc(buffer, size));
            },
            &text, &status);
        const std::unique_ptr<char, void (*)(void*)> owner(text, &std::free);
        return nlohmann::ordered_json::parse(text);
    }

    /// Has the library write its file. @return its lines.
    static std::multiset<std::string> write(const Json& configuration) {
        void* slot = nullptr;
        HostStatus status;
        plugin().initialize(&slot, configuration.dump().c_str(), &status);
        EXPECT_EQ(status.code, 0) << status.text();
        if (status.code == 0) {
            plugin().finalize(&slot);
        }
        return linesOf(file);
    }

    /// The option whose line a parameter changes; "none" when it changes no line.
    static std::string optionOf(const std::string& name, const Json& parameter) {
        Json changed = Json::parse(configuration());
        const auto before = write(changed);
        if (name != "configFile") {
            changed[name] = otherValue(parameter);
        }
        std::string option = "none";
        for (const std::string& line : write(changed)) {
            if (before.count(line) == 0) {
                EXPECT_EQ(option, "none") << name << " changes more than one line";
                option = line.substr(0, line.find(' '));
            }
        }
        return option;
    }

    static Json example() { return Json::parse(markdown::blocks(document()).at(0).text); }

    /// What linuxptp's ptp4l says of the file; without an interface it never starts.
    static std::string judgementOf(const Json& configuration) {
        Json here = configuration;
        here["configFile"] = file;
        write(here);
        return outputOf(std::string("/usr/sbin/ptp4l -f ") + file + " 2>&1");
    }
};

TEST_F(ConfigurationDocumentTest, TableIsThatOfTheSchema) {
    std::vector<Parameter> expected;
    const auto parameters = schema();
    for (const auto& [name, parameter] : parameters.items()) {
        expected.push_back({name, parameter["dataType"],
                            name == "transportSpecific" ? "hexadecimal" : rangeOf(parameter),
                            parameter["default"].dump(), optionOf(name, parameter)});
    }
    EXPECT_EQ(expected.size(), 16U);
    expected.push_back({"interface", "array of strings", "any", "none", "none"});
    EXPECT_EQ(documented(), expected);
}

TEST_F(ConfigurationDocumentTest, ExampleIsComplete) {
    std::set<std::string> names;
    for (const auto& parameter : documented()) {
        names.insert(parameter.name);
    }
    std::set<std::string> shown;
    const Json configured = example();
    for (const auto& [name, value] : configured.items()) {
        shown.insert(name);
    }
    EXPECT_EQ(shown, names);
}

TEST_F(ConfigurationDocumentTest, FixedOptionsStandInTheFile) {
    const auto rows = markdown::tables(document(), {"option", "value", "because"});
    EXPECT_FALSE(rows.empty());
    write(Json::parse(configuration()));
    for (const auto& row : rows) {
        const std::string option = unquoted(row.at(0));
        EXPECT_THAT(readFile(file),
                    testing::ContainsRegex("\n" + option + " +" + row.at(1) + "\n"));
    }
}

TEST_F(ConfigurationDocumentTest, NullIsTheEmptyValue) {
    Json configured = Json::parse(configuration());
    for (auto& [name, value] : configured.items()) {
        if (name != "configFile" && name != "transportSpecific" && name != "interface") {
            value = nullptr;
        }
    }
    const auto lines = write(configured);
    EXPECT_EQ(lines.count("priority1               0"), 1U);
    EXPECT_EQ(lines.count("neighborPropDelayThresh 0"), 1U);
    EXPECT_EQ(lines.count("follow_up_info       0"), 1U);
    EXPECT_EQ(lines.count("uds_address       "), 1U);
}

TEST_F(ConfigurationDocumentTest, NullIsAnErrorForTwo) {
    for (const char* name : {"transportSpecific", "interface"}) {
        Json wrong = Json::parse(configuration());
        wrong[name] = nullptr;
        void* slot = nullptr;
        HostStatus status;
        plugin().initialize(&slot, wrong.dump().c_str(), &status);
        EXPECT_LT(status.code, 0) << name;
    }
}

TEST_F(ConfigurationDocumentTest, StockLinuxptpSaysWhatIsShown) {
    if (outputOf("/usr/sbin/ptp4l -v 2>&1").empty() ||
        outputOf("/usr/sbin/ptp4l -v 2>&1").find("not found") != std::string::npos) {
        GTEST_SKIP() << "there is no /usr/sbin/ptp4l (package linuxptp)";
    }
    EXPECT_THAT(judgementOf(example()), HasSubstr("no interface specified"));
    const std::string shown = markdown::blocks(document()).at(2).text;
    const std::string refusal = judgementOf(Json::parse(configuration()));
    EXPECT_EQ(refusal.substr(0, refusal.find('\n')), shown.substr(0, shown.find('\n')));
    for (const auto& row : markdown::tables(
             document(), {"`networkTransport`", "stock linuxptp", "PTP messages in"})) {
        Json configured = example();
        configured["networkTransport"] = row.at(0);
        const bool taken =
            judgementOf(configured).find("no interface specified") != std::string::npos;
        EXPECT_EQ(taken ? "yes" : "no", row.at(1)) << row.at(0);
    }
}

} // namespace
