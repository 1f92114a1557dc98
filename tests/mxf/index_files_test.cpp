// Index table segments of the files of tests/data against what an
// independent tool dumps of them, and their round trip through the coder.
#include <gtest/gtest.h>

#include <fstream>
#include <stdexcept>

#include "mxf.h"
#include "support/mxf_index_segments.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

struct ExpectedDelta {
  int posTableIndex;
  int slice;
  std::uint32_t elementDelta;
};

struct ExpectedEntry {
  int temporalOffset;
  int keyFrameOffset;
  unsigned flags;
  std::uint64_t streamOffset;
};

struct ExpectedSegment {
  MXFRational indexEditRate;
  std::int64_t indexStartPosition;
  std::int64_t indexDuration;
  std::uint32_t editUnitByteCount;
  std::vector<ExpectedDelta> deltaEntries;
  std::vector<ExpectedEntry> indexEntries;
};

struct ExpectedFile {
  const char* name;
  std::vector<ExpectedSegment> segments;
};

// Spelled from a KLV trace of each file by another MXF tool. The OP-Atom
// file of bmx and the file with a damaged header key do not read to their
// end and are left out; the truncated file gives its header index.
const std::vector<ExpectedFile> expectedFiles{
    {"bmx_d10_50m_625_8ch24.mxf",
     {{{25, 1}, 0, 5, 312832,
       {{0, 0, 0}, {0, 0, 512}, {0, 0, 250880}},
       {}},
      }},
    {"bmx_op1a_dv25_625_bodypart_part4.mxf",
     {{{25, 1}, 0, 6, 151740,
       {{0, 0, 0}, {0, 0, 144020}, {0, 0, 147880}},
       {}},
      }},
    {"bmx_op1a_dv25_625_singlepass.mxf",
     {{{25, 1}, 0, 0, 151740,
       {{0, 0, 0}, {0, 0, 144020}, {0, 0, 147880}},
       {}},
      }},
    {"damaged_no_rip.mxf",
     {{{25, 1}, 0, 0, 212992,
       {{0, 0, 0}, {0, 0, 512}, {0, 0, 151040}},
       {}},
      }},
    {"damaged_truncated_50pct.mxf",
     {{{25, 1}, 0, 6, 151740,
       {{0, 0, 0}, {0, 0, 144020}, {0, 0, 147880}},
       {}},
      }},
    {"ffmpeg_d10_50m_625_noaudio.mxf",
     {{{25, 1}, 0, 0, 250880,
       {{0, 0, 0}, {0, 0, 512}},
       {}},
      }},
    {"ffmpeg_dv25_625_420_2mono.mxf",
     {{{25, 1}, 0, 0, 153088,
       {{0, 0, 0}, {0, 0, 512}, {0, 0, 144896}, {0, 0, 148992}},
       {}},
      }},
    {"ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
     {{{25, 1}, 0, 24, 0,
       {{0, 0, 0}, {0, 0, 512}, {0, 1, 0}, {0, 1, 6144}},
       {
        {0, 0, 0xC4, 0}, {0, -1, 0x26, 80384}, {0, -2, 0x33, 152064}, {0, -3, 0x33, 211456},
        {0, -4, 0x26, 266240}, {0, -5, 0x33, 321024}, {0, -6, 0x33, 374784}, {0, -7, 0x26, 422400},
        {0, -8, 0x26, 468480}, {0, -9, 0x33, 514560}, {0, -10, 0x33, 556032}, {0, -11, 0x26, 595456},
        {0, 0, 0xC4, 635904}, {0, -1, 0x26, 714240}, {0, -2, 0x33, 764928}, {0, -3, 0x33, 805376},
        {0, -4, 0x26, 845824}, {0, -5, 0x26, 890368}, {0, -6, 0x33, 934400}, {0, -7, 0x33, 974336},
        {0, -8, 0x26, 1012224}, {0, -9, 0x33, 1053184}, {0, -10, 0x33, 1092608}, {0, -11, 0x26, 1130496},
       }},
      }},
    {"ffmpeg_opatom_dv25_625_v1.mxf",
     {{{25, 1}, 0, 0, 144000,
       {{0, 0, 0}, {0, 0, 0}},
       {}},
      }},
    {"gst_dv25_625_420_2mono.mxf",
     {{{25, 1}, 0, 6, 0,
       {},
       {
        {0, 0, 0x80, 0}, {0, 0, 0x80, 151738}, {0, 0, 0x80, 303476}, {0, 0, 0x80, 455214},
        {0, 0, 0x80, 606952}, {0, 0, 0x80, 758690},
       }},
      }},
    {"gst_h264_high_longgop_1080p25_2mono.mxf",
     {{{25, 1}, 0, 24, 0,
       {},
       {
        {0, 0, 0x80, 0}, {0, 1, 0x20, 78690}, {0, 2, 0x20, 148727}, {0, 3, 0x20, 206528},
        {0, 4, 0x20, 260038}, {0, 5, 0x20, 313123}, {0, 6, 0x20, 365529}, {0, 7, 0x20, 411502},
        {0, 8, 0x20, 456232}, {0, 9, 0x20, 501048}, {0, 10, 0x20, 541250}, {0, 11, 0x20, 578924},
        {0, 0, 0x80, 617778}, {0, 1, 0x20, 694484}, {0, 2, 0x20, 743654}, {0, 3, 0x20, 782641},
        {0, 4, 0x20, 821374}, {0, 5, 0x20, 864157}, {0, 6, 0x20, 906859}, {0, 7, 0x20, 945082},
        {0, 8, 0x20, 981398}, {0, 9, 0x20, 1020986}, {0, 10, 0x20, 1058915}, {0, 11, 0x20, 1095149},
       }},
      }},
};

