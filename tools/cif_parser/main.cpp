// cif_parser -- reference stand-in for the CIF converter.
//
//   cif_parser <input.cif> <morvel.in>
//
// Reads the CIF file, writes the structure in the hand-made morvel.in format and
// keeps its diagnostics in cifparser.log in the current directory. On failure it
// prints a line with the word ERROR and the reason on standard output, leaves the
// output path untouched and exits with code 1. It never reads standard input.
#include "cif_reader.h"
#include "crystal.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <iostream>
#include <string>
#include <vector>

namespace {

class Log {
public:
    Log() : file_("cifparser.log", std::ios::out | std::ios::trunc) {}
    void line(const std::string& text)
    {
        if (file_)
            file_ << text << '\n';
    }

private:
    std::ofstream file_;
};

int fail(Log& log, const std::string& reason)
{
    log.line("ERROR: " + reason);
    // Standard output is what the dialog watches; the word ERROR ends its run.
    std::cout << "ERROR: " << reason << std::endl;
    return 1;
}

// Writes beside the target first and renames, so that a failed write never leaves
// a truncated morvel.in behind.
bool writeAtomically(const std::string& path, const std::string& text, std::string& error)
{
    std::string temp = path + ".part";
    {
        std::ofstream out(temp, std::ios::out | std::ios::trunc | std::ios::binary);
        if (!out) {
            error = "cannot write '" + path + "': " + std::strerror(errno);
            return false;
        }
        out << text;
        out.flush();
        if (!out) {
            out.close();
            std::remove(temp.c_str());
            error = "cannot write '" + path + "': write failed";
            return false;
        }
    }
    if (std::rename(temp.c_str(), path.c_str()) != 0) {
        error = "cannot write '" + path + "': " + std::strerror(errno);
        std::remove(temp.c_str());
        return false;
    }
    return true;
}

} // namespace

int main(int argc, char** argv)
{
    Log log;
    log.line("cif_parser -- reference stand-in for the CIF converter (not the real converter)");
    if (argc != 3)
        return fail(log, "usage: cif_parser <input.cif> <morvel.in>");
    const std::string input = argv[1];
    const std::string output = argv[2];
    log.line("Input:  " + input);
    log.line("Output: " + output);

    try {
        standin::Crystal crystal;
        std::vector<std::string> lines;
        std::string error;
        bool ok = standin::readCif(input, crystal, lines, error);
        for (const std::string& l : lines)
            log.line(l);
        if (!ok)
            return fail(log, error);
        if (!writeAtomically(output, standin::formatMorvelIn(crystal), error))
            return fail(log, error);
        log.line("Wrote " + std::to_string(crystal.sites.size()) + " sites and " +
                 std::to_string(crystal.symops.size()) + " symmetry operations.");
        // Only counts here: user text (a label, a block name) could hold the word
        // that the dialog takes for a failure.
        std::cout << "cif_parser: " << crystal.sites.size() << " sites, " << crystal.symops.size()
                  << " symmetry operations written" << std::endl;
        return 0;
    } catch (const std::exception& e) {
        return fail(log, std::string("unexpected failure: ") + e.what());
    }
}
