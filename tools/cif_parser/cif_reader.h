// Reading a CIF file into the stand-ins' structure description.
#pragma once

#include "crystal.h"

#include <string>
#include <vector>

namespace standin {

// Reads the first data block of the CIF file at path that holds atom sites (or
// the first block when none does). Diagnostics are appended to log, one line
// each. On failure returns false and sets error to the reason.
bool readCif(const std::string& path, Crystal& crystal, std::vector<std::string>& log,
             std::string& error);

} // namespace standin
