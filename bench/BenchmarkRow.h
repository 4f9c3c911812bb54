#ifndef BENCH_BENCHMARKROW_H
#define BENCH_BENCHMARKROW_H

#include <benchmark/benchmark.h>

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>

// A row is called GROUP/SIZE/CASE. In each GROUP/SIZE, the case "limit" is what the others are measured
// against, and "limit-again" measures it against itself. bench/compare knows the targets of the groups.

using Work = std::function<void()>;

/// @param bytes  that the work writes, for the rate
inline void addRow(const std::string& name, size_t bytes, const Work& work) {
    benchmark::RegisterBenchmark(name.c_str(),
                                 [work, bytes](benchmark::State& state) {
                                     for ([[maybe_unused]] auto _ : state) {
                                         work();
                                         benchmark::ClobberMemory();
                                     }
                                     state.SetBytesProcessed(
                                         static_cast<int64_t>(state.iterations() * bytes));
                                 })
        ->UseRealTime()
        ->Unit(benchmark::kMicrosecond);
}

#endif
