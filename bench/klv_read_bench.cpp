// Reading speed of GenericKLVReader on D-10-sized elements, against a plain
// read() loop over the same file.
#include <benchmark/benchmark.h>

#include <fstream>
#include <string>
#include <vector>

#include "bench_files.h"
#include "klv.h"

using zelta_bench::leastFileOctets;

namespace {

constexpr std::uint64_t valueOctets = 250000;
constexpr std::uint64_t elementOctets = 16 + 4 + valueOctets;
constexpr std::uint64_t elementCount = (leastFileOctets + elementOctets - 1) / elementOctets;
constexpr std::uint64_t fileOctets = elementCount * elementOctets;

const KLVKey pictureKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01,
                                                     0x03, 0x01, 0x05, 0x01, 0x01, 0x00});

// Written once per process with the library's own writer.
const std::string& benchFile() {
  static const std::string path = zelta_bench::writeBenchFile("zelta_klv_read_bench.klv", [](std::ostream& out) {
    GenericKLVWriter writer(out);
    const std::vector<std::uint8_t> picture(valueOctets, 0x5A);
    writer.startStream(true);
    writer.setLengthForm(0x83);
    for (std::uint64_t i = 0; i < elementCount; ++i)
      writeIndividualItem(writer, pictureKey, picture.data(), valueOctets);
    writer.endStream(false);
  });
  return path;
}

// Takes every value into the buffers of its own in turn, or with none skips
// them all.
class CountingHandler : public DullKLVHandler {
public:
  explicit CountingHandler(std::size_t ownBuffers) : own_(ownBuffers) {}
  bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    if (own_.empty()) return false;
    buffer = own_.next(length);
    return true;
  }
  void endIndividualItem(const KLVKey&) override { ++elements; }
  void value(const std::uint8_t* data, std::streamsize) override { benchmark::DoNotOptimize(data); }

  std::uint64_t elements = 0;

private:
  zelta_bench::BufferPool own_;
};

// Arguments: the client's stream buffer size (0: the file stream's own) and
// the handler's buffers (0: every value skipped).
void BM_Reader(benchmark::State& state) {
  const std::string& path = benchFile();
  std::uint64_t elements = 0;
  std::uint64_t octets = 0;
  std::vector<char> streamBuffer(static_cast<std::size_t>(state.range(0)));
  for (auto _ : state) {
    std::ifstream in;
    zelta_bench::openWithStreamBuffer(in, path, streamBuffer);
    CountingHandler handler(static_cast<std::size_t>(state.range(1)));
    GenericKLVReader reader;
    reader.setHandler(&handler);
    reader.read(in);
    check(handler.elements == elementCount, "every element read");
    elements += handler.elements;
    octets += fileOctets;
  }
  zelta_bench::reportThroughput(state, octets, elements);
}

void BM_PlainReadLoop(benchmark::State& state) {
  zelta_bench::plainReadLoop(state, benchFile(), fileOctets, elementOctets);
}

void readerCases(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgNames({"streamBuffer", "handlerBuffers"});
  for (const std::int64_t streamBuffer : {256, 0, 65536, 1048576})
    for (const std::int64_t handlerBuffers : {4, 0}) benchmark->Args({streamBuffer, handlerBuffers});
  benchmark->Unit(benchmark::kMillisecond)->UseRealTime();
}

}  // namespace

BENCHMARK(BM_PlainReadLoop)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_Reader)->Apply(readerCases);
BENCHMARK(BM_PlainReadLoop)->Unit(benchmark::kMillisecond)->UseRealTime();

BENCHMARK_MAIN();
