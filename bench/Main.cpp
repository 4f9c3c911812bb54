// What all benchmark programs share: Google Benchmark's options, and who compiled them.

#include "BenchmarkRow.h"

#include <benchmark/benchmark.h>

#include <exception>
#include <iostream>

namespace {

#if defined(__clang__)
constexpr const char* COMPILER = "clang++ " __clang_version__;
#else
constexpr const char* COMPILER = "g++ " __VERSION__;
#endif

} // namespace

int main(int argc, char** argv) try {
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 2;
    benchmark::AddCustomContext("compiler", COMPILER);
    addRows();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::ClearRegisteredBenchmarks(); // with them go the things that they share
    benchmark::Shutdown();
    return 0;
} catch (const std::exception& error) {
    std::cerr << argv[0] << ": " << error.what() << '\n';
    return 1;
}
