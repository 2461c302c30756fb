// Each formatter rendering the result of a 10,000-container load to a stream
// that discards what it is given: the cost of walking the values and writing
// the text, without the disk.
#include <benchmark/benchmark.h>

#include <ostream>
#include <streambuf>

#include "LoadResult.h"
#include "fendle/Formatter.h"

namespace {

constexpr int kRows = 10000;

// Counts the bytes written and keeps none of them.
class CountingBuffer : public std::streambuf {
 public:
  std::size_t written = 0;

 protected:
  int_type overflow(int_type c) override {
    ++written;
    return traits_type::not_eof(c);
  }
  std::streamsize xsputn(const char*, std::streamsize n) override {
    written += static_cast<std::size_t>(n);
    return n;
  }
};

void BM_Render(benchmark::State& state, const Fendle::Format::FormatterEntry* entry) {
  const auto result = Bench::LoadResult(kRows);
  const Fendle::Format::FormatHints hints = Bench::LoadHints(result);
  const std::unique_ptr<Fendle::Format::Formatter> formatter = entry->create();
  std::size_t bytes = 0;
  for (auto _ : state) {
    CountingBuffer buffer;
    std::ostream out(&buffer);
    formatter->Render(result, hints, out);
    bytes = buffer.written;
    benchmark::DoNotOptimize(bytes);
  }
  state.counters["output_bytes"] = static_cast<double>(bytes);
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * bytes));
}

void BM_BuildValues(benchmark::State& state) {
  for (auto _ : state) benchmark::DoNotOptimize(Bench::LoadResult(kRows));
}
BENCHMARK(BM_BuildValues)->Unit(benchmark::kMillisecond);

// One benchmark per registered formatter, so a new one is measured too.
const bool registered = [] {
  for (const Fendle::Format::FormatterEntry& entry : Fendle::Format::Formatters()) {
    benchmark::RegisterBenchmark((std::string("BM_Render/") + entry.name + "/10000").c_str(),
                                 BM_Render, &entry)
        ->Unit(benchmark::kMillisecond);
  }
  return true;
}();

}  // namespace

BENCHMARK_MAIN();
