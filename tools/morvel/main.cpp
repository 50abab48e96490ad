// morvel -- reference stand-in for the MORVEL computation program.
//
// Takes no arguments and never reads standard input. Reads morvel.par and
// morvel.in from the current directory, lists every interatomic distance up to
// DMAX and writes MORVEL.OUT there.
//
// Exit codes: 0 success; 1 morvel.par missing or malformed; 2 old ICSD input
// (INPUT = 2) refused; 3 morvel.in missing or malformed, or the job too large;
// 4 MORVEL.OUT cannot be written.
#include "crystal.h"
#include "distances.h"
#include "par_file.h"
#include "report.h"

#include <fstream>
#include <iostream>
#include <sstream>
#include <sys/stat.h>

namespace {

bool readWholeFile(const char* name, std::string& text, std::string& error)
{
    struct stat st;
    if (::stat(name, &st) != 0) {
        error = std::string("cannot read ") + name + ": the file does not exist in the working directory";
        return false;
    }
    if (!S_ISREG(st.st_mode)) {
        error = std::string("cannot read ") + name + ": it is not a regular file";
        return false;
    }
    std::ifstream in(name, std::ios::binary);
    if (!in) {
        error = std::string("cannot read ") + name + ": it cannot be opened";
        return false;
    }
    std::ostringstream s;
    s << in.rdbuf();
    text = s.str();
    return true;
}

int finish(const standin::RunOutcome& run, int code)
{
    std::ofstream out("MORVEL.OUT", std::ios::out | std::ios::trunc | std::ios::binary);
    if (out)
        out << standin::formatReport(run);
    out.flush();
    if (!out) {
        std::cerr << "morvel: cannot write MORVEL.OUT in the working directory" << std::endl;
        return 4;
    }
    if (!run.failure.empty())
        std::cerr << "morvel: " << run.failure << std::endl;
    return code;
}

} // namespace

int main(int argc, char**)
{
    standin::RunOutcome run;
    if (argc > 1) {
        run.failure = "the program takes no arguments";
        return finish(run, 1);
    }
    try {
        std::string text;
        standin::Parameters params;
        if (!readWholeFile("morvel.par", text, run.failure) || !standin::parseParameters(text, params, run.failure))
            return finish(run, 1);
        run.params = &params;
        if (params.input == 2) {
            run.failure = "INPUT = 2: the old ICSD input format is not supported by the stand-in; "
                          "use a CIF file or the hand-made format";
            return finish(run, 2);
        }

        standin::Crystal crystal;
        if (!readWholeFile("morvel.in", text, run.failure) || !standin::parseMorvelIn(text, crystal, run.failure))
            return finish(run, 3);
        run.crystal = &crystal;

        standin::DistanceResult distances;
        if (!standin::computeDistances(crystal, params.dmax, distances, run.failure))
            return finish(run, 3);
        run.distances = &distances;
        std::cout << "morvel: distances of " << crystal.sites.size() << " sites written to MORVEL.OUT"
                  << std::endl;
        return finish(run, 0);
    } catch (const std::exception& e) {
        run.failure = std::string("unexpected failure: ") + e.what();
        return finish(run, 3);
    }
}
