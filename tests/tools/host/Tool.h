/// @file
#pragma once

#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Json.h"

/// A fresh folder, removed with this object.
class Folder {
public:
    Folder();
    ~Folder();
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    std::string path(const std::string& name) const { return path_ + "/" + name; }

private:
    std::string path_;
};

std::string contentOf(const std::string& path);
void writeFile(const std::string& path, const std::string& content);

struct Result {
    int status;
    std::string output;
    std::string errors;

    /// The output as JSON Lines. A line that is not a JSON object fails the test.
    std::vector<vantelhost::Json> events() const;

    /// The events of one name.
    std::vector<vantelhost::Json> events(const std::string& name) const;
};

using Words = std::vector<std::string>;

/// The program, with the fake plug-in. Every run keeps the plug-in's record.
class ToolTest : public testing::Test {
protected:
    /// The command "run" with the fake plug-in, a record and the given options.
    Words command(const Words& options) const;

    /// Runs the program to its end.
    Result run(const Words& options, const std::string& input = {}) const;

    /// The same with JSON Lines, one interface and a script for the plug-in; ends at once unless
    /// the options say when.
    Result play(const std::string& script, const Words& options = {}) const;

    /// What the plug-in was told, line by line.
    std::vector<std::string> record() const;

    /// The configuration that the plug-in got.
    vantelhost::Json configuration() const;

    Folder folder;
};
