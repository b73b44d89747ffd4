#include "Settings.h"

#include <algorithm>
#include <map>
#include <set>
#include <sstream>

#include <fmt/format.h>
#include <strings.h>

#include "Text.h"

namespace vantelhost {

namespace {

constexpr char interfaceKey[] = "interface";

/// The line of the octet before which `count` others stand.
std::size_t lineAt(const std::string& text, std::size_t count) {
    const auto end = text.begin() + static_cast<std::ptrdiff_t>(std::min(count, text.size()));
    return static_cast<std::size_t>(std::count(text.begin(), end, '\n')) + 1;
}

/// Gathers the settings of all sources, then sorts them out by the schema.
class Completion {
public:
    Completion(const Schema& schema, const UserSettings& user) : schema_(schema), user_(user) {}

    Settings run() {
        if (user_.text && !readText(*user_.text)) {
            return std::move(settings_);
        }
        for (const auto& entry : user_.entries) {
            take(entry);
        }
        for (const auto& assignment : user_.assignments) {
            assign(assignment);
        }
        takeInterfaces();
        takeParameters();
        checkInterfaces();
        takeTheRest();
        return std::move(settings_);
    }

private:
    void error(const std::string& key, const std::string& problem) {
        if (bad_.insert(key).second) {
            settings_.errors.push_back(fmt::format("{}{}: {}", placeOf(key), key, problem));
        }
    }

    /// File and line of a key's value; empty when it is not from the file.
    std::string placeOf(const std::string& key) const {
        const auto place = places_.find(key);
        return place == places_.end() ? "" : place->second + ": ";
    }

    /// @return false when the text has no settings to go on with.
    bool readText(const std::string& text) {
        std::istringstream stream(text);
        const auto line = [&] {
            return lineAt(text, text.size() - static_cast<std::size_t>(stream.rdbuf()->in_avail()));
        };
        const auto watchKeys = [&](int depth, Json::parse_event_t event, Json& value) {
            if (event == Json::parse_event_t::key && depth == 1) {
                const auto key = value.get<std::string>();
                const auto place = fmt::format("{}:{}", user_.textName, line());
                if (!places_.insert_or_assign(key, place).second) {
                    error(key, "is given twice");
                }
            }
            return true;
        };
        try {
            given_ = Json::parse(stream, watchKeys);
        } catch (const Json::exception& failure) {
            settings_.errors.push_back(
                fmt::format("{}:{}: {}", user_.textName, line(), failure.what()));
            return false;
        }
        if (!given_.is_object()) {
            settings_.errors.push_back(
                fmt::format("{}:1: must be a JSON object, not {}", user_.textName, shown(given_)));
        }
        return given_.is_object();
    }

    /// A file that can say all is wrong where it says what nobody knows.
    void take(const ConfigEntry& entry) {
        const std::string& key = entry.key;
        const auto* parameter = find(schema_, key);
        const bool isNew = places_.insert_or_assign(key, entry.place).second;
        if (key == interfaceKey) {
            error(key, "is no setting but an option, and stands above [settings]");
        } else if (parameter == nullptr) {
            error(key, "is unknown to the plug-in" + hint(key));
        } else if (!isNew) {
            error(key, "is given twice");
        } else if (entry.isArray) {
            given_[key] = entry.values;
        } else {
            given_[key] = valueFromText(*parameter, entry.values.at(0));
        }
    }

    void assign(const std::string& assignment) {
        const auto equals = assignment.find('=');
        const std::string key = assignment.substr(0, equals);
        if (equals == std::string::npos || key.empty()) {
            settings_.errors.push_back(fmt::format("{}: must be key=value", assignment));
            return;
        }
        const std::string value = assignment.substr(equals + 1);
        places_.erase(key);
        if (!isUtf8(assignment)) {
            error(toAscii(key), "is not UTF-8 text");
        } else if (key == interfaceKey) {
            error(key, "is set with --interface");
        } else if (const auto* parameter = find(schema_, key)) {
            given_[key] = valueFromText(*parameter, value);
        } else {
            const Json parsed = Json::parse(value, nullptr, false);
            given_[key] = parsed.is_discarded() ? Json(value) : parsed;
        }
    }

    void takeInterfaces() {
        if (!std::all_of(user_.interfaces.begin(), user_.interfaces.end(), isUtf8)) {
            error(interfaceKey, "is not UTF-8 text");
        } else if (!user_.interfaces.empty()) {
            places_.erase(interfaceKey);
            given_[interfaceKey] = user_.interfaces;
        }
    }

    void takeParameters() {
        for (const auto& parameter : schema_) {
            const auto found = given_.find(parameter.key);
            const Json& value = found == given_.end() ? parameter.defaultValue : *found;
            const std::string problem = complaint(parameter, value);
            if (!problem.empty()) {
                error(parameter.key, problem);
            }
            settings_.values[parameter.key] = value;
        }
    }

    void checkInterfaces() {
        const bool given = given_.contains(interfaceKey);
        const Json value = given ? given_[interfaceKey] : Json::array();
        const auto isName = [](const Json& each) {
            return each.is_string() && !each.get_ref<const std::string&>().empty();
        };
        if (!given && user_.interfacesRequired) {
            error(interfaceKey, "is missing: name at least one, as with --interface eth0");
        } else if (!value.is_array() || !std::all_of(value.begin(), value.end(), isName)) {
            error(interfaceKey, "must be an array of names, not " + shown(value));
        } else if (value.empty() && user_.interfacesRequired) {
            error(interfaceKey, "must name at least one interface");
        }
        settings_.values[interfaceKey] = value;
    }

    /// Unknown keys come last: a plug-in that is less strict about names finds the known key first.
    void takeTheRest() {
        for (const auto& [key, value] : given_.items()) {
            if (settings_.values.contains(key)) {
                continue;
            }
            settings_.warnings.push_back(
                fmt::format("{}{}: is unknown to the plug-in{}, passed on as it is", placeOf(key),
                            key, hint(key)));
            settings_.values[key] = value;
        }
    }

    std::string hint(const std::string& key) const {
        for (const auto& parameter : schema_) {
            if (strcasecmp(parameter.key.c_str(), key.c_str()) == 0) {
                return fmt::format(" (\"{}\" is meant?)", parameter.key);
            }
        }
        return {};
    }

    const Schema& schema_;
    const UserSettings& user_;
    Json given_ = Json::object();
    std::map<std::string, std::string> places_; ///< of the keys whose value is from the file
    std::set<std::string> bad_;
    Settings settings_;
};

} // namespace

Settings completeSettings(const Schema& schema, const UserSettings& user) {
    return Completion(schema, user).run();
}

} // namespace vantelhost
