// What the benchmarks are written with: Google Benchmark where it is packaged, else the small runner of
// runner.h with the same names. BENCH_PEERS tells whether the peers are there, too.
#pragma once

#if BENCH_PEERS
#include <benchmark/benchmark.h>
#else
#include "bench/runner.h"
#endif

#define BENCH_JOIN2(a, b) a##b
#define BENCH_JOIN(a, b) BENCH_JOIN2(a, b)

// BENCH("work/ours") { for (auto _ : state) ... } Names are "work/ours" and "work/PEER"; what they are
// compared by stands in table.py.
#define BENCH(name) BENCH_AS(name, BENCH_JOIN(Bench, __COUNTER__))
#define BENCH_AS(name, function)                                        \
  static void function(benchmark::State& state);                        \
  [[maybe_unused]] static const auto BENCH_JOIN(function, Registered) = \
      benchmark::RegisterBenchmark(name, function)->UseRealTime();      \
  static void function([[maybe_unused]] benchmark::State& state)
