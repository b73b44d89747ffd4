/// @file
/// What the tests with linuxptp's ptp4l have in common: the scene that scripts/testbed.sh provides.
#pragma once

#include <string>
#include <vector>

/// A variable of the scene; "" when it is not set.
std::string sceneVariable(const char* name);

/// The boundary clock's interfaces.
std::vector<std::string> sceneInterfaces();

/// The boundary clock's management socket.
std::string sceneSocket();

/// A protocol configuration with which ptp4l follows the scene's grandmaster.
std::string sceneConfiguration();