// The segments of a file as far as it reads; a damaged file may end the
// read early.
std::vector<MXFIndexTableSegment> segmentsOf(const std::string& name) {
  RecordingIndexHandler handler;
  MXFIndexParser parser(&handler);
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setIndexHandler(&parser);
  std::ifstream stream(dataPath(name), std::ios::binary);
  try {
    reader.read(stream);
  } catch (const std::exception&) {
  }
  return handler.segments;
}

void expectSegment(const ExpectedSegment& expected, const MXFIndexTableSegment& segment) {
  EXPECT_EQ(segment.indexEditRate, expected.indexEditRate);
  EXPECT_EQ(segment.indexStartPosition, expected.indexStartPosition);
  EXPECT_EQ(segment.indexDuration, expected.indexDuration);
  EXPECT_EQ(segment.editUnitByteCount, expected.editUnitByteCount);
  ASSERT_EQ(segment.deltaEntryArray.size(), expected.deltaEntries.size());
  for (std::size_t i = 0; i < expected.deltaEntries.size(); ++i) {
    EXPECT_EQ(segment.deltaEntryArray[i].posTableIndex, expected.deltaEntries[i].posTableIndex) << i;
    EXPECT_EQ(segment.deltaEntryArray[i].slice, expected.deltaEntries[i].slice) << i;
    EXPECT_EQ(segment.deltaEntryArray[i].elementDelta, expected.deltaEntries[i].elementDelta) << i;
  }
  ASSERT_EQ(segment.indexEntryArray.size(), expected.indexEntries.size());
  for (std::size_t i = 0; i < expected.indexEntries.size(); ++i) {
    EXPECT_EQ(segment.indexEntryArray[i].temporalOffset, expected.indexEntries[i].temporalOffset) << i;
    EXPECT_EQ(segment.indexEntryArray[i].keyFrameOffset, expected.indexEntries[i].keyFrameOffset) << i;
    EXPECT_EQ(segment.indexEntryArray[i].flags, expected.indexEntries[i].flags) << i;
    EXPECT_EQ(segment.indexEntryArray[i].streamOffset, expected.indexEntries[i].streamOffset) << i;
  }
}

}  // namespace

TEST(MXFIndexFiles, SegmentsAgreeWithAnIndependentDump) {
  for (const ExpectedFile& file : expectedFiles) {
    SCOPED_TRACE(file.name);
    const std::vector<MXFIndexTableSegment> segments = segmentsOf(file.name);
    ASSERT_EQ(segments.size(), file.segments.size());
    for (std::size_t i = 0; i < segments.size(); ++i) expectSegment(file.segments[i], segments[i]);
  }
}

TEST(MXFIndexFiles, SegmentsCodedAndParsedAgainAreEqual) {
  for (const ExpectedFile& file : expectedFiles) {
    SCOPED_TRACE(file.name);
    const std::vector<MXFIndexTableSegment> segments = segmentsOf(file.name);
    IndexRun run;
    parseIndex(codeIndex(segments, 512), run);
    EXPECT_EQ(run.index.segments, segments);
  }
}

TEST(MXFIndexFiles, SampleSegmentCodedAndParsedAgainIsEqual) {
  MXFIndexTableSegment segment = sampleSegment();
  MXFIndexTableSegment withPosTable = sampleSegment();
  withPosTable.posTableCount = 1;
  for (MXFIndexEntry& entry : withPosTable.indexEntryArray) entry.posTable = {{-1, 2}};
  IndexRun run;
  parseIndex(codeIndex({segment, withPosTable}, 512), run);
  EXPECT_EQ(run.index.segments, (std::vector<MXFIndexTableSegment>{segment, withPosTable}));
  EXPECT_TRUE(run.errors.reports.empty());
}
