#include "distances.h"

#include <gemmi/symmetry.hpp>

#include <algorithm>
#include <cmath>
#include <tuple>

namespace standin {

namespace {

const double kPi = 3.14159265358979323846;
// Positions closer than this (angstrom) are one position: symmetry images of a
// site on a special position, or a site and itself.
const double kSamePosition = 0.01;

struct Metric {
    double g[3][3];    // metric tensor
    double gInvDiag[3]; // squared reciprocal lengths
    double volume;

    explicit Metric(const std::array<double, 6>& c)
    {
        double ca = std::cos(c[3] * kPi / 180), cb = std::cos(c[4] * kPi / 180), cg = std::cos(c[5] * kPi / 180);
        double a = c[0], b = c[1], cc = c[2];
        g[0][0] = a * a;      g[0][1] = a * b * cg;  g[0][2] = a * cc * cb;
        g[1][0] = g[0][1];    g[1][1] = b * b;       g[1][2] = b * cc * ca;
        g[2][0] = g[0][2];    g[2][1] = g[1][2];     g[2][2] = cc * cc;
        double det = g[0][0] * (g[1][1] * g[2][2] - g[1][2] * g[2][1]) -
                     g[0][1] * (g[1][0] * g[2][2] - g[1][2] * g[2][0]) +
                     g[0][2] * (g[1][0] * g[2][1] - g[1][1] * g[2][0]);
        volume = std::sqrt(det);
        gInvDiag[0] = (g[1][1] * g[2][2] - g[1][2] * g[2][1]) / det;
        gInvDiag[1] = (g[0][0] * g[2][2] - g[0][2] * g[2][0]) / det;
        gInvDiag[2] = (g[0][0] * g[1][1] - g[0][1] * g[1][0]) / det;
    }

