// MORVEL.OUT: plain text, or HTML for the verbose level.
#pragma once

#include "crystal.h"
#include "distances.h"
#include "par_file.h"

#include <string>

namespace standin {

// What the run got to: parameters (null when morvel.par could not be read), the
// structure and its distances (null when not reached), and the reason the run
// stopped (empty on success).
struct RunOutcome {
    const Parameters* params = nullptr;
    const Crystal* crystal = nullptr;
    const DistanceResult* distances = nullptr;
    std::string failure;
};

std::string formatReport(const RunOutcome& run);

} // namespace standin
