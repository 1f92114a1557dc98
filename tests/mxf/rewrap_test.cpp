// Files of tests/data read through MXFReader and written again through
// MXFWriter: header metadata as primed sets, index as segments, essence as
// it came or through the generic container splitter and muxer.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <memory>
#include <sstream>

#include "mxf.h"
#include "support/mxf_index_segments.h"
#include "support/mxf_primed_sets.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/essence_recording.h"
#include "support/recording.h"
#include "support/run_program.h"

using namespace zelta_test;

namespace {

struct Partition {
  KLVKey key;
  MXFPartitionPack pack;
  bool hasMetadata = false;
  MXFPrimerEntries primer;
  std::vector<MXFPrimedSet> sets;
  bool hasIndex = false;
  std::vector<MXFIndexTableSegment> segments;
  ByteVector essence;
};

struct Capture {
  std::vector<Partition> partitions;
  RecordingErrorHandler errors;
};

class PartitionCollector : public DullMXFStructureHandler {
public:
  explicit PartitionCollector(Capture& capture) : capture_(capture) {}
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t) override {
    capture_.partitions.emplace_back();
    capture_.partitions.back().key = key;
    capture_.partitions.back().pack = pack;
  }

private:
  Capture& capture_;
};

class MetadataCollector : public MXFMetadataHandler {
public:
  explicit MetadataCollector(Capture& capture) : capture_(capture) {}
  void start() override { capture_.partitions.back().hasMetadata = true; }
  void end() override {}
  void primer(const MXFPrimerEntries& entries) override { capture_.partitions.back().primer = entries; }
  bool acceptSet(const KLVKey&) override { return true; }
  void primedSet(const MXFPrimedSet& set) override { capture_.partitions.back().sets.push_back(set); }

private:
  Capture& capture_;
};

class IndexCollector : public MXFIndexHandler {
public:
  explicit IndexCollector(Capture& capture) : capture_(capture) {}
  void startIndex() override { capture_.partitions.back().hasIndex = true; }
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment& segment) override {
    capture_.partitions.back().segments.push_back(segment);
  }

private:
  Capture& capture_;
};

// Writes each essence section back into octets, as it came; a section that
// begins without a length form gets the last one seen.
class EssenceCollector : public DullKLVFilter {
public:
  explicit EssenceCollector(Capture& capture) : capture_(capture) {}
  void setLocator(Locator*) override {}
  void startStream(bool hasAccurateLengths) override {
    out_.reset(new std::ostringstream);
    writer_.reset(new GenericKLVWriter(*out_));
    setHandler(writer_.get());
    DullKLVFilter::startStream(hasAccurateLengths);
    if (form_ != 0) DullKLVFilter::setLengthForm(form_);
  }
  void setLengthForm(std::uint8_t form) override {
    form_ = form;
    DullKLVFilter::setLengthForm(form);
  }
  void endStream(bool aborted) override {
    DullKLVFilter::endStream(aborted);
    const std::string text = out_->str();
    ByteVector& essence = capture_.partitions.back().essence;
    essence.insert(essence.end(), text.begin(), text.end());
  }

private:
  Capture& capture_;
  std::unique_ptr<std::ostringstream> out_;
  std::unique_ptr<GenericKLVWriter> writer_;
  std::uint8_t form_ = 0;
};

void capture(std::istream& stream, Capture& result) {
  PartitionCollector structure(result);
  MetadataCollector metadata(result);
  MXFMetadataParser metadataParser(&metadata);
  IndexCollector index(result);
  MXFIndexParser indexParser(&index);
  EssenceCollector essence(result);
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setStructureHandler(&structure);
  reader.setMetadataHandler(&metadataParser);
  reader.setIndexHandler(&indexParser);
  reader.setEssenceHandler(&essence);
  reader.setErrorHandler(&result.errors);
  reader.read(stream);
}

