#include "report.h"

#include <cstdio>
#include <sstream>
#include <vector>

namespace standin {

namespace {

const char* const kNotComputed = "echoed only, not computed by the stand-in";

std::string escape(const std::string& s)
{
    std::string r;
    for (char c : s) {
        switch (c) {
        case '&': r += "&amp;"; break;
        case '<': r += "&lt;"; break;
        case '>': r += "&gt;"; break;
        case '"': r += "&quot;"; break;
        default: r += c;
        }
    }
    return r;
}

std::string fixed(double v, int decimals)
{
    char buf[64];
    std::snprintf(buf, sizeof buf, "%.*f", decimals, v);
    return buf;
}

std::string signedCharge(double c)
{
    std::string s = formatNumber(c);
    return c > 0 ? "+" + s : s;
}

// One writer, two renderings: the verbose level gets HTML, every other level
// plain text with aligned columns.
class Writer {
public:
    explicit Writer(bool html) : html_(html)
    {
        if (html_)
            out_ << "<html><head><title>MORVEL.OUT</title></head><body>\n";
    }

    void title(const std::string& t)
    {
        if (html_)
            out_ << "<h2>" << escape(t) << "</h2>\n";
        else
            out_ << t << "\n" << std::string(t.size(), '=') << "\n";
    }

    void heading(const std::string& h)
    {
        if (html_)
            out_ << "<h3>" << escape(h) << "</h3>\n";
        else
            out_ << "\n" << h << "\n" << std::string(h.size(), '-') << "\n";
    }

    void line(const std::string& l)
    {
        if (html_)
            out_ << "<p>" << escape(l) << "</p>\n";
        else
            out_ << l << "\n";
    }

    void error(const std::string& l)
    {
        if (html_)
            out_ << "<p><b><font color=\"#FF3300\">" << escape(l) << "</font></b></p>\n";
        else
            out_ << "\n" << l << "\n";
    }

    void anchor(const std::string& name)
    {
        if (html_)
            out_ << "<a name=\"" << name << "\"></a>\n";
    }

    // Rows of cells; the first row is the header. Plain text pads each column to
    // its widest cell.
    void table(const std::vector<std::vector<std::string>>& rows, const std::string& indent = "  ")
    {
        if (rows.empty())
            return;
        if (html_) {
            out_ << "<table border=\"1\" cellspacing=\"0\" cellpadding=\"3\">\n";
            for (size_t r = 0; r < rows.size(); ++r) {
                out_ << "<tr>";
                for (const std::string& c : rows[r])
                    out_ << (r == 0 ? "<th>" : "<td>") << escape(c) << (r == 0 ? "</th>" : "</td>");
                out_ << "</tr>\n";
            }
            out_ << "</table>\n";
            return;
        }
        std::vector<size_t> width;
        for (const auto& row : rows)
            for (size_t c = 0; c < row.size(); ++c) {
                if (width.size() <= c)
                    width.push_back(0);
                width[c] = std::max(width[c], row[c].size());
            }
        for (const auto& row : rows) {
            std::string l = indent;
            for (size_t c = 0; c < row.size(); ++c) {
                l += row[c];
                if (c + 1 < row.size())
                    l += std::string(width[c] - row[c].size() + 2, ' ');
            }
            while (!l.empty() && l.back() == ' ')
                l.pop_back();
            out_ << l << "\n";
        }
    }

