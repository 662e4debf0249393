#include <benchmark/benchmark.h>

// scripts/bench runs this program and compares the results.
BENCHMARK_MAIN();
