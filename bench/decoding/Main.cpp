#include "decoding/Main.h"

#include <benchmark/benchmark.h>

#include <iostream>
#include <sstream>
#include <string>

namespace kestrum::bench {
namespace {

/// Debian builds the library optimised, but with its assertions, and the library warns of them: timings "may be
/// affected". They stand outside the measured loops, whose code is compiled here; the benchmark `emptyIteration` shows
/// it. So this tells what is true instead.
class Reporter final : public benchmark::ConsoleReporter {
public:
    bool ReportContext(const Context& context) override
    {
        std::ostream& out = GetErrorStream();
        std::stringstream told;
        SetErrorStream(&told);
        const bool goesOn = ConsoleReporter::ReportContext(context);
        SetErrorStream(&out);
        for (std::string line; std::getline(told, line);)
            out << (line.find("built as DEBUG") == std::string::npos
                        ? line
                        : "The library has its assertions, outside the loops: see emptyIteration of bench_decoding.")
                << '\n';
        return goesOn;
    }
};

} // namespace

int runAll(int argc, char** argv)
{
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 2;
    Reporter reporter;
    return benchmark::RunSpecifiedBenchmarks(&reporter) > 0 ? 0 : 1;
}

} // namespace kestrum::bench
