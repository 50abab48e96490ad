#include "cif_reader.h"

#include <gemmi/cif.hpp>
#include <gemmi/numb.hpp>
#include <gemmi/symmetry.hpp>

#include <cctype>
#include <cmath>
#include <cstdio>
#include <sys/stat.h>

namespace cif = gemmi::cif;

namespace standin {

namespace {

// Label or symbol as one word of morvel.in: blanks inside a quoted CIF value
// would split the record.
std::string oneWord(const std::string& s)
{
    std::string w = s;
    for (char& c : w)
        if (std::isspace(static_cast<unsigned char>(c)))
            c = '_';
    return w;
}

// A value given as a number (standard uncertainty allowed: 5.6402(3)); NaN when
// the value is missing ('?' or '.') or not a number.
double number(const std::string& raw)
{
    if (cif::is_null(raw))
        return NAN;
    return cif::as_number(raw);
}

// The element part of a type symbol or label ("Fe3+" -> "Fe", "O1" -> "O"), used
// only when the site loop has no type symbol column.
std::string leadingLetters(const std::string& s)
{
    std::string r;
    for (char c : s) {
        if (!std::isalpha(static_cast<unsigned char>(c)))
            break;
        r += c;
    }
    return r.empty() ? s : r;
}

bool lowerEquals(const std::string& a, const std::string& b)
{
    if (a.size() != b.size())
        return false;
    for (size_t i = 0; i < a.size(); ++i)
        if (std::tolower(static_cast<unsigned char>(a[i])) != std::tolower(static_cast<unsigned char>(b[i])))
            return false;
    return true;
}

const std::string* findPair(cif::Block& block, std::initializer_list<const char*> tags)
{
    for (const char* tag : tags)
        if (const std::string* v = block.find_value(tag))
            if (!cif::is_null(*v))
                return v;
    return nullptr;
}

// The symmetry operations of the block: the explicit list when there is one,
// else those of the space group named by its Hermann-Mauguin or Hall symbol.
bool readSymmetry(cif::Block& block, const std::array<double, 6>& cell, Crystal& crystal,
                  std::vector<std::string>& log, std::string& error)
{
    for (const char* tag : {"_space_group_symop_operation_xyz", "_symmetry_equiv_pos_as_xyz"}) {
        cif::Column col = block.find_values(tag);
        if (!col.item())
            continue;
        for (const std::string& raw : col) {
            std::string text = cif::as_string(raw);
            std::string why = checkSymop(text);
            if (!why.empty()) {
                error = why;
                return false;
            }
            crystal.symops.push_back(gemmi::parse_triplet(text).triplet());
        }
        if (crystal.symops.empty()) {
            error = std::string("the list ") + tag + " is empty";
            return false;
        }
        log.push_back("Symmetry: " + std::to_string(crystal.symops.size()) + " operations from " + tag);
        return true;
    }
    const gemmi::SpaceGroup* sg = nullptr;
    std::string name;
    if (const std::string* hm = findPair(block, {"_space_group_name_H-M_alt", "_symmetry_space_group_name_H-M"})) {
        name = cif::as_string(*hm);
        sg = gemmi::find_spacegroup_by_name(name, cell[3], cell[5]);
        if (!sg) {
            error = "unknown space group '" + name + "'";
            return false;
        }
    } else if (const std::string* hall = findPair(block, {"_space_group_name_Hall", "_symmetry_space_group_name_Hall"})) {
        name = cif::as_string(*hall);
        try {
            sg = gemmi::find_spacegroup_by_ops(gemmi::symops_from_hall(name.c_str()));
        } catch (const std::exception&) {
            sg = nullptr;
        }
        if (!sg) {
            error = "unknown Hall symbol '" + name + "'";
            return false;
        }
    } else {
        error = "no symmetry: neither _symmetry_equiv_pos_as_xyz nor _space_group_symop_operation_xyz "
                "nor a space-group name";
        return false;
    }
    for (const gemmi::Op& op : sg->operations())
        crystal.symops.push_back(op.triplet());
    log.push_back("Symmetry: " + std::to_string(crystal.symops.size()) + " operations of space group '" +
                  name + "' (" + sg->xhm() + ")");
    return true;
}

} // namespace

bool readCif(const std::string& path, Crystal& crystal, std::vector<std::string>& log, std::string& error)
{
    crystal = Crystal();
    struct stat st;
    if (::stat(path.c_str(), &st) != 0) {
        error = "cannot read '" + path + "': no such file";
        return false;
    }
    if (!S_ISREG(st.st_mode)) {
        error = "cannot read '" + path + "': not a regular file";
        return false;
    }
    if (FILE* f = std::fopen(path.c_str(), "rb")) {
        std::fclose(f);
    } else {
        error = "cannot read '" + path + "': permission denied";
        return false;
    }

    cif::Document doc;
    try {
        doc = cif::read_file(path);
    } catch (const std::exception& e) {
        error = "'" + path + "' is not a CIF file: " + e.what();
        return false;
    }
    if (doc.blocks.empty()) {
        error = "'" + path + "' is not a CIF file: it has no data block";
        return false;
    }
    cif::Block* block = &doc.blocks.front();
    for (cif::Block& b : doc.blocks)
        if (b.has_tag("_atom_site_fract_x")) {
            block = &b;
            break;
        }
    log.push_back("Data block: " + block->name);
    crystal.title = oneWord(block->name);
    if (const std::string* name = findPair(*block, {"_chemical_name_mineral", "_chemical_name_common",
                                                    "_chemical_formula_sum"}))
        crystal.title += " " + cif::as_string(*name);
    for (char& c : crystal.title)
        if (c == '\n' || c == '\r')
            c = ' ';

    // Cell.
    const char* cellTags[6] = {"_cell_length_a", "_cell_length_b", "_cell_length_c",
                               "_cell_angle_alpha", "_cell_angle_beta", "_cell_angle_gamma"};
    for (int i = 0; i < 6; ++i) {
        const std::string* v = block->find_value(cellTags[i]);
        double x = v ? number(*v) : NAN;
        if (std::isnan(x)) {
            error = std::string("missing cell: no value for ") + cellTags[i];
            return false;
        }
        crystal.cell[i] = x;
    }
    std::string why = checkCell(crystal.cell);
    if (!why.empty()) {
        error = "bad cell: " + why;
        return false;
    }
    log.push_back("Cell: a = " + formatNumber(crystal.cell[0]) + "  b = " + formatNumber(crystal.cell[1]) +
                  "  c = " + formatNumber(crystal.cell[2]) + "  alpha = " + formatNumber(crystal.cell[3]) +
                  "  beta = " + formatNumber(crystal.cell[4]) + "  gamma = " + formatNumber(crystal.cell[5]));

    if (!readSymmetry(*block, crystal.cell, crystal, log, error))
        return false;

    // Oxidation numbers by atom type symbol.
    std::vector<std::pair<std::string, double>> oxidation;
    cif::Table types = block->find("_atom_type_", {"symbol", "?oxidation_number"});
    if (types.ok() && types.has_column(1))
        for (auto row : types) {
            double ox = row.has2(1) ? number(row[1]) : NAN;
            if (!std::isnan(ox))
                oxidation.emplace_back(cif::as_string(row[0]), ox);
        }

    // Sites.
    cif::Table sites = block->find("_atom_site_", {"label", "?type_symbol", "?fract_x", "?fract_y",
                                                   "?fract_z", "?occupancy"});
    if (!sites.ok() || sites.length() == 0) {
        error = "missing sites: no _atom_site_label loop";
        return false;
    }
    if (!sites.has_column(2) || !sites.has_column(3) || !sites.has_column(4)) {
        error = "missing sites: no _atom_site_fract_x/y/z columns";
        return false;
    }
    for (auto row : sites) {
        Site s;
        s.label = oneWord(cif::as_string(row[0]));
        s.symbol = oneWord(row.has2(1) ? cif::as_string(row[1]) : leadingLetters(s.label));
        for (int i = 0; i < 3; ++i) {
            s.fract[i] = number(row[2 + i]);
            if (std::isnan(s.fract[i])) {
                error = "site " + s.label + " has no fractional coordinate " + "xyz"[i];
                return false;
            }
        }
        if (row.has2(5)) {
            s.occupancy = number(row[5]);
            if (!(s.occupancy > 0 && s.occupancy <= 1)) {
                error = "site " + s.label + " has occupancy " + cif::as_string(row[5]) + ", not in (0, 1]";
                return false;
            }
        }
        const std::pair<std::string, double>* found = nullptr;
        for (const auto& t : oxidation)
            if (t.first == s.symbol) {
                found = &t;
                break;
            }
        if (!found)
            for (const auto& t : oxidation)
                if (lowerEquals(t.first, s.symbol)) {
                    found = &t;
                    break;
                }
        if (!found) {
            error = "atom type " + s.symbol + " (site " + s.label +
                    ") has no oxidation number: no _atom_type_oxidation_number for it";
            return false;
        }
        s.charge = found->second;
        log.push_back("Site " + s.label + "  type " + s.symbol + "  oxidation number " + formatNumber(s.charge) +
                      "  x y z = " + formatNumber(s.fract[0]) + " " + formatNumber(s.fract[1]) + " " +
                      formatNumber(s.fract[2]) + "  occupancy " + formatNumber(s.occupancy));
        crystal.sites.push_back(s);
    }
    return true;
}

} // namespace standin
