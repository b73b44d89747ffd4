#include "json/ArrayIterator.h"

#include "errors/Exception.h"
#include "json/cJSONUtils.h"

namespace zekelVantel {

ArrayIterator::ArrayIterator(const cJSON* array) {
    if (!isArray(array)) {
        zeerr::throwError(zeerr::site::jsonNotAnArray);
    }
    current_ = array->child;
}

const cJSON* ArrayIterator::operator*() const {
    if (atEnd()) {
        zeerr::throwError(zeerr::site::jsonOutOfBounds);
    }
    return current_;
}

ArrayIterator& ArrayIterator::operator++() {
    if (!atEnd()) {
        current_ = current_->next;
    }
    return *this;
}

} // namespace zekelVantel