void codeMetadata(const Partition& partition, KLVHandler* handler) {
  MXFMetadataCoder coder(handler);
  coder.start();
  coder.primer(partition.primer);
  for (const MXFPrimedSet& set : partition.sets) coder.primedSet(set);
  coder.end();
}

void codeIndex(const Partition& partition, KLVHandler* handler) {
  MXFIndexCoder coder(handler);
  coder.setKagSize(partition.pack.kagSize);
  coder.startIndex();
  for (const MXFIndexTableSegment& segment : partition.segments) coder.indexTableSegment(segment);
  coder.endIndex();
}

// What a region takes when coded alone, with room for a fill item, rounded
// up to the KAG.
template <typename Code>
std::uint64_t regionSize(const Partition& partition, Code code) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  code(partition, &writer);
  const std::uint64_t kag = partition.pack.kagSize == 0 ? 1 : partition.pack.kagSize;
  const std::uint64_t needed = out.str().size() + 20;
  return (needed + kag - 1) / kag * kag;
}

enum class EssenceRoute { asKLV, throughGenericContainer };

// The essence as edit units: the splitter's events piped into the muxer.
void writeEditUnits(const ByteVector& essence, KLVHandler* handler) {
  MXFGCMuxer muxer(handler);
  MXFGCSplitter splitter(muxer.getStructureHandler(), muxer.getSystemHandler(), muxer.getEssenceHandler());
  readThrough(essence, splitter);
}

void writePartition(MXFWriter& writer, const Partition& partition, EssenceRoute route) {
  MXFPartitionPack pack = partition.pack;
  pack.footerPartition = 0;
  pack.headerByteCount = partition.hasMetadata ? regionSize(partition, codeMetadata) : 0;
  pack.indexByteCount = partition.hasIndex ? regionSize(partition, codeIndex) : 0;
  writer.getStructureHandler()->startPartition(partition.key, pack, 0);
  if (partition.hasMetadata) codeMetadata(partition, writer.getMetadataHandler());
  if (partition.hasIndex) codeIndex(partition, writer.getIndexHandler());
  if (!partition.essence.empty()) {
    if (route == EssenceRoute::asKLV)
      readThrough(partition.essence, *writer.getEssenceHandler());
    else
      writeEditUnits(partition.essence, writer.getEssenceHandler());
  }
  writer.getStructureHandler()->endPartition(partition.key);
}

ByteVector rewrap(const Capture& original, EssenceRoute route = EssenceRoute::asKLV) {
  std::ostringstream out;
  {
    MXFWriter writer(out);
    writer.getStructureHandler()->startStream();
    for (const Partition& partition : original.partitions) writePartition(writer, partition, route);
    writer.getStructureHandler()->randomIndex({});
    writer.getStructureHandler()->endStream(false);
  }
  const std::string text = out.str();
  return ByteVector(text.begin(), text.end());
}

// The files that read to their end.
const char* const rewrappedFiles[] = {
    "bmx_d10_50m_625_8ch24.mxf",        "bmx_op1a_dv25_625_bodypart_part4.mxf",
    "bmx_op1a_dv25_625_singlepass.mxf", "damaged_no_rip.mxf",
    "ffmpeg_d10_50m_625_noaudio.mxf",   "ffmpeg_dv25_625_420_2mono.mxf",
    "ffmpeg_h264_high_longgop_1080p25_2mono.mxf", "ffmpeg_opatom_dv25_625_v1.mxf",
    "gst_dv25_625_420_2mono.mxf",       "gst_h264_high_longgop_1080p25_2mono.mxf"};

void captureFile(const std::string& name, Capture& result) {
  std::ifstream stream(dataPath(name), std::ios::binary);
  ASSERT_TRUE(stream.good()) << name;
  capture(stream, result);
}

std::size_t essenceSize(const Capture& capture) {
  std::size_t size = 0;
  for (const Partition& partition : capture.partitions) size += partition.essence.size();
  return size;
}

