// zelta-info --validate: the kit's validators' findings join the other
// reports, each with its severity, identifier and text.
#include <gtest/gtest.h>

#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::ProgramRun;
using zelta_test::runZeltaInfo;

bool has(const std::string& text, const std::string& what) { return text.find(what) != std::string::npos; }

// gst/dv25_625_420_2mono.mxf.mxfdump.txt: KAGSize = 00000001, the DV and
// wave labels without the multiple essence label, DV essence in a body
// partition, the header naming neither stream, the footer index SID 2.
TEST(ZeltaInfoValidate, FindingsOfTheKitJoinTheReports) {
  const ProgramRun run = runZeltaInfo("--validate " + dataPath("gst_dv25_625_420_2mono.mxf"));
  EXPECT_EQ(run.status, 0);
  EXPECT_EQ(run.err,
            "warning: unexpected essenceContainers value (missing MULTIPLE_ESSENCE)\n"
            "error: unexpected essenceContainers value\n"
            "error: unsupported KAG value\n"
            "error: unexpected bodySID value\n"
            "error: unexpected indexSID value\n"
            "error: unsupported KAG value\n"
            "error: unexpected body partition\n"
            "error: unsupported KAG value\n"
            "warning: non-zero indexSID value\n");
  const ProgramRun json = runZeltaInfo("--json --validate " + dataPath("gst_dv25_625_420_2mono.mxf"));
  EXPECT_TRUE(has(json.out,
                  "{\"severity\": \"error\", \"identifier\": \"4c50000795d811e1bbb2109add4ac68c\", "
                  "\"message\": \"unsupported KAG value\"}"))
      << json.out;
}

TEST(ZeltaInfoValidate, FileThatKeepsTheRulesHasNoFinding) {
  const ProgramRun run = runZeltaInfo("--validate " + dataPath("ffmpeg_d10_50m_525_4ch16.mxf"));
  EXPECT_EQ(run.status, 0);
  EXPECT_EQ(run.err, "");
}

TEST(ZeltaInfoValidate, WithoutTheOptionTheKitDoesNotValidate) {
  const ProgramRun run = runZeltaInfo(dataPath("gst_dv25_625_420_2mono.mxf"));
  EXPECT_EQ(run.status, 0);
  EXPECT_EQ(run.err, "");
}

// The header partition key is damaged: the first read ends fatally, and the
// second adds nothing of its own.
TEST(ZeltaInfoValidate, FatalFileIsReportedOnce) {
  const ProgramRun run = runZeltaInfo("--validate " + dataPath("damaged_flipped_header_partition_key_byte13.mxf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_EQ(run.err, "fatal: unexpected fixed length pack - 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.FD.04.00\n");
}

}  // namespace
