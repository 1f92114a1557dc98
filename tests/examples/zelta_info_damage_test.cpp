// zelta-info on damaged files and on files Zelta refuses: the exit status,
// the report on stderr and the same report in JSON.

#include <gtest/gtest.h>

#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::occurrences;
using zelta_test::ProgramRun;
using zelta_test::runZeltaInfo;

std::string hexOf(const MXFUID& id) {
  static const char digits[] = "0123456789abcdef";
  std::string out;
  for (std::size_t i = 0; i < 16; ++i) {
    out += digits[id[i] >> 4];
    out += digits[id[i] & 15];
  }
  return out;
}

TEST(ZeltaInfoOnDamage, FlippedHeaderPartitionKeyStopsAtTheFirstElement) {
  // Octet 13 of the header partition key is FD: no partition kind, so the
  // file does not start with a partition pack.
  const std::string message =
      "unexpected fixed length pack - 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.FD.04.00";
  ProgramRun run = runZeltaInfo("--json " + dataPath("damaged_flipped_header_partition_key_byte13.mxf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_EQ(run.err, "fatal: " + message + "\n");
  EXPECT_NE(run.out.find("\"result\": \"fatal\""), std::string::npos);
  EXPECT_NE(run.out.find("\"partitions\": []"), std::string::npos);
  EXPECT_NE(run.out.find("{\"severity\": \"fatal\", \"identifier\": \"" + hexOf(unexpectedElementId) +
                         "\", \"message\": \"" + message + "\"}"),
            std::string::npos)
      << run.out;
}

TEST(ZeltaInfoOnDamage, TruncatedInsideASkippedBodyElementEndsNormally) {
  // Cut inside the DV frame at 326097 (144000 octets): the skip seeks past
  // the end, the peek finds the end, and the read ends as if normally with
  // the header and both body partitions seen and no random index; the frame
  // misses the octets from the file's end (466642) to its own (326097 + 16 +
  // 4 + 144000).
  ProgramRun run = runZeltaInfo("--json " + dataPath("damaged_truncated_50pct.mxf"));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_EQ(run.err, "warning: last element runs past the end of the file - 3475 octets missing\n");
  EXPECT_NE(run.out.find("\"result\": \"ok\""), std::string::npos);
  EXPECT_EQ(occurrences(run.out, "{\"offset\": "), 3u);
  EXPECT_NE(run.out.find("{\"offset\": 22461, \"kind\": \"body\", \"status\": \"closed complete\""),
            std::string::npos)
      << run.out;
  EXPECT_NE(run.out.find("\"randomIndex\": []"), std::string::npos);
}

TEST(ZeltaInfoOnDamage, MissingRandomIndexEndsNormallyWithoutOne) {
  ProgramRun run = runZeltaInfo("--json " + dataPath("damaged_no_rip.mxf"));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(occurrences(run.out, "{\"offset\": "), 2u);
  EXPECT_NE(run.out.find("\"randomIndex\": []"), std::string::npos);
}

TEST(ZeltaInfoOnRefusedFile, NonSMPTEKeyInHeaderMetadataIsAnInvalidSMPTEKey) {
  // The AAF dictionary entry at 5120 has a key that does not begin 06 0E 2B 34.
  // Before it, the header pack's headerByteCount of 261920 is no multiple of
  // its KAG of 256 (the mxfdump of the file gives both).
  const std::string message = "invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4";
  ProgramRun run = runZeltaInfo("--json " + dataPath("bmx_avid_opatom_dv25_625_v1.mxf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_EQ(run.err, "warning: headerByteCount is not a multiple of kagSize\nfatal: " + message + "\n");
  EXPECT_NE(run.out.find("{\"severity\": \"fatal\", \"identifier\": \"" + hexOf(klvCodingErrorId) +
                         "\", \"message\": \"" + message + "\"}"),
            std::string::npos)
      << run.out;
}

TEST(ZeltaInfoUsage, NoFileIsAUsageError) {
  ProgramRun run = runZeltaInfo("");
  EXPECT_EQ(run.status, 2);
  EXPECT_NE(run.err.find("usage: zelta-info"), std::string::npos);
}

TEST(ZeltaInfoUsage, UnreadableFileIsAUsageError) {
  ProgramRun run = runZeltaInfo(dataPath("no-such-file.mxf"));
  EXPECT_EQ(run.status, 2);
  EXPECT_NE(run.err.find("cannot open"), std::string::npos);
}

TEST(ZeltaInfoUsage, HelpTellsTheExitStatuses) {
  ProgramRun run = runZeltaInfo("--help");
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.out.find("Exit status: 0 when the read ended normally, 1 when a fatal error stopped"),
            std::string::npos);
}

TEST(ZeltaInfoText, PrintsPartitionsSectionsAndRandomIndex) {
  ProgramRun run = runZeltaInfo(dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.out.find("partition at 0: header, closed complete\n"), std::string::npos) << run.out;
  EXPECT_NE(run.out.find("partition at 758272: footer, closed complete\n"), std::string::npos);
  EXPECT_NE(run.out.find("  headerByteCount 4608, indexByteCount 512\n"), std::string::npos);
  EXPECT_NE(run.out.find("  metadata: "), std::string::npos);
  EXPECT_NE(run.out.find(" elements, 4608 bytes\n"), std::string::npos);
  EXPECT_NE(run.out.find("random index: 2 entries\n  bodySID 1 at 0\n  bodySID 0 at 758272\n"), std::string::npos);
}

}  // namespace
