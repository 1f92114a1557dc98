// Files written by other tools: the splitter's sections must match the byte
// counts that those tools wrote, and its partitions their random index.
#include <gtest/gtest.h>

#include <fstream>
#include <map>

#include "mxf.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

struct FileRead {
  Journal journal;
  JournalStructureHandler structure{journal};
  std::vector<std::string> reports;
};

void readFileThrough(const std::string& name, FileRead& result) {
  JournalKLVHandler metadata(result.journal, "metadata");
  JournalKLVHandler index(result.journal, "index");
  DullKLVHandler essence;
  RecordingErrorHandler errors;
  MXFSplitter splitter(&result.structure, &metadata, &index, &essence, false);
  splitter.setErrorHandler(&errors);
  std::ifstream in(dataPath(name), std::ios::binary);
  ASSERT_TRUE(in.good()) << name;
  GenericKLVReader reader;
  reader.setHandler(&splitter);
  reader.setErrorHandler(&errors);
  reader.read(in);
  for (const Report& report : errors.reports) result.reports.push_back(report.message);
}

// The octets between each section stream's start and end, per partition.
std::map<std::pair<std::size_t, std::string>, std::streamoff> sectionSizes(const Journal& journal) {
  std::map<std::pair<std::size_t, std::string>, std::streamoff> sizes;
  std::size_t partition = 0;
  std::streamoff start = 0;
  for (std::size_t i = 0; i < journal.lines.size(); ++i) {
    const std::string& line = journal.lines[i];
    if (line.rfind("structure startPartition", 0) == 0) ++partition;
    std::string name = line.substr(0, line.find(' '));
    if (line == name + " startStream 1") start = journal.positions[i];
    if (line == name + " endStream 0") sizes[{partition - 1, name}] = journal.positions[i] - start;
  }
  return sizes;
}

class SplitterFiles : public ::testing::TestWithParam<const char*> {};

}  // namespace

TEST_P(SplitterFiles, SectionsMatchTheByteCountsAndPartitionsTheRandomIndex) {
  FileRead result;
  readFileThrough(GetParam(), result);
  EXPECT_TRUE(result.reports.empty());
  const std::vector<MXFPartitionPack>& packs = result.structure.packs;
  const std::vector<MXFRandomIndexEntry>& entries = result.structure.entries;
  ASSERT_EQ(entries.size(), packs.size());
  for (std::size_t i = 0; i < packs.size(); ++i) {
    EXPECT_EQ(entries[i].byteOffset, packs[i].thisPartition) << i;
    EXPECT_EQ(entries[i].bodySID, packs[i].bodySID) << i;
  }
  std::map<std::pair<std::size_t, std::string>, std::streamoff> sizes = sectionSizes(result.journal);
  for (std::size_t i = 0; i < packs.size(); ++i) {
    if (packs[i].headerByteCount != 0) {
      EXPECT_EQ(static_cast<std::streamoff>(packs[i].headerByteCount), (sizes[{i, "metadata"}])) << i;
    }
    if (packs[i].indexByteCount != 0) {
      EXPECT_EQ(static_cast<std::streamoff>(packs[i].indexByteCount), (sizes[{i, "index"}])) << i;
    }
  }
  EXPECT_EQ("structure endStream 0", result.journal.lines.back());
}

INSTANTIATE_TEST_SUITE_P(OtherTools, SplitterFiles,
                         ::testing::Values("bmx_d10_50m_625_8ch24.mxf", "bmx_op1a_dv25_625_bodypart_part4.mxf",
                                           "bmx_op1a_dv25_625_singlepass.mxf", "ffmpeg_d10_50m_625_noaudio.mxf",
                                           "ffmpeg_dv25_625_420_2mono.mxf",
                                           "ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
                                           "ffmpeg_opatom_dv25_625_v1.mxf", "gst_dv25_625_420_2mono.mxf",
                                           "gst_h264_high_longgop_1080p25_2mono.mxf"));

TEST(SplitterFiles, FileWithoutRandomIndexEndsAfterItsFooter) {
  FileRead result;
  readFileThrough("damaged_no_rip.mxf", result);
  EXPECT_TRUE(result.reports.empty());
  EXPECT_TRUE(result.structure.entries.empty());
  ASSERT_EQ(2u, result.structure.packs.size());
  std::vector<std::string> tail(result.journal.lines.end() - 2, result.journal.lines.end());
  std::vector<std::string> expected{"structure endPartition " + toString(partitionKey(4, 4)),
                                    "structure endStream 0"};
  EXPECT_EQ(expected, tail);
}

TEST(SplitterFiles, FlippedHeaderPartitionKindStopsAtTheFirstElement) {
  FileRead result;
  EXPECT_EQ("unexpected fixed length pack - 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.FD.04.00",
            runtimeErrorTextOf([&] { readFileThrough("damaged_flipped_header_partition_key_byte13.mxf", result); }));
}
