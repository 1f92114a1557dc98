// What indexing long-GOP pictures costs against reading them: the picture
// elements of the MPEG-2 and H.264 files of tests/data, taken in memory and
// repeated to at least 1 GiB, go through MXFMPEGIndexer or MXFAVCIndexer
// (then flushIndex) edit unit by edit unit; the same octets, written once as
// a file, are read by a plain read() loop in the same run. Indexing should
// cost well under a twentieth of the read.
#include <benchmark/benchmark.h>

#include <fstream>
#include <type_traits>
#include <memory>
#include <string>
#include <vector>

#include "bench_files.h"
#include "klv.h"
#include "mxf.h"

namespace {

enum Codec { mpeg2, avc };

const char* const mpeg2Files[] = {"ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf",
                                  "bmx_op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf",
                                  "bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf"};
const char* const avcFiles[] = {"ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
                                "bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf",
                                "gst_h264_high_longgop_1080p25_2mono.mxf"};

typedef std::vector<ByteVector> Pictures;

// The picture elements of one file, in stored order, whatever number the
// writer gave its picture element.
class PictureCollector : public DullMXFGCEssenceHandler {
public:
  explicit PictureCollector(Pictures& pictures) : pictures_(pictures) {}
  bool startEssenceElement(const KLVKey&, std::uint64_t, std::uint8_t*&) override { return true; }
  void pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override {
    pictures_.emplace_back(data, data + length);
  }

private:
  Pictures& pictures_;
};

struct Stream {
  std::vector<Pictures> files;  // each file's pictures, a GOP structure of its own
  std::uint64_t octets = 0;     // of one pass over every file
  std::uint64_t pictures = 0;
  std::uint64_t repeats = 0;    // passes that make at least leastFileOctets
  std::string path;             // the repeated octets as one file
};

Stream loadStream(Codec codec) {
  Stream stream;
  for (const char* name : codec == mpeg2 ? mpeg2Files : avcFiles) {
    std::ifstream in(std::string(ZELTA_TEST_DATA) + "/" + name, std::ios::binary);
    check(in.is_open(), "test file opened");
    Pictures pictures;
    PictureCollector collector(pictures);
    MXFGCSplitter splitter(nullptr, nullptr, &collector);
    MXFReader reader;
    reader.setEssenceHandler(&splitter);
    reader.read(in);
    check(!pictures.empty(), "pictures in the test file");
    for (const ByteVector& picture : pictures) stream.octets += picture.size();
    stream.pictures += pictures.size();
    stream.files.push_back(std::move(pictures));
  }
  stream.repeats = (zelta_bench::leastFileOctets + stream.octets - 1) / stream.octets;
  stream.path = zelta_bench::writeBenchFile(codec == mpeg2 ? "pictures.m2v" : "pictures.h264", [&](std::ostream& out) {
    for (std::uint64_t i = 0; i < stream.repeats; ++i)
      for (const Pictures& pictures : stream.files)
        for (const ByteVector& picture : pictures)
          out.write(reinterpret_cast<const char*>(picture.data()), static_cast<std::streamsize>(picture.size()));
  });
  return stream;
}

const Stream& streamOf(Codec codec) {
  static const Stream streams[] = {loadStream(mpeg2), loadStream(avc)};
  return streams[codec];
}

class Position : public Locator {
public:
  const std::streampos& getPosition() override { return position_; }
  void advance(std::uint64_t octets) { position_ += static_cast<std::streamoff>(octets); }

private:
  std::streampos position_ = 0;
};

// Every picture of an iteration through one indexer, as a writer indexes a
// long clip: each file's stream begins with a key picture and its parameter
// sets, so the files follow one another as one stream.
template <typename Indexer>
void indexStream(benchmark::State& state, Codec codec) {
  const Stream& stream = streamOf(codec);
  std::uint64_t octets = 0;
  for (auto _ : state) {
    Position position;
    DullMXFGCStructureHandler structure;
    DullMXFGCEssenceHandler essence;
    MXFIndexTableSegment segment;
    Indexer indexer(&structure, &essence, &position, &segment);
    indexer.start(0);
    for (std::uint64_t i = 0; i < stream.repeats; ++i)
      for (const Pictures& pictures : stream.files)
        for (const ByteVector& picture : pictures) {
          indexer.startEditUnit();
          indexer.pictureElement(MXFMPEGPictureElementKey, picture.data(), picture.size());
          position.advance(picture.size() + 20);
          indexer.endEditUnit();
        }
    if constexpr (std::is_same_v<Indexer, MXFAVCIndexer>) indexer.flushIndex();
    indexer.end();
    check(segment.indexEntryArray.size() == stream.repeats * stream.pictures, "an entry for every picture");
    octets += stream.repeats * stream.octets;
  }
  zelta_bench::reportThroughput(state, octets, octets / (stream.octets / stream.pictures));
}

void BM_PlainReadOfPictures(benchmark::State& state) {
  const Stream& stream = streamOf(static_cast<Codec>(state.range(0)));
  zelta_bench::plainReadLoop(state, stream.path, stream.repeats * stream.octets, stream.octets / stream.pictures);
}

void BM_MPEGIndexer(benchmark::State& state) { indexStream<MXFMPEGIndexer>(state, mpeg2); }
void BM_AVCIndexer(benchmark::State& state) { indexStream<MXFAVCIndexer>(state, avc); }

}  // namespace

BENCHMARK(BM_PlainReadOfPictures)->ArgName("avc")->Arg(mpeg2)->Arg(avc)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_MPEGIndexer)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_AVCIndexer)->Unit(benchmark::kMillisecond);

BENCHMARK_MAIN();
