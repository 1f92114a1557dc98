// Reading speed of the essence path, MXFReader with MXFGCSplitter as its
// essence delegate, on a generic container of D-10-sized picture elements,
// against a plain read() loop over the same file.
#include <benchmark/benchmark.h>

#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "bench_files.h"
#include "klv.h"
#include "mxf.h"

using zelta_bench::leastFileOctets;

namespace {

constexpr std::uint64_t pictureOctets = 250000;
constexpr std::uint64_t elementOctets = 16 + 4 + pictureOctets;
constexpr std::uint64_t frameCount = (leastFileOctets + elementOctets - 1) / elementOctets;

const KLVKey pictureKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01,
                                                     0x03, 0x01, 0x15, 0x01, 0x05, 0x01});
const KLVKey op1aLabel(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01, 0x0D, 0x01,
                                                    0x02, 0x01, 0x01, 0x01, 0x09, 0x00});

// A primer pack without entries: a count of 0 and an entry size of 18.
const ByteVector emptyPrimer{0, 0, 0, 0, 0, 0, 0, 18};
constexpr std::uint64_t primerOctets = 16 + 4 + 8;

void writePartition(MXFWriter& writer, MXFPartitionKind kind, std::uint64_t headerByteCount, std::uint32_t bodySID,
                    const std::function<void()>& contents) {
  MXFPartitionPack pack;
  pack.kagSize = 1;
  pack.headerByteCount = headerByteCount;
  pack.bodySID = bodySID;
  pack.operationalPattern = op1aLabel;
  const KLVKey key = MXFPartitionPackKey(kind, MXFClosedComplete);
  writer.getStructureHandler()->startPartition(key, pack, 0);
  contents();
  writer.getStructureHandler()->endPartition(key);
}

// Header partition with the primer alone, one body partition of frame-wrapped
// pictures, footer partition and random index.
void writeContainer(std::ostream& out) {
  MXFWriter writer(out);
  writer.getStructureHandler()->startStream();
  writePartition(writer, MXFHeaderPartition, primerOctets, 0, [&] {
    KLVHandler& metadata = *writer.getMetadataHandler();
    metadata.startStream(true);
    metadata.setLengthForm(0x83);
    writeFixedLengthPack(metadata, MXFPrimerPackKey, emptyPrimer);
    metadata.endStream(false);
  });
  writePartition(writer, MXFBodyPartition, 0, 1, [&] {
    KLVHandler& essence = *writer.getEssenceHandler();
    const std::vector<std::uint8_t> picture(pictureOctets, 0x5A);
    essence.setLengthForm(0x83);
    for (std::uint64_t i = 0; i < frameCount; ++i)
      writeIndividualItem(essence, pictureKey, picture.data(), pictureOctets);
  });
  writePartition(writer, MXFFooterPartition, 0, 0, [] {});
  writer.getStructureHandler()->randomIndex({});
  writer.getStructureHandler()->endStream(false);
}

struct BenchFile {
  std::string path;
  std::uint64_t octets;
};

const BenchFile& benchFile() {
  static const BenchFile file = [] {
    const std::string path = zelta_bench::writeBenchFile("zelta_gc_read_bench.mxf", writeContainer);
    std::ifstream in(path, std::ios::binary | std::ios::ate);
    return BenchFile{path, static_cast<std::uint64_t>(std::streamoff(in.tellg()))};
  }();
  return file;
}

// Wants every picture: into the next buffer of a pool of its own, or else,
// with no pool, into the splitter's buffer. Four buffers of a picture each
// come to the plain loop's 1 MiB.
class PictureHandler : public DullMXFGCEssenceHandler {
public:
  explicit PictureHandler(std::size_t ownBuffers) : own_(ownBuffers) {}
  bool startEssenceElement(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    if (!own_.empty()) buffer = own_.next(length);
    return true;
  }
  void pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override {
    benchmark::DoNotOptimize(data);
    check(length == pictureOctets, "whole picture");
    ++pictures;
  }

  std::uint64_t pictures = 0;

private:
  zelta_bench::BufferPool own_;
};

// The essence stream as KLV, without the splitter: values into the buffers
// of the handler's own.
class KLVPictureHandler : public DullKLVHandler {
public:
  explicit KLVPictureHandler(std::size_t ownBuffers) : own_(ownBuffers) {}
  bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    buffer = own_.next(length);
    return true;
  }
  void endIndividualItem(const KLVKey&) override { ++pictures; }
  void value(const std::uint8_t* data, std::streamsize) override { benchmark::DoNotOptimize(data); }

  std::uint64_t pictures = 0;

private:
  zelta_bench::BufferPool own_;
};

// A stream buffer of the client's of the size given, or the file stream's
// own for 0.
template <typename Handler>
void readEssence(benchmark::State& state, Handler& pictures, KLVHandler& essence, std::size_t streamBufferOctets) {
  const BenchFile& file = benchFile();
  std::uint64_t octets = 0;
  std::uint64_t elements = 0;
  std::vector<char> streamBuffer(streamBufferOctets);
  for (auto _ : state) {
    std::ifstream in;
    zelta_bench::openWithStreamBuffer(in, file.path, streamBuffer);
    pictures.pictures = 0;
    MXFReader reader;
    reader.setEssenceHandler(&essence);
    reader.read(in);
    check(pictures.pictures == frameCount, "every picture read");
    octets += file.octets;
    elements += pictures.pictures;
  }
  zelta_bench::reportThroughput(state, octets, elements);
}

// Arguments: the client's stream buffer size (0: the file stream's own) and
// the handler's buffers (0: the splitter's own buffer).
void BM_Splitter(benchmark::State& state) {
  PictureHandler pictures(static_cast<std::size_t>(state.range(1)));
  MXFGCSplitter splitter(nullptr, nullptr, &pictures);
  readEssence(state, pictures, splitter, static_cast<std::size_t>(state.range(0)));
}

// Arguments as for the splitter; the handler has at least one buffer.
void BM_ReaderIntoKLVHandlerBuffers(benchmark::State& state) {
  KLVPictureHandler pictures(static_cast<std::size_t>(state.range(1)));
  readEssence(state, pictures, pictures, static_cast<std::size_t>(state.range(0)));
}

void BM_PlainReadLoop(benchmark::State& state) {
  zelta_bench::plainReadLoop(state, benchFile().path, benchFile().octets, elementOctets);
}

}  // namespace

// The plain loop runs between the readers, so that a drift of the machine
// shows in its figure.
BENCHMARK(BM_PlainReadLoop)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_Splitter)
    ->ArgNames({"streamBuffer", "handlerBuffers"})
    ->Args({256, 4})
    ->Args({256, 1})
    ->Args({0, 4})
    ->Args({0, 1})
    ->Args({256, 0})
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();
BENCHMARK(BM_PlainReadLoop)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_ReaderIntoKLVHandlerBuffers)
    ->ArgNames({"streamBuffer", "handlerBuffers"})
    ->Args({256, 4})
    ->Args({0, 1})
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

BENCHMARK_MAIN();
