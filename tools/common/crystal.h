// The structure description shared by the two stand-in programs: what cif_parser
// writes to morvel.in and what morvel reads back (the "Hand-made" input format,
// described in tools/README.md).
#pragma once

#include <array>
#include <string>
#include <vector>

namespace standin {

struct Site {
    std::string label;
    std::string symbol;              // type symbol as given, e.g. Na, Ti4+
    double charge = 0.0;             // oxidation number
    std::array<double, 3> fract{};   // fractional coordinates
    double occupancy = 1.0;
};

struct Crystal {
    std::string title;
    std::array<double, 6> cell{};    // a b c in angstrom, alpha beta gamma in degrees
    std::vector<std::string> symops; // "x,y,z" triplets, in file order
    std::vector<Site> sites;         // the asymmetric unit
};

// Checks six cell parameters; returns an empty string when they describe a real
// cell, else the reason.
std::string checkCell(const std::array<double, 6>& cell);

// Checks one symmetry operation written as a triplet ("-y,x-y,z+1/2"); returns an
// empty string when it can be used, else the reason.
std::string checkSymop(const std::string& triplet);

// The morvel.in text of a crystal.
std::string formatMorvelIn(const Crystal& crystal);

// Reads morvel.in text. On failure returns false and sets error to a reason that
// names the line.
bool parseMorvelIn(const std::string& text, Crystal& crystal, std::string& error);

// Number formatting used by both programs: C locale, shortest round-trip-free
// "%.*g" form.
std::string formatNumber(double value, int precision = 6);

} // namespace standin
