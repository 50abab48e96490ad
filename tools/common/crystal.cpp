#include "crystal.h"

#include <gemmi/symmetry.hpp>

#include <cctype>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <sstream>

namespace standin {

namespace {

const double kPi = 3.14159265358979323846;

std::string upper(std::string s)
{
    for (char& c : s)
        c = char(std::toupper(static_cast<unsigned char>(c)));
    return s;
}

std::string trim(const std::string& s)
{
    size_t b = s.find_first_not_of(" \t\r\n");
    if (b == std::string::npos)
        return std::string();
    size_t e = s.find_last_not_of(" \t\r\n");
    return s.substr(b, e - b + 1);
}

// A number as the hand-made format allows it: a decimal number, or a fraction
// such as 1/3 or -2/3 so that special positions can be written exactly.
bool parseReal(const std::string& text, double& value)
{
    if (text.empty())
        return false;
    const char* begin = text.c_str();
    char* end = nullptr;
    double v = std::strtod(begin, &end);
    if (end == begin)
        return false;
    if (*end == '/') {
        const char* denBegin = end + 1;
        char* denEnd = nullptr;
        double den = std::strtod(denBegin, &denEnd);
        if (denEnd == denBegin || *denEnd != '\0' || den == 0.0)
            return false;
        v /= den;
        end = denEnd;
    }
    if (*end != '\0' || !std::isfinite(v))
        return false;
    value = v;
    return true;
}

std::vector<std::string> splitWords(const std::string& line)
{
    std::istringstream in(line);
    std::vector<std::string> words;
    std::string w;
    while (in >> w)
        words.push_back(w);
    return words;
}

} // namespace

std::string formatNumber(double value, int precision)
{
    char buf[64];
    std::snprintf(buf, sizeof buf, "%.*g", precision, value);
    std::string s(buf);
    if (s == "-0")
        s = "0";
    return s;
}

std::string checkCell(const std::array<double, 6>& cell)
{
    for (int i = 0; i < 3; ++i)
        if (!(cell[i] > 0.0) || !std::isfinite(cell[i]))
            return "cell length " + formatNumber(cell[i]) + " is not a positive number";
    for (int i = 3; i < 6; ++i)
        if (!(cell[i] > 0.0 && cell[i] < 180.0))
            return "cell angle " + formatNumber(cell[i]) + " is not between 0 and 180 degrees";
    double ca = std::cos(cell[3] * kPi / 180), cb = std::cos(cell[4] * kPi / 180),
           cg = std::cos(cell[5] * kPi / 180);
    double v2 = 1 - ca * ca - cb * cb - cg * cg + 2 * ca * cb * cg;
    // Angles that cannot close a parallelepiped (e.g. 90 90 179) give no volume.
    if (!(v2 > 1e-6))
        return "the cell angles do not describe a cell with a volume";
    return std::string();
}

std::string checkSymop(const std::string& triplet)
{
    try {
        gemmi::Op op = gemmi::parse_triplet(triplet);
        int det = op.det_rot();
        if (std::abs(det) != gemmi::Op::DEN * gemmi::Op::DEN * gemmi::Op::DEN)
            return "symmetry operation '" + triplet + "' is not a symmetry operation";
    } catch (const std::exception& e) {
        return "symmetry operation '" + triplet + "' cannot be read (" + e.what() + ")";
    }
    return std::string();
}

std::string formatMorvelIn(const Crystal& crystal)
{
    std::ostringstream out;
    out << "# morvel.in -- structure input of the MORVEL stand-in (hand-made format)\n";
    if (!crystal.title.empty())
        out << "TITLE " << crystal.title << "\n";
    out << "CELL";
    for (double v : crystal.cell)
        out << ' ' << formatNumber(v, 10);
    out << "\n";
    for (const std::string& op : crystal.symops)
        out << "SYMOP " << op << "\n";
    for (const Site& s : crystal.sites) {
        out << "ATOM " << s.label << ' ' << s.symbol << ' ' << formatNumber(s.charge);
        for (double f : s.fract)
            out << ' ' << formatNumber(f, 10);
        out << ' ' << formatNumber(s.occupancy) << "\n";
    }
    return out.str();
}

bool parseMorvelIn(const std::string& text, Crystal& crystal, std::string& error)
{
    crystal = Crystal();
    bool haveCell = false;
    std::istringstream in(text);
    std::string raw;
    int lineNo = 0;
    auto fail = [&](const std::string& why) {
        error = "morvel.in line " + std::to_string(lineNo) + ": " + why;
        return false;
    };
    while (std::getline(in, raw)) {
        ++lineNo;
        std::string line = trim(raw);
        if (line.empty() || line[0] == '#')
            continue;
        size_t cut = line.find_first_of(" \t");
        std::string key = upper(line.substr(0, cut));
        std::string rest = cut == std::string::npos ? std::string() : trim(line.substr(cut));
        if (key == "TITLE") {
            crystal.title = rest;
        } else if (key == "CELL") {
            if (haveCell)
                return fail("a second CELL line");
            std::vector<std::string> w = splitWords(rest);
            if (w.size() != 6)
                return fail("CELL needs six numbers: a b c alpha beta gamma");
            for (int i = 0; i < 6; ++i)
                if (!parseReal(w[i], crystal.cell[i]))
                    return fail("'" + w[i] + "' is not a number");
            std::string why = checkCell(crystal.cell);
            if (!why.empty())
                return fail(why);
            haveCell = true;
        } else if (key == "SYMOP") {
            std::string op;
            for (char c : rest)
                if (c != ' ' && c != '\t')
                    op += c;
            std::string why = op.empty() ? std::string("SYMOP needs an operation such as -x,-y,z+1/2")
                                         : checkSymop(op);
            if (!why.empty())
                return fail(why);
            crystal.symops.push_back(op);
        } else if (key == "ATOM") {
            std::vector<std::string> w = splitWords(rest);
            if (w.size() != 6 && w.size() != 7)
                return fail("ATOM needs: label symbol charge x y z [occupancy]");
            Site s;
            s.label = w[0];
            s.symbol = w[1];
            if (!parseReal(w[2], s.charge))
                return fail("charge '" + w[2] + "' is not a number");
            for (int i = 0; i < 3; ++i)
                if (!parseReal(w[3 + i], s.fract[i]))
                    return fail("coordinate '" + w[3 + i] + "' is not a number");
            if (w.size() == 7 && (!parseReal(w[6], s.occupancy) || s.occupancy <= 0 || s.occupancy > 1))
                return fail("occupancy '" + w[6] + "' is not a number in (0, 1]");
            crystal.sites.push_back(s);
        } else {
            return fail("unknown record '" + key + "' (expected TITLE, CELL, SYMOP or ATOM)");
        }
    }
    if (!haveCell) {
        error = "morvel.in has no CELL line";
        return false;
    }
    if (crystal.sites.empty()) {
        error = "morvel.in has no ATOM line";
        return false;
    }
    return true;
}

} // namespace standin
