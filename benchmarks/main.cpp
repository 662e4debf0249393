#include <benchmark/benchmark.h>

#include "Ratios.hpp"

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) {
        return 2;
    }
    project::benchmarks::Ratios ratios;
    benchmark::RunSpecifiedBenchmarks(&ratios);
    ratios.print();
    return 0;
}
