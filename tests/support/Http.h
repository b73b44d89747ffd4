/// @file
#pragma once

#include <string>

/// What a server of HTTP on this machine answers.
/// @return the body of an answer with status 200; empty when there is none within 5 s.
std::string httpGet(int port, const std::string& target);

/// The text as a part of a target.
std::string percentEncoded(const std::string& text);
