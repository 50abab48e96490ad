#include "par_file.h"

#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <sstream>
#include <vector>

namespace standin {

namespace {

bool toReal(const std::string& s, double& v)
{
    const char* b = s.c_str();
    char* e = nullptr;
    errno = 0;
    v = std::strtod(b, &e);
    return e != b && *e == '\0' && errno == 0 && std::isfinite(v);
}

bool toInt(const std::string& s, int& v)
{
    const char* b = s.c_str();
    char* e = nullptr;
    errno = 0;
    long l = std::strtol(b, &e, 10);
    if (e == b || *e != '\0' || errno != 0 || l < -1000000 || l > 1000000)
        return false;
    v = int(l);
    return true;
}

} // namespace

bool parseParameters(const std::string& fileText, Parameters& p, std::string& error)
{
    static const char* const names[11] = {"DMAX", "INPUT", "PRINT TYPE", "OUTPUT", "POLYHEDRA DETAILS",
                                          "TOLERANCE", "field 7", "THRESH", "MAX V-ATOMS", "field 10",
                                          "field 11"};
    p = Parameters();
    size_t eol = fileText.find('\n');
    std::string line1 = fileText.substr(0, eol);
    if (!line1.empty() && line1.back() == '\r')
        line1.pop_back();
    if (eol != std::string::npos) {
        std::string rest = fileText.substr(eol + 1);
        if (!rest.empty() && rest[0] == ' ')
            rest.erase(0, 1);
        while (!rest.empty() && (rest.back() == '\n' || rest.back() == '\r'))
            rest.pop_back();
        p.text = rest;
    }

    std::istringstream in(line1);
    std::vector<std::string> w;
    std::string word;
    while (in >> word)
        w.push_back(word);
    if (w.size() != 11) {
        error = "morvel.par line 1 has " + std::to_string(w.size()) + " fields; it needs 11: "
                "DMAX INPUT PRINTTYPE OUTPUT POLYDETAILS TOLERANCE 1.6 THRESH MAXVATOMS .001 0.5";
        return false;
    }
    for (int i = 0; i < 11; ++i)
        p.fields[i] = w[i];

    double* reals[11] = {&p.dmax, nullptr, nullptr, nullptr, nullptr, &p.tolerance, &p.field7, &p.thresh,
                         nullptr, nullptr, &p.field11};
    int* ints[11] = {nullptr, &p.input, &p.printType, &p.output, &p.polyhedraDetails, nullptr, nullptr,
                     nullptr, &p.maxVAtoms, nullptr, nullptr};
    for (int i = 0; i < 11; ++i) {
        bool ok = true;
        if (reals[i])
            ok = toReal(w[i], *reals[i]);
        else if (ints[i])
            ok = toInt(w[i], *ints[i]);
        if (!ok) {
            error = std::string("morvel.par: ") + names[i] + " = '" + w[i] + "' is not " +
                    (reals[i] ? "a number" : "an integer");
            return false;
        }
    }
    p.field10 = w[9];
    if (p.input < 0 || p.input > 2) {
        error = "morvel.par: INPUT = " + w[1] + " is not 0 (CIF), 1 (hand-made) or 2 (old ICSD)";
        return false;
    }
    if (p.output < -1 || p.output > 1) {
        error = "morvel.par: OUTPUT = " + w[3] + " is not -1, 0 or 1";
        return false;
    }
    if (!(p.dmax > 0)) {
        error = "morvel.par: DMAX = " + w[0] + " must be greater than 0";
        return false;
    }
    return true;
}

} // namespace standin
