// Writing speed of the driver into a file of the page cache, against a
// plain write() of the same number of octets in the same run, on two clips
// of at least 1 GiB:
// - D-10 at 50 Mbit/s and 625 lines with eight channels: a system item, a
//   250,000-octet picture and an AES3 sound element per edit unit;
// - long-GOP MPEG-2 at 50 Mbit/s, 1080 lines, with eight mono channels: the
//   variable rate road, pictures indexed from their bitstream, a body
//   partition about every ten seconds.
// The source hands out buffers that it made once, as a capture card's ring
// does. Peak resident memory is reported after each run, the smaller clip
// first, so that a growth with the clip's length would show.
#include <benchmark/benchmark.h>

#include <fcntl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "bench_files.h"
#include "kit.h"

namespace {

enum ClipKind { d10Clip, longGOPClip };

constexpr std::uint32_t channelCount = 8;
constexpr std::size_t d10PictureOctets = 250000;
constexpr std::size_t d10SoundOctets = 4 + 1920 * 8 * 4;
constexpr std::size_t longGOPPictureOctets = 250000;
constexpr std::size_t monoSoundOctets = 1920 * 3;
constexpr std::size_t gopLength = 12;

class Buffer : public ZeltaBuffer {
public:
  explicit Buffer(ByteVector bytes) : bytes_(std::move(bytes)) {}
  const std::uint8_t* getData() const override { return bytes_.data(); }
  std::size_t getSize() const override { return bytes_.size(); }

private:
  ByteVector bytes_;
};

// A frame of the size given that says what an indexer reads: a sequence and
// GOP header before an I picture, and the picture header.
ByteVector mpeg2Frame(std::uint16_t temporalReference, std::uint8_t codingType) {
  ByteVector bytes;
  if (codingType == 1) {
    bytes.insert(bytes.end(), {0x00, 0x00, 0x01, 0xB3, 0x78, 0x04, 0x38, 0x35, 0xFF, 0xFF, 0xE0, 0x18});
    bytes.insert(bytes.end(), {0x00, 0x00, 0x01, 0xB8, 0x00, 0x08, 0x00, 0x40});
  }
  bytes.insert(bytes.end(), {0x00, 0x00, 0x01, 0x00, static_cast<std::uint8_t>(temporalReference >> 2),
                             static_cast<std::uint8_t>(((temporalReference & 3) << 6) | (codingType << 3))});
  bytes.resize(longGOPPictureOctets, 0x5A);
  return bytes;
}

std::shared_ptr<ZeltaDefaultMetadata> masterOf(ClipKind kind, std::uint64_t units) {
  auto m = std::make_shared<ZeltaDefaultMetadata>();
  m->prefaceVersion = kind == d10Clip ? 0x0102 : 0x0103;
  m->materialPackageUID = UMID::createNew(0x0F);
  m->filePackageUID = UMID::createNew(0x0F);
  m->packageName = L"bench";
  m->editRate = {25, 1};
  m->bitRate = 50000000;
  m->progressive = false;
  m->aspectRatio = {16, 9};
  m->componentDepth = 8;
  m->subsampling = {2, 1};
  m->audioChannelCount = channelCount;
  m->quantizationBits = 24;
  m->audioSamplingRates.assign(channelCount, MXFRational{48000, 1});
  m->duration = units;
  m->indexSID = 2;
  m->bodySID = 1;
  if (kind == d10Clip) {
    m->essenceFormat = static_cast<std::uint32_t>(ZeltaEssenceFormat::D10);
    m->displaySize = {720, 288};
    m->videoLineMap = {7, 320};
  } else {
    m->essenceFormat = static_cast<std::uint32_t>(ZeltaEssenceFormat::MPEG);
    m->displaySize = {1920, 540};
    m->videoLineMap = {21, 584};
    m->singleSequence = true;
    m->closedGOP = true;
    m->identicalGOP = true;
    m->maxGOP = gopLength;
    m->bPictureCount = 2;
    m->profileAndLevel = 130;
  }
  return m;
}

class BenchSource : public ZeltaSource {
public:
  BenchSource(ClipKind kind, std::uint64_t units) : master_(masterOf(kind, units)), units_(units) {
    if (kind == d10Clip) {
      pictures_.push_back(std::make_shared<Buffer>(ByteVector(d10PictureOctets, 0x11)));
      d10Sound_ = std::make_shared<Buffer>(ByteVector(d10SoundOctets, 0x22));
    } else {
      static const std::uint8_t types[gopLength] = {1, 3, 3, 2, 3, 3, 2, 3, 3, 2, 3, 3};
      for (std::size_t i = 0; i < gopLength; ++i)
        pictures_.push_back(std::make_shared<Buffer>(mpeg2Frame(static_cast<std::uint16_t>(i), types[i])));
    }
    for (std::uint32_t channel = 0; channel < channelCount; ++channel)
      sounds_.push_back(std::make_shared<Buffer>(ByteVector(monoSoundOctets, static_cast<std::uint8_t>(channel))));
  }

