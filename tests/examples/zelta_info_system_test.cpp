// zelta-info --system through the SDTI-CP and proxy system parsers, against
// the system metadata packs that an independent dump printed.

#include <gtest/gtest.h>

#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::ProgramRun;
using zelta_test::runZeltaInfo;

const char* const bmxD10 = "bmx_d10_50m_625_8ch24.mxf";

std::size_t occurrences(const std::string& text, const std::string& part) {
  std::size_t found = 0;
  for (std::size_t at = 0; (at = text.find(part, at)) != std::string::npos; ++at) ++found;
  return found;
}

}  // namespace

TEST(ZeltaInfoSystem, BmxD10PacksAsTheDumpPrintsThem) {
  const ProgramRun run = runZeltaInfo("--json --system " + dataPath(bmxD10));
  ASSERT_EQ(run.status, 0) << run.err;
  EXPECT_EQ(run.err, "");
  EXPECT_NE(run.out.find("\"reports\": []"), std::string::npos);
  EXPECT_EQ(occurrences(run.out, "\"packs\""), 5u);
  for (int unit = 0; unit < 5; ++unit) {
    const std::string pack =
        "{\"bitmap\": 92, \"rate\": 4, \"type\": 0, \"channelHandle\": 0, \"continuityCount\": " +
        std::to_string(unit) +
        ", \"label\": \"06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.01.01\", \"creationStamp\": \"00 00 00 00 00 00 "
        "00 00 00 00 00 00 00 00 00 00 00\", \"userStamp\": \"81 0" +
        std::to_string(unit) + " 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00\"}";
    EXPECT_NE(run.out.find(pack), std::string::npos) << pack << "\n" << run.out;
  }
  EXPECT_NE(run.out.find("\"sets\": [{\"kind\": \"package\", \"items\": []}]"), std::string::npos);
}

TEST(ZeltaInfoSystem, TextNamesEachFieldOfThePack) {
  const ProgramRun run = runZeltaInfo("--system " + dataPath(bmxD10));
  ASSERT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("system: 5 edit units\n  edit unit 0\n    pack bitmap 0x5C rate 0x04 type 0x00 channel "
                         "handle 0 continuity count 0\n      label 06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.01.01\n"
                         "      creation stamp 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00\n"
                         "      user stamp 81 00 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00\n"
                         "    package metadata: 0 items\n"),
            std::string::npos)
      << run.out;
}

TEST(ZeltaInfoSystem, FileWithoutSystemItemsHasEditUnitsWithNothingInThem) {
  const ProgramRun run = runZeltaInfo("--json --system " + dataPath("gst_dv25_625_420_2mono.mxf"));
  ASSERT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("\"system\": {\"editUnits\": [{\"packs\": [], \"sets\": [], \"proxy\": []}"),
            std::string::npos)
      << run.out;
}

TEST(ZeltaInfoSystem, HelpNamesTheOption) {
  const ProgramRun run = runZeltaInfo("--help");
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.out.find("--system"), std::string::npos);
}
