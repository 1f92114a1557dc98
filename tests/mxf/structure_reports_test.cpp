// What MXFReader reports about the structure of files written by other
// tools, and of damaged copies of them. The expectations come from
// independent dumps of each file's partition packs; every value cited below
// is from those dumps.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "mxf.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

struct FileCase {
  const char* name;
  std::vector<std::string> reports;
  std::string failure;       // what() of the exception that ended the read
  std::size_t partitions;    // startPartition events
  std::size_t randomIndex;   // entries of the randomIndex event, 0 for none
  std::string lastEvent;     // the structure handler's last event
};

void PrintTo(const FileCase& c, std::ostream* out) { *out << c.name; }

const std::string none = "no failure";
const std::string cleanEnd = "endStream 0";
const std::string abortedEnd = "endStream 1";

class StructureReports : public ::testing::TestWithParam<FileCase> {};

}  // namespace

TEST_P(StructureReports, FileGivesExactlyTheReportsItsPacksCallFor) {
  const FileCase& expected = GetParam();
  ReaderRun run;
  readFileWithMXFReader(expected.name, run);
  EXPECT_EQ(expected.reports, run.reports());
  EXPECT_EQ(expected.failure, run.failure);
  EXPECT_EQ(expected.partitions, run.structure.packs.size());
  EXPECT_EQ(expected.randomIndex, run.structure.entries.size());
  ASSERT_FALSE(run.structure.events.empty());
  EXPECT_EQ(expected.lastEvent, run.structure.events.back());
}

// Files that the independent tools call well-formed, and that pass every
// check: versions 1.2 (GStreamer, bmx D-10 and OP-Atom) and 1.3 (ffmpeg, bmx
// OP1a) pass in silence; every byte count is a multiple of the KAG (512 for
// ffmpeg and bmx D-10, 1 for GStreamer and bmx OP1a); each thisPartition is
// where its pack lies, each previousPartition names the partition before,
// every footerPartition names the footer or is 0, indexSID is 0 exactly where
// indexByteCount is, no footer has a bodySID, and each random index lists the
// partitions as they are.
INSTANTIATE_TEST_SUITE_P(
    WellFormed, StructureReports,
    ::testing::Values(
        // KAG 512, headerByteCount 4608, indexByteCount 512 with indexSID 2;
        // footer at 758272; random index (1, 0), (0, 758272).
        FileCase{"ffmpeg_d10_50m_625_noaudio.mxf", {}, none, 2, 2, cleanEnd},
        // KAG 512, headerByteCount 6656, indexByteCount 512; footer at 926208.
        FileCase{"ffmpeg_dv25_625_420_2mono.mxf", {}, none, 2, 2, cleanEnd},
        // Header, body at 7168 (bodySID 1), footer at 1175552 with an index
        // of 1024 octets under indexSID 2.
        FileCase{"ffmpeg_h264_high_longgop_1080p25_2mono.mxf", {}, none, 3, 3, cleanEnd},
        // OP-Atom: header, body at 5120, footer at 869888 with indexSID 2.
        FileCase{"ffmpeg_opatom_dv25_625_v1.mxf", {}, none, 3, 3, cleanEnd},
        // Version 1.2, KAG 1: header, body at 5539, footer at 916104.
        FileCase{"gst_dv25_625_420_2mono.mxf", {}, none, 3, 3, cleanEnd},
        // Version 1.2, KAG 1: header, body at 5577, footer at 1136902.
        FileCase{"gst_h264_high_longgop_1080p25_2mono.mxf", {}, none, 3, 3, cleanEnd},
        // Version 1.2, KAG 512, headerByteCount 22016, indexByteCount 512
        // with indexSID 1 and bodySID 2 in the header; four-octet lengths
        // in the random index, whose overall length 48 fits them.
        FileCase{"bmx_d10_50m_625_8ch24.mxf", {}, none, 2, 2, cleanEnd},
        // KAG 1: the second body partition has bodyOffset 606960 under
        // bodySID 2, which is consistent.
        FileCase{"bmx_op1a_dv25_625_bodypart_part4.mxf", {}, none, 4, 4, cleanEnd},
        // The open incomplete header names no footer (footerPartition 0),
        // nor do the open bodies; the random index shows the way to the end.
        FileCase{"bmx_op1a_dv25_625_singlepass.mxf", {}, none, 4, 4, cleanEnd}));

