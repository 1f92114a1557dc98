// zelta-info through the sequential reader: a run-in, the structure reports
// and the header metadata as primed sets.

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::occurrences;
using zelta_test::ProgramRun;
using zelta_test::runZeltaInfo;

TEST(ZeltaInfoRunIn, RunInIsSkippedCountedAndMovesEveryOffset) {
  // 1000 octets of 0x55 hold no partition key.
  const std::string path = ::testing::TempDir() + "zelta-info-run-in.mxf";
  {
    ByteVector file(1000, 0x55);
    ByteVector original = zelta_test::readFile(dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
    file.insert(file.end(), original.begin(), original.end());
    std::ofstream out(path, std::ios::binary);
    out.write(reinterpret_cast<const char*>(file.data()), static_cast<std::streamsize>(file.size()));
  }
  ProgramRun run = runZeltaInfo("--json " + path);
  std::remove(path.c_str());
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.out.find("\"runIn\": 1000"), std::string::npos);
  // The header and footer partitions of the independent walk, 1000 octets on.
  EXPECT_NE(run.out.find("{\"offset\": 1000, \"kind\": \"header\""), std::string::npos) << run.out;
  EXPECT_NE(run.out.find("{\"offset\": 759272, \"kind\": \"footer\""), std::string::npos) << run.out;
  // OP1a (octets 12 and 13 of 01 01) is a generalized operational pattern,
  // which no run-in may precede: one report per partition.
  EXPECT_EQ(run.err,
            "error: generalized operational pattern with run-in\n"
            "error: generalized operational pattern with run-in\n");
}

TEST(ZeltaInfoRunIn, TextNamesTheRunInOnlyWhenThereIsOne) {
  EXPECT_EQ(runZeltaInfo(dataPath("ffmpeg_d10_50m_625_noaudio.mxf")).out.find("run-in"), std::string::npos);
  EXPECT_NE(runZeltaInfo("--json " + dataPath("ffmpeg_d10_50m_625_noaudio.mxf")).out.find("\"runIn\": 0,"),
            std::string::npos);
}

TEST(ZeltaInfoSets, HeaderMetadataArrivesAsPrimerAndPrimedSets) {
  // The mxfdump of the ffmpeg D-10 file: a primer of 100 entries and 19 sets
  // (Preface, Identification, ContentStorage, EssenceContainerData, two
  // packages, four tracks and sequences, two timecode components, two source
  // clips, a CDCI descriptor) in the header partition.
  ProgramRun run = runZeltaInfo("--json --sets " + dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  EXPECT_EQ(run.status, 0) << run.err;
  // ffmpeg codes set lengths in short and one-octet long form (LL = 1 and 2 in
  // the dump) where the format asks for four octets: warnings only.
  EXPECT_NE(run.err.find("warning: non-standard BER length form - 0x81\n"), std::string::npos) << run.err;
  EXPECT_EQ(run.err.find("error: "), std::string::npos) << run.err;
  EXPECT_EQ(occurrences(run.out, "{\"partition\": "), 1u);
  EXPECT_NE(run.out.find("\"metadata\": [{\"partition\": 0, \"primer\": [{\"tag\": "), std::string::npos);
  EXPECT_EQ(occurrences(run.out, "{\"tag\": "), 100u);
  EXPECT_EQ(occurrences(run.out, "\"properties\": ["), 19u);
  EXPECT_EQ(occurrences(run.out, "{\"key\": \"06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.2F.00\", \"properties\""), 1u);
  EXPECT_EQ(occurrences(run.out, "{\"key\": \"06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.3B.00\", \"properties\""), 4u);
}

TEST(ZeltaInfoSets, TextListsPrimerEntriesAndSets) {
  ProgramRun run = runZeltaInfo("--sets " + dataPath("gst_dv25_625_420_2mono.mxf"));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("header metadata of partition at 0: "), std::string::npos) << run.out;
  EXPECT_NE(run.out.find("header metadata of partition at 916104: "), std::string::npos);
  EXPECT_NE(run.out.find("  set 06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.2F.00\n"), std::string::npos);
}

TEST(ZeltaInfoIndex, SegmentFieldsAndDeltaEntriesAsAnIndependentDumpGivesThem) {
  // The mxfdump of the ffmpeg D-10 file: one segment at 0x1400 with
  // instanceUID ad.ab.44.24.2f.25.4d.c7.92.ff.00.0f.00.00.00.00, edit rate
  // 25/1, start 0, duration 0 (open), 0x3d400 octets per edit unit, indexSID 2,
  // bodySID 1, slice count 0 and the delta entries 0 and 512.
  ProgramRun run = runZeltaInfo("--json --index " + dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("\"index\": [{\"partition\": 0, \"instanceUID\": \"adab44242f254dc792ff000f00000000\", "
                         "\"indexEditRate\": \"25/1\", \"indexStartPosition\": 0, \"indexDuration\": 0, "
                         "\"editUnitByteCount\": 250880, \"indexSID\": 2, \"bodySID\": 1, \"sliceCount\": 0, "
                         "\"posTableCount\": 0, \"deltaEntryArray\": [{\"posTableIndex\": 0, \"slice\": 0, "
                         "\"elementDelta\": 0}, {\"posTableIndex\": 0, \"slice\": 0, \"elementDelta\": 512}], "
                         "\"indexEntryArray\": []}]"),
            std::string::npos)
      << run.out;
}

TEST(ZeltaInfoIndex, TextListsEntriesOfAVariableSizeIndex) {
  // The footer index of the ffmpeg long GOP file holds one entry per frame.
  ProgramRun run = runZeltaInfo("--index " + dataPath("ffmpeg_h264_high_longgop_1080p25_2mono.mxf"));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("index of partition at 1175552: 1 segments\n"), std::string::npos) << run.out;
  EXPECT_EQ(occurrences(run.out, "    entry: "), 24u);
}

}  // namespace
