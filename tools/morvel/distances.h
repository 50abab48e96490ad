// Interatomic distances of a crystal up to a maximum distance, over all images
// that the symmetry operations and the lattice translations make.
#pragma once

#include "crystal.h"

#include <array>
#include <string>
#include <vector>

namespace standin {

struct Neighbour {
    int site = 0;                 // index of the asymmetric-unit site it is an image of
    int op = 0;                   // 0-based index into DistanceResult::symops
    std::array<int, 3> shift{};   // lattice translation: position = op(site) + shift
    double distance = 0;
};

struct DistanceResult {
    std::vector<std::string> symops;               // the crystal's, with x,y,z added when it lacked it
    double volume = 0;                             // cell volume, cubic angstrom
    std::vector<int> multiplicity;                 // distinct images of each site in the cell
    std::vector<std::vector<Neighbour>> neighbours; // per site, sorted by distance
};

// Above this many candidate positions the job is refused rather than left to run
// for minutes (a huge DMAX against a tiny cell).
constexpr double kMaxCandidates = 2e7;

// On failure returns false and sets error to the reason.
bool computeDistances(const Crystal& crystal, double dmax, DistanceResult& result, std::string& error);

// ORTEP-style image code: the operation's number (1-based) and 5 plus each
// translation, "3_564"; translations beyond +-4 are written out, "3_(6,0,-1)".
std::string symmetryCode(int op, const std::array<int, 3>& shift);

} // namespace standin
