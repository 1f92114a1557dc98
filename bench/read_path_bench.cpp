// Reading speed of the read path whatever stream buffer the client sets, on
// three kinds of file: D-10 (a system item, a 250,000-octet picture and an
// AES3 sound element per frame), long-GOP MPEG-2 with eight mono sound tracks
// as ffmpeg writes it (twenty elements an edit unit, fill items among them),
// and uncompressed HD pictures of 4 MiB.
//
// Two readers, each with a std::ifstream whose buffer the client set to 256
// octets, left as it comes, 64 KiB or 1 MiB:
// - the essence read: MXFReader with MXFGCSplitter, every system item and
//   essence element taken, the essence into the handler's buffers; measured
//   against a plain read() loop of 1 MiB over the same file;
// - the skip walk: MXFReader with the header metadata and index parsers, the
//   essence skipped; measured against a pread() walk of keys and lengths.
//
// And the kit's reader on the D-10 file: with the essence handler alone,
// and with every handler and an error handler, so that every parser and
// validator of the kit runs.
#include <benchmark/benchmark.h>

#include <fcntl.h>
#include <unistd.h>

#include <array>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "bench_files.h"
#include "kit.h"
#include "klv.h"
#include "mxf.h"

namespace {

enum FileKind { d10File, longGOPFile, hdFile };

struct BenchFile {
  std::string path;
  std::uint64_t octets = 0;
  std::uint64_t essenceElements = 0;  // pictures and sound
  std::size_t handlerBuffers = 0;     // a pool of about the plain loop's 1 MiB
};

const KLVKey systemKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x05, 0x01, 0x01, 0x0D, 0x01,
                                                    0x03, 0x01, 0x04, 0x01, 0x01, 0x00});
const KLVKey d10PictureKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01,
                                                        0x03, 0x01, 0x05, 0x01, 0x01, 0x01});
const KLVKey d10SoundKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01,
                                                      0x03, 0x01, 0x06, 0x01, 0x10, 0x00});
const KLVKey hdPictureKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01,
                                                       0x03, 0x01, 0x15, 0x01, 0x05, 0x01});
const KLVKey op1aLabel(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01, 0x0D, 0x01,
                                                    0x02, 0x01, 0x01, 0x01, 0x09, 0x00});

constexpr std::uint64_t systemOctets = 57;
constexpr std::uint64_t d10PictureOctets = 250000;
constexpr std::uint64_t d10SoundOctets = 4 + 1920 * 8 * 4;  // 8 channels of 32-bit AES3 words
constexpr std::uint64_t hdPictureOctets = 1920 * 1080 * 2;
constexpr std::uint64_t elementPrefix = 16 + 4;

// A primer pack without entries: a count of 0 and an entry size of 18.
const ByteVector emptyPrimer{0, 0, 0, 0, 0, 0, 0, 18};
constexpr std::uint64_t primerOctets = elementPrefix + 8;

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

// Header partition with the primer alone, one body partition of frames that
// bring at least leastFileOctets, footer partition and random index.
void writeContainer(std::ostream& out, std::uint64_t frameOctets, const std::function<void(KLVHandler&)>& frame) {
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
    essence.setLengthForm(0x83);
    for (std::uint64_t octets = 0; octets < zelta_bench::leastFileOctets; octets += frameOctets) frame(essence);
  });
  writePartition(writer, MXFFooterPartition, 0, 0, [] {});
  writer.getStructureHandler()->randomIndex({});
  writer.getStructureHandler()->endStream(false);
}

std::uint64_t fileOctets(const std::string& path) {
  std::ifstream in(path, std::ios::binary | std::ios::ate);
  return static_cast<std::uint64_t>(std::streamoff(in.tellg()));
}

BenchFile writeD10() {
  const std::vector<std::uint8_t> system(systemOctets, 0x11);
  const std::vector<std::uint8_t> picture(d10PictureOctets, 0x5A);
  const std::vector<std::uint8_t> sound(d10SoundOctets, 0x22);
  const std::uint64_t frameOctets = 3 * elementPrefix + systemOctets + d10PictureOctets + d10SoundOctets;
  std::uint64_t frames = 0;
  BenchFile file;
  file.path = zelta_bench::writeBenchFile("zelta_read_path_d10.mxf", [&](std::ostream& out) {
    writeContainer(out, frameOctets, [&](KLVHandler& essence) {
      writeFixedLengthPack(essence, systemKey, system);
      writeIndividualItem(essence, d10PictureKey, picture.data(), d10PictureOctets);
      writeIndividualItem(essence, d10SoundKey, sound.data(), d10SoundOctets);
      ++frames;
    });
  });
  file.essenceElements = 2 * frames;
  file.handlerBuffers = 4;
  return file;
}

BenchFile writeHD() {
  const std::vector<std::uint8_t> picture(hdPictureOctets, 0x5A);
  std::uint64_t frames = 0;
  BenchFile file;
  file.path = zelta_bench::writeBenchFile("zelta_read_path_hd.mxf", [&](std::ostream& out) {
    writeContainer(out, elementPrefix + hdPictureOctets, [&](KLVHandler& essence) {
      writeIndividualItem(essence, hdPictureKey, picture.data(), hdPictureOctets);
      ++frames;
    });
  });
  file.essenceElements = frames;
  file.handlerBuffers = 1;
  return file;
}

