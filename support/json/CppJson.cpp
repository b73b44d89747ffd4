#include "json/CppJson.h"

#include "errors/Exception.h"

namespace zekelVantel {

CppJson::CppJson(const std::string& text) : root_(cJSON_Parse(text.c_str())) {
    if (root_ == nullptr) {
        zeerr::throwError(zeerr::site::jsonInvalid);
    }
}

} // namespace zekelVantel
