/// @file
#pragma once

#include <unistd.h>

/// While it lives the process has no rights of root.
class OrdinaryUser {
public:
    OrdinaryUser() : user_(::geteuid()) {
        constexpr uid_t nobody = 65534;
        isOne_ = user_ != 0 || ::seteuid(nobody) == 0;
    }
    ~OrdinaryUser() { static_cast<void>(::seteuid(user_)); }
    OrdinaryUser(const OrdinaryUser&) = delete;
    OrdinaryUser& operator=(const OrdinaryUser&) = delete;

    /// False where a user may not be changed.
    bool isOne() const { return isOne_; }

private:
    const uid_t user_;
    bool isOne_;
};
