/// @file
#pragma once

#include <string>

/// A fresh folder that is the working folder while this object lives, and is removed with it.
class TemporaryFolder {
public:
    TemporaryFolder();
    ~TemporaryFolder();
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;

    /// Absolute path of the folder, or of something in it.
    std::string path() const { return path_; }
    std::string path(const std::string& name) const { return path_ + "/" + name; }

private:
    std::string previous_;
    std::string path_;
};

/// The whole content of a file; "" when it cannot be read.
std::string readFile(const std::string& path);

/// Replaces the content of a file.
void writeFile(const std::string& path, const std::string& content);