void expectSameContent(const Capture& original, const Capture& again) {
  EXPECT_GT(essenceSize(original), 0u);
  ASSERT_EQ(again.partitions.size(), original.partitions.size());
  for (std::size_t i = 0; i < original.partitions.size(); ++i) {
    SCOPED_TRACE(i);
    const Partition& before = original.partitions[i];
    const Partition& after = again.partitions[i];
    EXPECT_EQ(after.key, before.key);
    EXPECT_EQ(after.primer, before.primer);
    EXPECT_EQ(after.sets, before.sets);
    EXPECT_EQ(after.segments, before.segments);
    EXPECT_EQ(after.essence, before.essence);
  }
}

// The edit units of a file's essence, partition by partition, with the
// bytes of every element.
RecordingGCHandler editUnitsOf(const Capture& capture) {
  RecordingGCHandler units(RecordingGCHandler::take);
  for (const Partition& partition : capture.partitions) {
    if (partition.essence.empty()) continue;
    MXFGCSplitter splitter(&units, &units, &units);
    readThrough(partition.essence, splitter);
  }
  return units;
}

}  // namespace

TEST(MXFRewrap, EssencePipedThroughSplitterAndMuxerReadsBackWithTheSameEditUnitsAndBytes) {
  for (const char* name : rewrappedFiles) {
    SCOPED_TRACE(name);
    Capture original;
    captureFile(name, original);
    const ByteVector bytes = rewrap(original, EssenceRoute::throughGenericContainer);
    Capture again;
    util::vector_istream in(bytes);
    capture(in, again);
    EXPECT_EQ(reportLines(again.errors), std::vector<std::string>());
    const RecordingGCHandler before = editUnitsOf(original);
    const RecordingGCHandler after = editUnitsOf(again);
    EXPECT_NE(std::count(before.events.begin(), before.events.end(), "startEditUnit"), 0);
    EXPECT_EQ(after.events, before.events);
    ASSERT_EQ(after.elements.size(), before.elements.size());
    for (std::size_t i = 0; i < before.elements.size(); ++i) {
      EXPECT_EQ(after.elements[i].key, before.elements[i].key);
      EXPECT_EQ(after.elements[i].bytes, before.elements[i].bytes) << i;
    }
  }
}

TEST(MXFRewrap, RewrappedFilesReadBackWithoutReportsAndWithTheSameContent) {
  for (const char* name : rewrappedFiles) {
    SCOPED_TRACE(name);
    Capture original;
    captureFile(name, original);
    ASSERT_FALSE(original.partitions.empty());
    ASSERT_FALSE(original.partitions.front().sets.empty());
    const ByteVector bytes = rewrap(original);
    Capture again;
    util::vector_istream in(bytes);
    capture(in, again);
    EXPECT_EQ(reportLines(again.errors), std::vector<std::string>());
    expectSameContent(original, again);
  }
}

TEST(MXFRewrap, RewrappedFilesAreAcceptedByFfprobeAndMediainfo) {
  if (runProgram("command -v ffprobe").status != 0 || runProgram("command -v mediainfo").status != 0)
    GTEST_SKIP() << "ffprobe or mediainfo is not installed";
  for (const char* name : rewrappedFiles) {
    SCOPED_TRACE(name);
    Capture original;
    captureFile(name, original);
    const ByteVector bytes = rewrap(original);
    const std::string path = testing::TempDir() + "zelta_rewrap_" + name;
    std::ofstream(path, std::ios::binary).write(reinterpret_cast<const char*>(bytes.data()),
                                                static_cast<std::streamsize>(bytes.size()));
    const ProgramRun probe = runProgram("ffprobe -v error -show_streams '" + path + "'");
    EXPECT_EQ(probe.status, 0) << probe.err;
    EXPECT_NE(probe.out.find("[STREAM]"), std::string::npos);
    const ProgramRun info = runProgram("mediainfo '" + path + "'");
    EXPECT_EQ(info.status, 0);
    EXPECT_NE(info.out.find("Format                                   : MXF"), std::string::npos) << info.out;
    std::remove(path.c_str());
  }
}
