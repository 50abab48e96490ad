// morvel.par as the dialog writes it: line 1 holds eleven blank-separated fields,
// line 2 (optional) one blank and the text of morvelpartxt.txt.
#pragma once

#include <array>
#include <string>

namespace standin {

struct Parameters {
    std::array<std::string, 11> fields; // as read, for the echo
    double dmax = 0;
    int input = 0;        // 0 CIF converted, 1 hand-made, 2 old ICSD
    int printType = 0;
    int output = 0;       // 0 normal, 1 verbose (HTML), -1 ionic radii tables
    int polyhedraDetails = 0;
    double tolerance = 0;
    double field7 = 0;
    double thresh = 0;
    int maxVAtoms = 0;
    std::string field10;
    double field11 = 0;
    std::string text;     // line 2 and after, without the leading blank
};

// On failure returns false and sets error to the reason.
bool parseParameters(const std::string& fileText, Parameters& p, std::string& error);

} // namespace standin
