// zelta-info --copy: a file copied element by element is the same file.

#include <gtest/gtest.h>

#include <cstdio>
#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

TEST(ZeltaInfoCopy, CopyOfAFileFromEachWriterIsByteForByteTheSame) {
  for (const char* name : {"ffmpeg_h264_high_longgop_1080p25_2mono.mxf", "gst_dv25_625_420_2mono.mxf",
                           "bmx_op1a_dv25_625_bodypart_part4.mxf"}) {
    SCOPED_TRACE(name);
    const std::string out = ::testing::TempDir() + "zelta-info-copy-same.mxf";
    zelta_test::ProgramRun run = zelta_test::runZeltaInfo("--copy " + out + " " + zelta_test::dataPath(name));
    EXPECT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(zelta_test::readFile(out), zelta_test::readFile(zelta_test::dataPath(name)));
    std::remove(out.c_str());
  }
}

TEST(ZeltaInfoCopy, RefusedFileEndsWithTheFatalReportAndExitOne) {
  const std::string out = ::testing::TempDir() + "zelta-info-copy-refused.mxf";
  zelta_test::ProgramRun run =
      zelta_test::runZeltaInfo("--copy " + out + " " + zelta_test::dataPath("bmx_avid_opatom_dv25_625_v1.mxf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_EQ(run.err, "fatal: invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4\n");
  std::remove(out.c_str());
}

}  // namespace
