#include "errors/Exception.h"

#include <cstdarg>
#include <cstdio>
#include <new>

#include "errors/ErrorText.h"

namespace zeerr {
namespace {

/// Writes what every error has in common. @return the position for more members.
char* beginError(Status& status, const ErrorSite& site, Resizer& resizer) {
    char* position = beginMembers(status);
    position = addString(position, "error_constant", site.constant, resizer);
    return addSourceLocation(position, site.file, site.line, component, resizer);
}

void setErrorWithMember(Status& status, const ErrorSite& site, const char* key, const char* value) {
    if (!setCode(status, site.code)) {
        return;
    }
    Resizer resizer(status);
    char* position = beginError(status, site, resizer);
    if (value != nullptr) {
        addString(position, key, value, resizer);
    }
}

} // namespace

ExceptionBase::ExceptionBase(Status& status) {
    merge(status_, status);
}

ExceptionBase::ExceptionBase(const ExceptionBase& other) noexcept {
    setCode(status_, other.status_.code);
    copyText(status_, other.status_);
}

ExceptionBase::~ExceptionBase() = default;

const char* ExceptionBase::what() const noexcept {
    return status_.json == nullptr ? "" : status_.json;
}

Exception::~Exception() = default;

const char* Exception::what() const noexcept {
    return ExceptionBase::what();
}

void setError(Status& status, const ErrorSite& site, const char* additionalInfo) {
    setErrorWithMember(status, site, "additionalInfo", additionalInfo);
}

void setErrorWithInfo(Status& status, const ErrorSite& site, const char* format, ...) {
    char text[512];
    std::va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(text, sizeof(text), format, arguments);
    va_end(arguments);
    setError(status, site, text);
}

void throwError(const ErrorSite& site) {
    LocalStatus status;
    setError(status, site);
    throw Exception(status);
}

void throwIfError(Status& status) {
    if (isError(status)) {
        throw Exception(status);
    }
}

void statusFromCurrentException(Status& status) noexcept {
    constexpr char what[] = "std_exception_what";
    try {
        throw;
    } catch (ExceptionBase& exception) {
        merge(status, exception.status());
    } catch (const std::bad_alloc& exception) {
        setErrorWithMember(status, site::badAlloc, what, exception.what());
    } catch (const std::exception& exception) {
        setErrorWithMember(status, site::standardException, what, exception.what());
    } catch (...) {
        setError(status, site::unknownException);
    }
}

} // namespace zeerr