    std::string finish()
    {
        if (html_)
            out_ << "</body></html>\n";
        return out_.str();
    }

private:
    bool html_;
    std::ostringstream out_;
};

void writeParameters(Writer& w, const Parameters& p)
{
    static const char* const inputNames[3] = {"CIF file converted by cif_parser", "hand-made input",
                                              "old ICSD input"};
    std::string outputNote = p.output == 1 ? "verbose output (HTML)"
                             : p.output == 0 ? "normal output"
                                             : "ionic radii tables: not computed by the stand-in; normal output written";
    w.heading("Parameters read from morvel.par");
    w.table({{"Parameter", "Value", "Use"},
             {"DMAX", p.fields[0], "largest distance listed (angstrom)"},
             {"INPUT", p.fields[1], inputNames[p.input]},
             {"PRINT TYPE", p.fields[2], std::string(kNotComputed) + " (all distances within DMAX are listed)"},
             {"OUTPUT", p.fields[3], outputNote},
             {"POLYHEDRA DETAILS", p.fields[4], kNotComputed},
             {"TOLERANCE", p.fields[5], kNotComputed},
             {"field 7", p.fields[6], kNotComputed},
             {"THRESH", p.fields[7], std::string(kNotComputed) + " (hydrogen bonds)"},
             {"MAX V-ATOMS", p.fields[8], kNotComputed},
             {"field 10", p.fields[9], kNotComputed},
             {"field 11", p.fields[10], kNotComputed}});
    w.line("Bond weights and coordination polyhedra: not computed by the stand-in.");
    if (!p.text.empty()) {
        w.heading("Job text (morvel.par line 2)");
        std::istringstream in(p.text);
        std::string l;
        while (std::getline(in, l))
            w.line(l);
    }
}

void writeStructure(Writer& w, const Crystal& c, const DistanceResult* d)
{
    w.heading("Structure read from morvel.in");
    if (!c.title.empty())
        w.line("Title: " + c.title);
    w.table({{"a", "b", "c", "alpha", "beta", "gamma", "volume"},
             {fixed(c.cell[0], 4), fixed(c.cell[1], 4), fixed(c.cell[2], 4), fixed(c.cell[3], 3),
              fixed(c.cell[4], 3), fixed(c.cell[5], 3), d ? fixed(d->volume, 3) : "-"}});
    const std::vector<std::string>& symops = d ? d->symops : c.symops;
    w.line("Symmetry operations: " + std::to_string(symops.size()));
    std::vector<std::vector<std::string>> ops{{"No.", "Operation"}};
    for (size_t i = 0; i < symops.size(); ++i)
        ops.push_back({std::to_string(i + 1), symops[i]});
    w.table(ops);
    w.line("Sites of the asymmetric unit: " + std::to_string(c.sites.size()));
    std::vector<std::vector<std::string>> sites{{"Label", "Symbol", "Charge", "x", "y", "z", "Occupancy", "Multiplicity"}};
    for (size_t i = 0; i < c.sites.size(); ++i) {
        const Site& s = c.sites[i];
        sites.push_back({s.label, s.symbol, signedCharge(s.charge), fixed(s.fract[0], 5), fixed(s.fract[1], 5),
                         fixed(s.fract[2], 5), fixed(s.occupancy, 3),
                         d ? std::to_string(d->multiplicity[i]) : "-"});
    }
    w.table(sites);
}

void writeDistances(Writer& w, const Parameters& p, const Crystal& c, const DistanceResult& d)
{
    w.anchor("TITLE");
    w.heading("Interatomic distances up to DMAX = " + p.fields[0] + " A");
    w.line("Symmetry code n_klm: operation n applied to the neighbour's site, then the lattice translation "
           "(k-5, l-5, m-5).");
    for (size_t s = 0; s < c.sites.size(); ++s) {
        const Site& site = c.sites[s];
        w.line("");
        w.line(site.label + " (" + site.symbol + ", charge " + signedCharge(site.charge) + ")");
        std::vector<std::vector<std::string>> rows{{"Neighbour", "Symbol", "Symmetry", "Distance"}};
        for (const Neighbour& n : d.neighbours[s])
            rows.push_back({c.sites[n.site].label, c.sites[n.site].symbol, symmetryCode(n.op, n.shift),
                            fixed(n.distance, 4)});
        w.table(rows, "    ");
        w.line("  Coordination number (d <= " + p.fields[0] + " A): " + std::to_string(d.neighbours[s].size()));
    }
}

} // namespace

std::string formatReport(const RunOutcome& run)
{
    bool html = run.params && run.params->output == 1;
    Writer w(html);
    w.title("MORVEL reference stand-in: interatomic distances");
    w.line("This is the reference stand-in shipped with MorvelGUI, not the real computation program: "
           "it lists distances only.");
    if (run.params)
        writeParameters(w, *run.params);
    if (run.crystal)
        writeStructure(w, *run.crystal, run.distances);
    if (run.params && run.crystal && run.distances)
        writeDistances(w, *run.params, *run.crystal, *run.distances);
    if (!run.failure.empty()) {
        w.error("ERROR: " + run.failure);
    } else {
        w.line("");
        w.line("Normal end.");
    }
    return w.finish();
}

} // namespace standin
