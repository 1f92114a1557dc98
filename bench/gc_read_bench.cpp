// Reading speed of the essence path, MXFReader with MXFGCSplitter as its
// essence delegate, on generic containers of D-10-sized and of uncompressed
// HD picture elements, against a plain read() loop over the same file.
#include <benchmark/benchmark.h>

#include <fstream>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "bench_files.h"
#include "klv.h"
#include "mxf.h"

using zelta_bench::leastFileOctets;

namespace {

// D-10 at 50 Mb/s, and 1920 x 1080 8-bit 4:2:2 uncompressed.
constexpr std::int64_t d10PictureOctets = 250000;
constexpr std::int64_t hdPictureOctets = 1920 * 1080 * 2;

constexpr std::uint64_t elementOctets(std::uint64_t pictureOctets) { return 16 + 4 + pictureOctets; }
constexpr std::uint64_t frameCount(std::uint64_t pictureOctets) {
  return (leastFileOctets + elementOctets(pictureOctets) - 1) / elementOctets(pictureOctets);
}

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
void writeContainer(std::ostream& out, std::uint64_t pictureOctets) {
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
    for (std::uint64_t i = 0; i < frameCount(pictureOctets); ++i)
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

// One file per picture size, written on first use.
const BenchFile& benchFile(std::uint64_t pictureOctets) {
  static std::map<std::uint64_t, BenchFile> files;
  const auto found = files.find(pictureOctets);
  if (found != files.end()) return found->second;
  const std::string path = zelta_bench::writeBenchFile(
      "zelta_gc_read_bench_" + std::to_string(pictureOctets) + ".mxf",
      [pictureOctets](std::ostream& out) { writeContainer(out, pictureOctets); });
  std::ifstream in(path, std::ios::binary | std::ios::ate);
  return files[pictureOctets] = BenchFile{path, static_cast<std::uint64_t>(std::streamoff(in.tellg()))};
}

// Wants every picture: into the next buffer of a pool of its own, or else,
// with no pool, into the splitter's buffer. Four D-10 pictures come to the
// plain loop's 1 MiB; an HD picture is four times that alone.
class PictureHandler : public DullMXFGCEssenceHandler {
public:
  explicit PictureHandler(std::size_t ownBuffers) : own_(ownBuffers) {}
  bool startEssenceElement(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    if (!own_.empty()) buffer = own_.next(length);
    return true;
  }
  void pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t) override {
    benchmark::DoNotOptimize(data);
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

// Arguments: the picture size, the client's stream buffer size (0: the file
// stream's own) and the handler's buffers.
template <typename Handler>
void readEssence(benchmark::State& state, Handler& pictures, KLVHandler& essence) {
  const std::uint64_t pictureOctets = static_cast<std::uint64_t>(state.range(0));
  const BenchFile& file = benchFile(pictureOctets);
  std::uint64_t octets = 0;
  std::uint64_t elements = 0;
  std::vector<char> streamBuffer(static_cast<std::size_t>(state.range(1)));
  for (auto _ : state) {
    std::ifstream in;
    zelta_bench::openWithStreamBuffer(in, file.path, streamBuffer);
    pictures.pictures = 0;
    MXFReader reader;
    reader.setEssenceHandler(&essence);
    reader.read(in);
    check(pictures.pictures == frameCount(pictureOctets), "every picture read");
    octets += file.octets;
    elements += pictures.pictures;
  }
  zelta_bench::reportThroughput(state, octets, elements);
}

// No handler buffers: the splitter's own buffer.
void BM_Splitter(benchmark::State& state) {
  PictureHandler pictures(static_cast<std::size_t>(state.range(2)));
  MXFGCSplitter splitter(nullptr, nullptr, &pictures);
  readEssence(state, pictures, splitter);
}

// The handler has at least one buffer.
void BM_ReaderIntoKLVHandlerBuffers(benchmark::State& state) {
  KLVPictureHandler pictures(static_cast<std::size_t>(state.range(2)));
  readEssence(state, pictures, pictures);
}

// Argument: the picture size.
void BM_PlainReadLoop(benchmark::State& state) {
  const std::uint64_t pictureOctets = static_cast<std::uint64_t>(state.range(0));
  const BenchFile& file = benchFile(pictureOctets);
  zelta_bench::plainReadLoop(state, file.path, file.octets, elementOctets(pictureOctets));
}

void plainArguments(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgName("picture")->Arg(d10PictureOctets)->Arg(hdPictureOctets);
  benchmark->Unit(benchmark::kMillisecond)->UseRealTime();
}

void readerArguments(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgNames({"picture", "streamBuffer", "handlerBuffers"});
}

}  // namespace

// The plain loop runs between the readers, so that a drift of the machine
// shows in its figure.
BENCHMARK(BM_PlainReadLoop)->Apply(plainArguments);
BENCHMARK(BM_Splitter)
    ->Apply(readerArguments)
    ->Args({d10PictureOctets, 256, 4})
    ->Args({d10PictureOctets, 256, 1})
    ->Args({d10PictureOctets, 0, 4})
    ->Args({d10PictureOctets, 0, 1})
    ->Args({d10PictureOctets, 256, 0})
    ->Args({hdPictureOctets, 256, 1})
    ->Args({hdPictureOctets, 0, 1})
    ->Args({hdPictureOctets, 256, 0})
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();
BENCHMARK(BM_PlainReadLoop)->Apply(plainArguments);
BENCHMARK(BM_ReaderIntoKLVHandlerBuffers)
    ->Apply(readerArguments)
    ->Args({d10PictureOctets, 256, 4})
    ->Args({d10PictureOctets, 0, 1})
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

BENCHMARK_MAIN();
