/// @file
/// The exceptions of the plug-in, raising them, and turning whatever is in flight into a status.
#pragma once

#include <exception>

#include "errors/ErrorSites.h"
#include "errors/Status.h"

namespace zeerr {

/// Carries one status.
class ExceptionBase {
public:
    /// Takes the outcome over: the text moves if it has the plug-in's own resize operation, else it
    /// is copied.
    explicit ExceptionBase(Status& status);

    /// Copies the outcome: both exceptions then have a text of their own.
    ExceptionBase(const ExceptionBase& other) noexcept;
    ExceptionBase& operator=(const ExceptionBase&) = delete;
    virtual ~ExceptionBase();

    /// The JSON text, or "" when there is none.
    virtual const char* what() const noexcept;

    Status& status() { return status_; }

private:
    LocalStatus status_;
};

/// The only exception that the plug-in throws.
class Exception : public virtual ExceptionBase, public virtual std::exception {
public:
    explicit Exception(Status& status) : ExceptionBase(status) {}
    Exception(const Exception& other) noexcept = default;
    Exception& operator=(const Exception&) = delete;
    ~Exception() override;

    /// The same text, also for those who catch std::exception.
    const char* what() const noexcept override;
};

/// Records an error in a status that has none yet: code, constant, source location, component and,
/// if given, "additionalInfo". A status that holds an error stays as it is.
[[gnu::cold]] void setError(Status& status, const ErrorSite& site,
                            const char* additionalInfo = nullptr);

/// As setError, with an "additionalInfo" formatted printf-style.
[[gnu::cold, gnu::format(printf, 3, 4)]] void
setErrorWithInfo(Status& status, const ErrorSite& site, const char* format, ...);

/// Throws a zeerr::Exception with the error.
[[noreturn]] void throwError(const ErrorSite& site);

/// Throws a zeerr::Exception built from the status, if that holds an error.
void throwIfError(Status& status);

/// To be called in a catch-all handler: records the exception in flight in a status, which keeps an
/// error that it already holds.
void statusFromCurrentException(Status& status) noexcept;

} // namespace zeerr
