/// @file
/// What may be asked at any time, from any thread.
#pragma once

#include <cstdint>
#include <string>

#include "contract/PluginFixture.h"

/// The text of an error that a status has on entry.
inline constexpr char ownError[] = R"({"mine":1})";

/// Expects the answers that are promised.
void expectAnswers(const Plugin& plugin);

/// The same, for a host that has no memory for the schema, or comes with an error.
void expectRefusedAnswers(const Plugin& plugin);

/// Expects what a call has left in its status.
void expectStatus(const HostStatus& status, std::int32_t code, const std::string& text);
