/// @file
#pragma once

#include <memory>
#include <string>

#include <cjson/cJSON.h>

namespace zekelVantel {

/// Owns a parsed JSON document.
class CppJson {
public:
    /// @throws zeerr::Exception "jsonErrorsInvalidJSON" when the text does not parse.
    explicit CppJson(const std::string& text);

    /// The root item. It stays owned by this object.
    const cJSON* root() const { return root_.get(); }

    /// Releases the document: root() is null afterwards.
    void reset() { root_.reset(); }

private:
    struct Delete {
        void operator()(cJSON* item) const { cJSON_Delete(item); }
    };
    std::unique_ptr<cJSON, Delete> root_;
};

} // namespace zekelVantel
