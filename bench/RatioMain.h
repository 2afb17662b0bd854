#pragma once

#include <QByteArray>
#include <QTemporaryDir>
#include <benchmark/benchmark.h>

#include <functional>
#include <map>
#include <string>

// Seconds per iteration of each benchmark that ran, by its function's name.
using Timings = std::map<std::string, double>;

// Prints the usual table, then the closing lines the benchmark draws from all the timings:
// its figures as ratios against the peers run in the same process.
class RatioReporter : public benchmark::ConsoleReporter {
public:
    explicit RatioReporter(std::function<void(Timings&)> print) : ratios(std::move(print)) {}

    void ReportRuns(const std::vector<Run>& runs) override {
        ConsoleReporter::ReportRuns(runs);
        for (const Run& run : runs)
            if (run.iterations > 0)
                seconds[run.run_name.function_name] = run.real_accumulated_time / run.iterations;
    }
    void Finalize() override {
        ConsoleReporter::Finalize();
        ratios(seconds);
    }

private:
    std::function<void(Timings&)> ratios;
    Timings seconds;
};

// Runs the benchmarks inside an App on the offscreen platform, with settings and data in a
// folder of their own, then prints the ratios.
template <class App>
int runWithRatios(int argc, char** argv, const std::function<void(Timings&)>& ratios) {
    QTemporaryDir home;
    qputenv("XDG_CONFIG_HOME", home.path().toUtf8());
    qputenv("XDG_DATA_HOME", home.path().toUtf8());
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    App app(argc, argv);
    benchmark::Initialize(&argc, argv);
    RatioReporter reporter(ratios);
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    return 0;
}
