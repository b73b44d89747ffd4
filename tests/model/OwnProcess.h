/// @file
#pragma once

#include <functional>
#include <string>

/// Runs something in a child of this process, with a fresh working folder.
/// @return what went wrong: how the child ended, and what it, or a sanitizer, wrote on stderr.
/// Empty when
///         nothing did.
std::string failureInOwnProcess(const std::function<void()>& deed);
