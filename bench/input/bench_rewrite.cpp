// Times the completion of a CIF text with oxidation numbers (reading the table text, indexing it,
// cutting and rewriting the CIF text, encoding the result) for 1,000 to 100,000 atom rows with a
// table of as many entries, each with a symbol of its own. Each size runs in a child process so
// that its peak memory can be told apart.
//
//   cmake --build <build> --target bench_rewrite && <build>/bench/input/bench_rewrite
//
// Prints one line per size: rows, input and output size, median wall-clock and processor time of
// 5 runs, wall-clock time per row, peak memory. The processor time is the steadier figure when
// other work shares the machine.
#include "cifrewrite.h"
#include "oxidationtable.h"

#include <QByteArray>
#include <QString>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include <sys/resource.h>
#include <time.h>

namespace {
struct Input
{
    QByteArray table;
    QByteArray cif;
};

// A structure of n sites: every label is in the table but the last one; a tenth of the rows
// are found through their type symbol.
Input generate(int n)
{
    Input in;
    in.cif = "data_bench\n_cell_length_a 10.0\nloop_\n_atom_site_label\n_atom_site_type_symbol\n"
             "_atom_site_fract_x\n_atom_site_fract_y\n_atom_site_fract_z\n";
    for (int i = 0; i < n; ++i) {
        const QByteArray id = QByteArray::number(i);
        const bool bySymbol = i % 10 == 0;
        in.table += (bySymbol ? "T" : "A") + id + " S" + id + "+ " + QByteArray::number(i % 7 - 3) + "\n";
        in.cif += (i == n - 1 ? "Q" : "A") + id + "   T" + id + "   0.1250 0.2500 0.3750\n";
    }
    in.cif += "loop_\n_atom_site_aniso_label\n_atom_site_aniso_U_11\nA0 0.01\n";
    return in;
}

double cpuSeconds()
{
    timespec t{};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &t);
    return double(t.tv_sec) + double(t.tv_nsec) * 1e-9;
}

double rewriteSeconds(const Input &in, qsizetype *outBytes, double *cpu)
{
    const double cpuStart = cpuSeconds();
    const auto start = std::chrono::steady_clock::now();
    const OxidationTableRead table = parseOxidationTable(QString::fromLatin1(in.table));
    const OxidationIndex index(table.entries);
    const CifRewrite rewrite = rewriteCifText(QString::fromLatin1(in.cif), index);
    const QByteArray written = rewrite.text.toLatin1();
    const auto stop = std::chrono::steady_clock::now();
    *cpu = cpuSeconds() - cpuStart;
    if (rewrite.outcome != CifRewrite::Outcome::Rewritten || !table.complete)
        std::abort();
    *outBytes = written.size();
    return std::chrono::duration<double>(stop - start).count();
}

int runOneSize(int n)
{
    const Input in = generate(n);
    std::vector<double> times;
    std::vector<double> cpuTimes;
    qsizetype written = 0;
    for (int i = 0; i < 5; ++i) {
        double cpu = 0;
        times.push_back(rewriteSeconds(in, &written, &cpu));
        cpuTimes.push_back(cpu);
    }
    std::sort(times.begin(), times.end());
    std::sort(cpuTimes.begin(), cpuTimes.end());
    const double median = times[times.size() / 2];
    const double cpuMedian = cpuTimes[cpuTimes.size() / 2];
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    std::printf("%8d  %10lld  %10lld  %9.2f  %9.2f  %10.3f  %9.1f\n", n, static_cast<long long>(in.cif.size()),
                static_cast<long long>(written), median * 1e3, cpuMedian * 1e3, median * 1e6 / n,
                usage.ru_maxrss / 1024.0);
    return 0;
}
} // namespace

int main(int argc, char **argv)
{
    if (argc > 1)
        return runOneSize(std::atoi(argv[1]));

    std::printf("    rows   CIF bytes   new bytes    wall ms     cpu ms  us per row  peak MiB\n");
    std::fflush(stdout);
    for (int n : {1000, 2000, 5000, 10000, 20000, 50000, 100000}) {
        const std::string command = std::string("\"") + argv[0] + "\" " + std::to_string(n);
        if (std::system(command.c_str()) != 0)
            return 1;
    }
    return 0;
}
