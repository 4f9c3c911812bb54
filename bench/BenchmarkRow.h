#ifndef BENCH_BENCHMARKROW_H
#define BENCH_BENCHMARKROW_H

#include <benchmark/benchmark.h>

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

// A row is called GROUP/SIZE/CASE. In each GROUP/SIZE, the case "limit" is what the others are measured
// against, and "limit-again" measures it against itself. bench/compare knows the targets of the groups.

using Work = std::function<void()>;

/// Adds the rows of a program with addRow(); every program defines it. Main.cpp calls it and runs them.
void addRows();

/// A row. Its work is done once before it is timed, so what the first one sets up is not counted.
/// @param bytes    that the work writes, for the rate; 0 for none
/// @param prepare  done before that
inline void addRow(
    const std::string& name, size_t bytes, const Work& work, const Work& prepare = [] {}) {
    benchmark::RegisterBenchmark(name.c_str(),
                                 [work, prepare, bytes](benchmark::State& state) {
                                     prepare();
                                     work();
                                     for ([[maybe_unused]] auto _ : state) {
                                         work();
                                         benchmark::ClobberMemory();
                                     }
                                     if (bytes != 0)
                                         state.SetBytesProcessed(state.iterations() *
                                                                 static_cast<int64_t>(bytes));
                                 })
        ->UseRealTime()
        ->Unit(benchmark::kMicrosecond);
}

inline void addLimit(const std::string& group, size_t bytes, const Work& limit) {
    addRow(group + "/limit", bytes, limit);
    addRow(group + "/limit-again", bytes, limit);
}

/// A thing that several rows use, made when the first of them runs: a run of few rows makes what these need.
/// Copies share the thing; it goes with the last of them.
template <class Thing>
class Shared {
public:
    explicit Shared(std::function<std::unique_ptr<Thing>()> make)
        : mState(std::make_shared<State>(State{std::move(make), nullptr})) {}

    Thing& operator*() const {
        if (!mState->thing)
            mState->thing = mState->make();
        return *mState->thing;
    }
    Thing* operator->() const { return &**this; }

private:
    struct State {
        std::function<std::unique_ptr<Thing>()> make;
        std::unique_ptr<Thing> thing;
    };
    std::shared_ptr<State> mState;
};

#endif
