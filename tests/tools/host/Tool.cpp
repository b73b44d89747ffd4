#include "Tool.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>

#include "support/Child.h"

using vantelhost::Json;

Folder::Folder() : path_((std::filesystem::temp_directory_path() / "host_tests.XXXXXX").string()) {
    if (::mkdtemp(path_.data()) == nullptr) {
        throw std::runtime_error("mkdtemp " + path_);
    }
}

Folder::~Folder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
}

std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

void writeFile(const std::string& path, const std::string& content) {
    std::ofstream(path, std::ios::binary) << content;
}

namespace {

std::vector<std::string> linesOf(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

} // namespace

std::vector<Json> Result::events() const {
    std::vector<Json> all;
    for (const auto& line : linesOf(output)) {
        const Json event = Json::parse(line, nullptr, false);
        EXPECT_TRUE(event.is_object() && event.contains("event") && event.contains("t")) << line;
        all.push_back(event);
    }
    return all;
}

std::vector<Json> Result::events(const std::string& name) const {
    std::vector<Json> some;
    for (const auto& event : events()) {
        if (event.value("event", "") == name) {
            some.push_back(event);
        }
    }
    return some;
}

Words ToolTest::command(const Words& options) const {
    Words words{HOST_TOOL,   "run",   "--library",
                FAKE_PLUGIN, "--set", "record=" + folder.path("record")};
    words.insert(words.end(), options.begin(), options.end());
    return words;
}

Result ToolTest::run(const Words& options, const std::string& input) const {
    Child child(command(options));
    child.write(input);
    const int status = child.wait();
    return {status, child.output(), child.errors()};
}

Result ToolTest::play(const std::string& script, const Words& options) const {
    Words words{"--json", "--interface", "eth0", "--set", "script=" + script};
    words.insert(words.end(), options.begin(), options.end());
    if (std::find(options.begin(), options.end(), "--seconds") == options.end()) {
        words.insert(words.end(), {"--seconds", "0"});
    }
    return run(words);
}

std::vector<std::string> ToolTest::record() const {
    return linesOf(contentOf(folder.path("record")));
}

Json ToolTest::configuration() const {
    const std::string prefix = "initialise ";
    for (const auto& line : record()) {
        if (line.compare(0, prefix.size(), prefix) == 0) {
            return Json::parse(line.substr(prefix.size()));
        }
    }
    return nullptr;
}
