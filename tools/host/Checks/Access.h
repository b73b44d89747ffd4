/// @file
#pragma once

#include <string>

#include "Checks/Finding.h"

namespace vantelhost {

/// Whether the process may, with its effective user: R_OK, W_OK, X_OK. Else errno says why not.
bool isAllowed(const std::string& path, int mode);

/// The folder of a file is there, and files can be made in it.
/// @param otherMend follows the mend of a missing folder
Finding checkFolderOf(const std::string& file, const char* otherMend = "");

} // namespace vantelhost
