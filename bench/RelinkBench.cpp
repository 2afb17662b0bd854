// Relinking throughput on generated pages of growing size (one reference per ~200 bytes), and
// the plain rescanning algorithm on the smallest page as a peer. Prints the ratios that matter:
// how much the largest page's throughput falls behind the smallest's (near-linear keeps it
// close to 1), and how much faster the production path is than the plain one.

#include "PageGenerator.h"
#include "ReferenceRelink.h"

#include "relink/Relink.h"
#include "relink/SuffixMap.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <map>
#include <string>

namespace {

const CString256 kBase("http://www.example.org/news/2026/index.html");

const std::string& pageOf(size_t bytes) {
    static std::map<size_t, std::string> pages;
    auto it = pages.find(bytes);
    if (it == pages.end())
        it = pages.emplace(bytes, PageGenerator(7).page(bytes, 200)).first;
    return it->second;
}

template <void (*Relink)(const CString256&, CText&)>
void relinkPage(benchmark::State& state) {
    const std::string& source = pageOf(static_cast<size_t>(state.range(0)));
    for (auto _ : state) {
        CText page("");
        page.append(source.data(), static_cast<long>(source.size()));
        Relink(kBase, page);
        benchmark::DoNotOptimize(page.buffer());
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) *
                            static_cast<int64_t>(source.size()));
}

constexpr int64_t kSmall = 100 * 1000;
constexpr int64_t kLarge = 4 * 1000 * 1000;

BENCHMARK(relinkPage<relink>)
    ->Name("relink")
    ->Arg(kSmall)
    ->Arg(1000 * 1000)
    ->Arg(kLarge)
    ->Unit(benchmark::kMillisecond);
BENCHMARK(relinkPage<reference::relink>)
    ->Name("plain_relink")
    ->Arg(kSmall)
    ->Unit(benchmark::kMillisecond);

// Keeps each run's throughput so that the ratios can be printed after the table.
class RatioReporter : public benchmark::ConsoleReporter {
public:
    std::map<std::string, double> bytesPerSecond;

    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs)
            bytesPerSecond[run.benchmark_name()] = run.counters.at("bytes_per_second");
        ConsoleReporter::ReportRuns(runs);
    }
};

} // namespace

int main(int argc, char** argv) {
    InitializeSuffixMap();
    benchmark::Initialize(&argc, argv);
    RatioReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    const auto& r = reporter.bytesPerSecond;
    const std::string small = "relink/" + std::to_string(kSmall);
    const std::string large = "relink/" + std::to_string(kLarge);
    const std::string plain = "plain_relink/" + std::to_string(kSmall);
    if (r.count(small) && r.count(large) && r.count(plain)) {
        std::printf(
            "relink throughput: 100 KB %.1f MB/s, 4 MB %.1f MB/s; 100 KB / 4 MB ratio %.2f\n",
            r.at(small) / 1e6, r.at(large) / 1e6, r.at(small) / r.at(large));
        std::printf("relink vs plain algorithm on 100 KB: %.1fx faster\n",
                    r.at(small) / r.at(plain));
    }
    benchmark::Shutdown();
    return 0;
}