    double length2(const double d[3]) const
    {
        double s = 0;
        for (int i = 0; i < 3; ++i)
            for (int j = 0; j < 3; ++j)
                s += d[i] * g[i][j] * d[j];
        return s;
    }
};

struct Image {
    int site;
    int op;
    std::array<int, 3> shift; // brings op(site) into the cell [0,1)
    std::array<double, 3> f;  // op(site) + shift
};

} // namespace

std::string symmetryCode(int op, const std::array<int, 3>& shift)
{
    std::string code = std::to_string(op + 1) + "_";
    bool small = std::all_of(shift.begin(), shift.end(), [](int t) { return t >= -4 && t <= 4; });
    if (small) {
        for (int t : shift)
            code += char('5' + t);
    } else {
        code += "(" + std::to_string(shift[0]) + "," + std::to_string(shift[1]) + "," +
                std::to_string(shift[2]) + ")";
    }
    return code;
}

bool computeDistances(const Crystal& crystal, double dmax, DistanceResult& result, std::string& error)
{
    result = DistanceResult();
    std::string why = checkCell(crystal.cell);
    if (!why.empty()) {
        error = why;
        return false;
    }
    if (!(dmax > 0) || !std::isfinite(dmax)) {
        error = "DMAX must be a positive number";
        return false;
    }
    Metric metric(crystal.cell);
    result.volume = metric.volume;

    std::vector<gemmi::Op> ops;
    for (const std::string& s : crystal.symops) {
        why = checkSymop(s);
        if (!why.empty()) {
            error = why;
            return false;
        }
        ops.push_back(gemmi::parse_triplet(s));
        result.symops.push_back(s);
    }
    // Every site stands at its own position, whether or not the list says so.
    if (std::none_of(ops.begin(), ops.end(), [](const gemmi::Op& op) { return op == gemmi::Op::identity(); })) {
        ops.push_back(gemmi::Op::identity());
        result.symops.push_back("x,y,z");
    }

    // Distinct images of every site in the cell.
    std::vector<Image> images;
    result.multiplicity.assign(crystal.sites.size(), 0);
    for (size_t s = 0; s < crystal.sites.size(); ++s) {
        size_t first = images.size();
        for (size_t k = 0; k < ops.size(); ++k) {
            std::array<double, 3> p = ops[k].apply_to_xyz(crystal.sites[s].fract);
            Image im{int(s), int(k), {}, {}};
            for (int i = 0; i < 3; ++i) {
                double fl = std::floor(p[i]);
                im.shift[i] = -int(fl);
                im.f[i] = p[i] - fl;
            }
            bool seen = false;
            for (size_t j = first; j < images.size() && !seen; ++j) {
                double d[3];
                for (int i = 0; i < 3; ++i) {
                    d[i] = im.f[i] - images[j].f[i];
                    d[i] -= std::round(d[i]);
                }
                seen = metric.length2(d) < kSamePosition * kSamePosition;
            }
            if (!seen)
                images.push_back(im);
        }
        result.multiplicity[s] = int(images.size() - first);
    }

    // Translation ranges: a fractional difference u reaches at most
    // dmax * |a*_i| along axis i for a vector no longer than dmax.
    double reach[3];
    for (int i = 0; i < 3; ++i)
        reach[i] = dmax * std::sqrt(metric.gInvDiag[i]) + 1e-9;
    auto range = [&](double d0, int i, int& lo, int& hi) {
        lo = int(std::ceil(-reach[i] - d0));
        hi = int(std::floor(reach[i] - d0));
    };
    double candidates = 0;
    for (const Site& site : crystal.sites)
        for (const Image& im : images) {
            double n = 1;
            for (int i = 0; i < 3; ++i) {
                int lo, hi;
                range(im.f[i] - site.fract[i], i, lo, hi);
                n *= std::max(0, hi - lo + 1);
            }
            candidates += n;
        }
    if (candidates > kMaxCandidates) {
        error = "DMAX = " + formatNumber(dmax) + " is too large for this cell: " + formatNumber(candidates, 3) +
                " positions would have to be examined";
        return false;
    }

    const double dmax2 = dmax * dmax * (1 + 1e-12);
    result.neighbours.resize(crystal.sites.size());
    for (size_t s = 0; s < crystal.sites.size(); ++s) {
        const std::array<double, 3>& x0 = crystal.sites[s].fract;
        std::vector<Neighbour>& list = result.neighbours[s];
        for (const Image& im : images) {
            double d0[3] = {im.f[0] - x0[0], im.f[1] - x0[1], im.f[2] - x0[2]};
            int lo[3], hi[3];
            for (int i = 0; i < 3; ++i)
                range(d0[i], i, lo[i], hi[i]);
            for (int t0 = lo[0]; t0 <= hi[0]; ++t0)
                for (int t1 = lo[1]; t1 <= hi[1]; ++t1)
                    for (int t2 = lo[2]; t2 <= hi[2]; ++t2) {
                        double d[3] = {d0[0] + t0, d0[1] + t1, d0[2] + t2};
                        double l2 = metric.length2(d);
                        if (l2 > dmax2 || l2 < kSamePosition * kSamePosition)
                            continue;
                        Neighbour n;
                        n.site = im.site;
                        n.op = im.op;
                        n.shift = {im.shift[0] + t0, im.shift[1] + t1, im.shift[2] + t2};
                        n.distance = std::sqrt(l2);
                        list.push_back(n);
                    }
        }
        // Sorted by the distance as printed, then by label, so that equal
        // distances come out in a stable order.
        std::sort(list.begin(), list.end(), [&](const Neighbour& a, const Neighbour& b) {
            long long da = std::llround(a.distance * 1e4), db = std::llround(b.distance * 1e4);
            const std::string& la = crystal.sites[a.site].label;
            const std::string& lb = crystal.sites[b.site].label;
            return std::tie(da, la, a.site, a.op, a.shift) < std::tie(db, lb, b.site, b.op, b.shift);
        });
    }
    return true;
}

} // namespace standin