  std::shared_ptr<const ZeltaMasterMetadata> getMasterMetadata() override { return master_; }
  std::shared_ptr<MXFUIDGenerator> getUIDGenerator() override { return nullptr; }
  bool hasPictureMetadata() override { return false; }
  bool isIndexDeferred() override { return false; }
  std::uint32_t getAVCWrapping() override { return 0; }
  bool hasMoreEditUnits() override { return served_ < units_; }
  MXFSDTICPTimeStamp getUserStamp() override { return MXFSDTICPTimeStamp{}; }
  MXFGCLocalItems getPackageMetadata() override { return {}; }
  MXFGCLocalItems getPictureMetadata() override { return {}; }
  std::shared_ptr<ZeltaBuffer> getD10Picture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getD10Sound() override { return d10Sound_; }
  std::shared_ptr<ZeltaBuffer> getDVElement() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getMPEGPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getRawPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getAVCPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getSound(std::uint32_t channel) override { return sounds_.at(channel); }
  std::shared_ptr<ZeltaBuffer> getAncillaryData() override { return nullptr; }

private:
  std::shared_ptr<ZeltaBuffer> picture() { return pictures_[served_++ % pictures_.size()]; }

  std::shared_ptr<ZeltaDefaultMetadata> master_;
  std::uint64_t units_;
  std::uint64_t served_ = 0;
  std::vector<std::shared_ptr<ZeltaBuffer>> pictures_;
  std::shared_ptr<ZeltaBuffer> d10Sound_;
  std::vector<std::shared_ptr<ZeltaBuffer>> sounds_;
};

// Edit units for a clip of at least the octets given.
std::uint64_t unitsFor(ClipKind kind, std::uint64_t octets) {
  const std::uint64_t perUnit = kind == d10Clip ? 512 + 250368 + 61952 : 512 + 251904 + channelCount * 6144;
  return (octets + perUnit - 1) / perUnit;
}

std::uint64_t fileSize(const std::string& path) {
  std::ifstream in(path, std::ios::binary | std::ios::ate);
  return static_cast<std::uint64_t>(std::streamoff(in.tellg()));
}

double peakResidentMiB() {
  rusage usage{};
  ::getrusage(RUSAGE_SELF, &usage);
  return static_cast<double>(usage.ru_maxrss) / 1024.0;
}

std::uint64_t clipOctets(benchmark::State& state) { return std::uint64_t(state.range(1)) << 20; }

// The driver into a std::ofstream with the buffer it comes with.
void BM_DriverWrite(benchmark::State& state) {
  const auto kind = static_cast<ClipKind>(state.range(0));
  const std::uint64_t units = unitsFor(kind, clipOctets(state));
  const std::string path = zelta_bench::benchFilePath(kind == d10Clip ? "driver_d10.mxf" : "driver_lgop.mxf");
  const auto writeClip = [&] {
    auto out = std::make_shared<std::ofstream>(path, std::ios::binary | std::ios::trunc);
    createZeltaDriver(std::make_shared<BenchSource>(kind, units))->drive(createZeltaWriter(out));
    out->close();
  };
  // One clip before the timed ones, as the plain loop writes one to learn
  // its size, so that both start from the same state of the page cache.
  writeClip();
  std::uint64_t octets = 0;
  for (auto _ : state) {
    writeClip();
    octets += fileSize(path);
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(octets));
  state.counters["fileMiB"] = static_cast<double>(fileSize(path)) / (1 << 20);
  state.counters["peakRSSMiB"] = peakResidentMiB();
  // The page cache holds only the file of the benchmark that runs.
  std::remove(path.c_str());
}

// The yardstick: write() of as many octets as the driver's file holds, in
// pieces of 1 MiB.
void BM_PlainWrite(benchmark::State& state) {
  const auto kind = static_cast<ClipKind>(state.range(0));
  const std::uint64_t units = unitsFor(kind, clipOctets(state));
  const std::string sized = zelta_bench::benchFilePath(kind == d10Clip ? "sized_d10.mxf" : "sized_lgop.mxf");
  {
    auto out = std::make_shared<std::ofstream>(sized, std::ios::binary | std::ios::trunc);
    createZeltaDriver(std::make_shared<BenchSource>(kind, units))->drive(createZeltaWriter(out));
  }
  const std::uint64_t total = fileSize(sized);
  std::remove(sized.c_str());
  const std::string path = zelta_bench::benchFilePath("plain_write.bin");
  std::vector<char> buffer(zelta_bench::plainBufferOctets, 0x33);
  std::uint64_t octets = 0;
  for (auto _ : state) {
    const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    check(fd >= 0, "bench file opened");
    for (std::uint64_t left = total; left > 0;) {
      const std::size_t piece = static_cast<std::size_t>(std::min<std::uint64_t>(left, buffer.size()));
      const ssize_t n = ::write(fd, buffer.data(), piece);
      check(n > 0, "bench file written");
      left -= static_cast<std::uint64_t>(n);
    }
    ::close(fd);
    octets += total;
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(octets));
  std::remove(path.c_str());
}

void clipCases(benchmark::internal::Benchmark* benchmark) {
  benchmark->ArgNames({"clip", "MiB"});
  for (const std::int64_t kind : {d10Clip, longGOPClip})
    for (const std::int64_t mib : {256, 1100}) benchmark->Args({kind, mib});
  benchmark->Unit(benchmark::kMillisecond)->UseRealTime();
}

}  // namespace

BENCHMARK(BM_PlainWrite)->Apply(clipCases);
BENCHMARK(BM_DriverWrite)->Apply(clipCases);

BENCHMARK_MAIN();