// The bmx OP-Atom file is well-formed by the other tools' measure, yet:
// - its header pack says KAG 256 and headerByteCount 261920, which is
//   1023 * 256 + 32, so not a multiple of the KAG (the body that follows
//   begins at 262176, 32 octets past a KAG boundary);
// - at 5120, inside the header metadata, lie two keys that are no SMPTE
//   keys (an AAF dictionary entry), and a KLV read cannot go past them.
// The read is aborted, so the end of the stream brings no further report.
INSTANTIATE_TEST_SUITE_P(
    OPAtomWithDictionary, StructureReports,
    ::testing::Values(FileCase{
        "bmx_avid_opatom_dv25_625_v1.mxf",
        {reportLine("warning", headerByteCountKagId, "headerByteCount is not a multiple of kagSize"),
         reportLine("fatal", klvCodingErrorId, "invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4")},
        "invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4",
        1,
        0,
        abortedEnd}));

INSTANTIATE_TEST_SUITE_P(
    Damaged, StructureReports,
    ::testing::Values(
        // Octet 13 of the header partition key is FD: no partition key, so
        // the first element is a fixed length pack where a partition must
        // begin. The read is aborted there, before any partition.
        FileCase{"damaged_flipped_header_partition_key_byte13.mxf",
                 {reportLine("fatal", unexpectedElementId,
                             "unexpected fixed length pack - 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.FD.04.00")},
                 "unexpected fixed length pack - 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.FD.04.00",
                 0,
                 0,
                 abortedEnd},
        // The random index is gone, but the header pack names the footer
        // (footerPartition 858624): the file still shows its end, and
        // nothing is reported.
        FileCase{"damaged_no_rip.mxf", {}, none, 2, 0, cleanEnd},
        // Cut in the middle of an essence element of the second body
        // partition. The essence port declines the value, the reader seeks
        // past the end and meets the end of the file: a normal end. The
        // header pack names the footer (footerPartition 933057), so the
        // missing random index and footer are not reported either.
        FileCase{"damaged_truncated_50pct.mxf", {}, none, 3, 0, cleanEnd}));

TEST(StructureReports, FileWithoutRandomIndexEndsAfterItsFooter) {
  ReaderRun run;
  readFileWithMXFReader("damaged_no_rip.mxf", run);
  ASSERT_LE(2u, run.structure.events.size());
  EXPECT_EQ((std::vector<std::string>{"endPartition " + toString(partitionKey(4, 4)), cleanEnd}),
            std::vector<std::string>(run.structure.events.end() - 2, run.structure.events.end()));
}

TEST(StructureReports, TruncatedFileEndsInItsSecondBodyPartition) {
  ReaderRun run;
  readFileWithMXFReader("damaged_truncated_50pct.mxf", run);
  ASSERT_EQ(3u, run.structure.packs.size());
  EXPECT_EQ(22461u, run.structure.packs[2].thisPartition);
  EXPECT_EQ(933057u, run.structure.packs[0].footerPartition);
  EXPECT_EQ("endPartition " + toString(partitionKey(3, 4)),
            run.structure.events[run.structure.events.size() - 2]);
}

TEST(StructureReports, DictionaryKeyStopsTheReadAt5120) {
  ReaderRun run;
  readFileWithMXFReader("bmx_avid_opatom_dv25_625_v1.mxf", run);
  ASSERT_EQ(2u, run.errors.positions.size());
  EXPECT_EQ(5120, run.errors.positions[1]);
}