// 201 times the 24 edit units of the file in tests/data, by ffmpeg as it
// writes such files: 4,824 edit units, 772 MB. Empty when ffmpeg is missing.
BenchFile writeLongGOP() {
  BenchFile file;
  const std::string source = std::string(ZELTA_TEST_DATA) + "/ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf";
  const std::string path = zelta_bench::benchFilePath("zelta_read_path_longgop.mxf");
  const std::string command = "ffmpeg -v error -y -stream_loop 200 -i '" + source + "' -map 0 -c copy -f mxf '" +
                              path + "' </dev/null";
  if (std::system(command.c_str()) != 0) return file;
  file.path = path;
  file.essenceElements = 201 * 24 * 9;
  file.handlerBuffers = 4;
  return file;
}

// Each file once per process, on first use.
const BenchFile& benchFile(FileKind kind) {
  static std::map<FileKind, BenchFile> files;
  const auto found = files.find(kind);
  if (found != files.end()) return found->second;
  BenchFile file = kind == d10File ? writeD10() : kind == hdFile ? writeHD() : writeLongGOP();
  if (!file.path.empty()) file.octets = fileOctets(file.path);
  return files[kind] = file;
}

// The file of the case's first argument, or none when it could not be made.
const BenchFile* caseFile(benchmark::State& state) {
  const BenchFile& file = benchFile(static_cast<FileKind>(state.range(0)));
  if (!file.path.empty()) return &file;
  state.SkipWithError("ffmpeg could not make the file");
  return nullptr;
}

// Takes every system item and essence element; essence into its buffers.
class TakingHandler : public DullMXFGCSystemHandler, public DullMXFGCEssenceHandler {
public:
  explicit TakingHandler(std::size_t buffers) : buffers_(buffers) {}
  bool startSystemElement(const KLVKey&) override { return true; }
  void systemFixedPack(const KLVKey&, const ByteVector& bytes) override { benchmark::DoNotOptimize(bytes.data()); }
  bool startEssenceElement(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    buffer = buffers_.next(length);
    return true;
  }
  void pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t) override { deliver(data); }
  void soundElement(const KLVKey&, const std::uint8_t* data, std::uint64_t) override { deliver(data); }

  std::uint64_t elements = 0;

private:
  void deliver(const std::uint8_t* data) {
    benchmark::DoNotOptimize(data);
    ++elements;
  }
  zelta_bench::BufferPool buffers_;
};

class MetadataSink : public MXFMetadataHandler {
public:
  void start() override {}
  void end() override {}
  void primer(const MXFPrimerEntries&) override {}
  bool acceptSet(const KLVKey&) override { return true; }
  void primedSet(const MXFPrimedSet& set) override { benchmark::DoNotOptimize(&set); }
};

class IndexSink : public MXFIndexHandler {
public:
  void startIndex() override {}
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment& segment) override { benchmark::DoNotOptimize(&segment); }
};

// Arguments: the file and the client's stream buffer size (0: the file
// stream's own).
void BM_EssenceRead(benchmark::State& state) {
  const BenchFile* file = caseFile(state);
  if (!file) return;
  std::vector<char> streamBuffer(static_cast<std::size_t>(state.range(1)));
  TakingHandler handler(file->handlerBuffers);
  std::uint64_t octets = 0;
  for (auto _ : state) {
    std::ifstream in;
    zelta_bench::openWithStreamBuffer(in, file->path, streamBuffer);
    MXFGCSplitter splitter(nullptr, &handler, &handler);
    MXFReader reader;
    reader.setEssenceHandler(&splitter);
    handler.elements = 0;
    reader.read(in);
    check(handler.elements == file->essenceElements, "every essence element read");
    octets += file->octets;
  }
  zelta_bench::reportThroughput(state, octets, octets / file->octets * file->essenceElements);
}

void BM_SkipWalk(benchmark::State& state) {
  const BenchFile* file = caseFile(state);
  if (!file) return;
  std::vector<char> streamBuffer(static_cast<std::size_t>(state.range(1)));
  std::uint64_t octets = 0;
  for (auto _ : state) {
    std::ifstream in;
    zelta_bench::openWithStreamBuffer(in, file->path, streamBuffer);
    DullMXFStructureHandler structure;
    MetadataSink metadata;
    MXFMetadataParser metadataParser(&metadata);
    IndexSink index;
    MXFIndexParser indexParser(&index);
    MXFReader reader;
    reader.setStructureHandler(&structure);
    reader.setMetadataHandler(&metadataParser);
    reader.setIndexHandler(&indexParser);
    reader.read(in);
    check(in.eof(), "whole bench file walked");
    octets += file->octets;
  }
  zelta_bench::reportThroughput(state, octets, octets / file->octets * file->essenceElements);
}

