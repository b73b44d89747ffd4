#include "Report/RecordFiles.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <optional>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <unistd.h>

#include "Json.h"
#include "Moment.h"
#include "RotatedName.h"
#include "Text.h"
#include "UsageError.h"

namespace vantelhost {

namespace {

namespace fs = std::filesystem;

/// When a file begins: the start of its run, the seconds since then.
using Key = std::pair<std::uint64_t, double>;

struct File {
    std::string path;
    unsigned number = 0; ///< of the rotation
    std::string firstLine;
    std::optional<Key> key; ///< none when the first line is no event
};

/// All of one name, the oldest first.
using Family = std::vector<File>;
using Families = std::map<std::string, Family>;

std::optional<Key> keyOf(const std::string& text) {
    const Json line = Json::parse(text, nullptr, false);
    if (!line.is_object() || !line.contains("event")) {
        return std::nullopt;
    }
    try {
        const Moment moment{line.at("t").get<double>(), line.at("time").get<std::uint64_t>()};
        return Key{line.value("begin", beginOf(moment)), moment.seconds};
    } catch (const Json::exception&) {
        return std::nullopt;
    }
}

[[noreturn]] void refuse(const std::string& path, int error) {
    throw UsageError(fmt::format("cannot read {}: {}", path, errorText(error)));
}

/// The first line; nothing of a file that can be read only once, and of a line that is none.
/// Throws UsageError when the file cannot be read.
std::string firstLineOf(const std::string& path) {
    constexpr std::streamsize longest = 1 << 20;
    std::error_code ignored;
    if (!fs::is_regular_file(path, ignored)) {
        if (::access(path.c_str(), R_OK) != 0) {
            refuse(path, errno);
        }
        return "";
    }
    std::string line(static_cast<std::size_t>(longest), '\0');
    std::ifstream stream = openRecord(path);
    stream.getline(line.data(), longest);
    line.resize(stream.good() ? static_cast<std::size_t>(stream.gcount()) - 1 : 0);
    return line;
}

File lookedAt(const std::string& path, unsigned number) {
    auto line = firstLineOf(path);
    auto key = keyOf(line);
    return {path, number, std::move(line), key};
}

bool hasKey(const Family& family) {
    return std::any_of(family.begin(), family.end(),
                       [](const File& file) { return file.key.has_value(); });
}

Key firstKey(const Family& family) {
    return *std::find_if(family.begin(), family.end(), [](const File& file) {
                return file.key.has_value();
            })->key;
}

bool isSame(const File& a, const File& b) {
    std::error_code ignored;
    return fs::equivalent(a.path, b.path, ignored);
}

void add(Families& families, const std::string& path) {
    const auto [base, number] = rotatedName(path);
    families[base].push_back(lookedAt(path, number));
}

std::vector<std::string> filesIn(const std::string& folder) {
    std::vector<std::string> paths;
    std::error_code error;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        std::error_code ignored;
        if (entry->is_regular_file(ignored)) {
            paths.push_back(entry->path().string());
        }
    }
    if (error) {
        throw UsageError(fmt::format("cannot read {}: {}", folder, error.message()));
    }
    return paths;
}

/// A rotation that was cut short leaves one file with two names.
void addFolder(Families& families, const std::string& folder) {
    Families found;
    for (const auto& path : filesIn(folder)) {
        add(found, path);
    }
    bool isEmpty = true;
    for (auto& [base, family] : found) {
        if (!hasKey(family)) {
            continue;
        }
        isEmpty = false;
        auto& all = families[base];
        for (auto& file : family) {
            if (std::none_of(all.begin(), all.end(),
                             [&](const File& each) { return isSame(each, file); })) {
                all.push_back(std::move(file));
            }
        }
    }
    if (isEmpty) {
        throw UsageError(fmt::format("there is no record in {}", folder));
    }
}

void refuseTwice(const std::vector<File>& files) {
    std::map<std::string, const File*> seen;
    for (const auto& file : files) {
        const auto [place, isNew] = seen.emplace(file.firstLine, &file);
        const bool isAgain = !isNew && file.key;
        if (isAgain) {
            throw UsageError(
                fmt::format("{} and {} hold the same record", place->second->path, file.path));
        }
    }
}

/// Takes the files out of the families.
std::vector<File> inOrder(Families& families) {
    std::vector<Family> all;
    for (auto& [base, family] : families) {
        std::stable_sort(family.begin(), family.end(),
                         [](const File& a, const File& b) { return a.number > b.number; });
        all.push_back(std::move(family));
    }
    if (std::all_of(all.begin(), all.end(), hasKey)) {
        std::stable_sort(all.begin(), all.end(), [](const Family& a, const Family& b) {
            return firstKey(a) < firstKey(b);
        });
    }
    std::vector<File> files;
    for (auto& family : all) {
        std::move(family.begin(), family.end(), std::back_inserter(files));
    }
    return files;
}

} // namespace

std::vector<std::string> findRecords(const std::vector<std::string>& paths) {
    Families families;
    for (const auto& path : paths) {
        std::error_code ignored;
        if (fs::is_directory(path, ignored)) {
            addFolder(families, path);
        } else {
            add(families, path);
        }
    }
    auto files = inOrder(families);
    refuseTwice(files);
    std::vector<std::string> found;
    found.reserve(files.size());
    for (auto& file : files) {
        found.push_back(std::move(file.path));
    }
    return found;
}

std::ifstream openRecord(const std::string& path) {
    std::ifstream stream(path, std::ios::binary);
    if (!stream) {
        refuse(path, errno);
    }
    return stream;
}

} // namespace vantelhost
