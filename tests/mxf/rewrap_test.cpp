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
#include "support/mxf_rewrap.h"
#include "support/mxf_index_segments.h"
#include "support/mxf_primed_sets.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/essence_recording.h"
#include "support/recording.h"
#include "support/run_program.h"

using namespace zelta_test;

namespace {

// The essence as edit units: the splitter's events piped into the muxer.
void writeEditUnits(const ByteVector& essence, KLVHandler* handler) {
  MXFGCMuxer muxer(handler);
  MXFGCSplitter splitter(muxer.getStructureHandler(), muxer.getSystemHandler(), muxer.getEssenceHandler());
  readThrough(essence, splitter);
}

// The files that read to their end.
const char* const rewrappedFiles[] = {
    "bmx_d10_50m_625_8ch24.mxf",        "bmx_op1a_dv25_625_bodypart_part4.mxf",
    "bmx_op1a_dv25_625_singlepass.mxf", "damaged_no_rip.mxf",
    "ffmpeg_d10_50m_625_noaudio.mxf",   "ffmpeg_dv25_625_420_2mono.mxf",
    "ffmpeg_h264_high_longgop_1080p25_2mono.mxf", "ffmpeg_opatom_dv25_625_v1.mxf",
    "gst_dv25_625_420_2mono.mxf",       "gst_h264_high_longgop_1080p25_2mono.mxf"};

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
    const ByteVector bytes = rewrap(original, writeEditUnits);
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