class ModelSink : public ZeltaMetadataHandler {
public:
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel& objects) override { benchmark::DoNotOptimize(&objects); }
  void packageItem(const std::uint8_t* data, std::size_t) override { benchmark::DoNotOptimize(data); }
};

class ReportSink : public ErrorHandler {
public:
  void setLocator(Locator*) override {}
  void start() override {}
  void end() override {}
  void warning(const MXFUID&, const std::string& message) override { benchmark::DoNotOptimize(&message); }
  void error(const MXFUID&, const std::string& message) override { benchmark::DoNotOptimize(&message); }
  void fatalError(const MXFUID&, const std::string& message) override { benchmark::DoNotOptimize(&message); }
};

template <typename T>
std::shared_ptr<T> borrowed(T& object) {
  return std::shared_ptr<T>(&object, [](T*) {});
}

// Arguments: the file, the client's stream buffer size, and 1 for every
// handler with an error handler, 0 for the essence handler alone.
void BM_KitRead(benchmark::State& state) {
  const BenchFile* file = caseFile(state);
  if (!file) return;
  std::vector<char> streamBuffer(static_cast<std::size_t>(state.range(1)));
  TakingHandler essence(file->handlerBuffers);
  DullMXFStructureHandler structure;
  ModelSink metadata;
  IndexSink index;
  DullMXFGCStructureHandler editUnits;
  DullMXFSDTICPSystemHandler system;
  ReportSink reports;
  std::uint64_t octets = 0;
  for (auto _ : state) {
    auto in = std::make_shared<std::ifstream>();
    zelta_bench::openWithStreamBuffer(*in, file->path, streamBuffer);
    std::shared_ptr<ZeltaReader> reader = createZeltaReader(in);
    reader->setEssenceHandler(borrowed<MXFGCEssenceHandler>(essence));
    if (state.range(2) != 0) {
      reader->setStructureHandler(borrowed<MXFStructureHandler>(structure));
      reader->setMetadataHandler(borrowed<ZeltaMetadataHandler>(metadata));
      reader->setIndexHandler(borrowed<MXFIndexHandler>(index));
      reader->setGCStructureHandler(borrowed<MXFGCStructureHandler>(editUnits));
      reader->setSDTICPHandler(borrowed<MXFSDTICPSystemHandler>(system));
      reader->setErrorHandler(borrowed<ErrorHandler>(reports));
    }
    essence.elements = 0;
    reader->read();
    check(essence.elements == file->essenceElements, "every essence element read");
    octets += file->octets;
  }
  zelta_bench::reportThroughput(state, octets, octets / file->octets * file->essenceElements);
}

// Arguments: the file, and the size of the reads and of the one buffer that
// they fill.
void BM_PlainReadLoop(benchmark::State& state) {
  const BenchFile* file = caseFile(state);
  if (file)
    zelta_bench::plainReadLoop(state, file->path, file->octets, file->octets / file->essenceElements,
                               static_cast<std::size_t>(state.range(1)));
}

void BM_PreadWalk(benchmark::State& state) {
  const BenchFile* file = caseFile(state);
  if (file) zelta_bench::preadWalk(state, file->path, file->octets, file->octets / file->essenceElements);
}

const std::int64_t files[] = {d10File, longGOPFile, hdFile};
const std::int64_t streamBuffers[] = {256, 0, 65536, 1048576};

void readerCases(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgNames({"file", "streamBuffer"});
  for (const std::int64_t file : files)
    for (const std::int64_t buffer : streamBuffers) benchmark->Args({file, buffer});
  benchmark->Unit(benchmark::kMillisecond)->UseRealTime();
}

void kitCases(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgNames({"file", "streamBuffer", "everyHandler"});
  for (const std::int64_t buffer : {std::int64_t(0), std::int64_t(1048576)})
    for (const std::int64_t every : {0, 1}) benchmark->Args({d10File, buffer, every});
  benchmark->Unit(benchmark::kMillisecond)->UseRealTime();
}

void walkCases(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgName("file");
  for (const std::int64_t file : files) benchmark->Arg(file);
  benchmark->Unit(benchmark::kMillisecond)->UseRealTime();
}

// Reads of 1 MiB, the yardstick; and, for context, reads of a picture into
// a buffer of a picture's size, which is where the essence read writes: the
// size of the destination alone changes the speed of the kernel's copy.
void plainCases(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgNames({"file", "buffer"});
  for (const std::int64_t file : files) benchmark->Args({file, std::int64_t(zelta_bench::plainBufferOctets)});
  benchmark->Args({d10File, std::int64_t(d10PictureOctets)})->Args({hdFile, std::int64_t(hdPictureOctets)});
  benchmark->Unit(benchmark::kMillisecond)->UseRealTime();
}

}  // namespace

BENCHMARK(BM_PlainReadLoop)->Apply(plainCases);
BENCHMARK(BM_EssenceRead)->Apply(readerCases);
BENCHMARK(BM_PreadWalk)->Apply(walkCases);
BENCHMARK(BM_SkipWalk)->Apply(readerCases);
BENCHMARK(BM_KitRead)->Apply(kitCases);

BENCHMARK_MAIN();
