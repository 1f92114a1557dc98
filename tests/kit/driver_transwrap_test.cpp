// Files of other writers written again through the driver, from the master
// and the edit units that the kit's reader finds: the copy holds the same
// pictures and sound, keeps every rule of the kit, and the independent tools
// read it.
#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "support/kit_readers.h"
#include "support/kit_transwrap.h"
#include "support/run_program.h"

using namespace zelta_test;

namespace {

// Every D-10, DV, MPEG-2 long-GOP and AVC file of the test data whose master
// the kit extracts, but ffmpeg_opatom_dv25_625_v1.mxf: its six frames stand
// in one element, which no edit unit of constant size holds. The files of
// bmx in OP1a and of GStreamer describe their sound with wave descriptors,
// so no master comes of them ("AES3AudioDescriptor has 1 channel").
const char* const files[] = {"bmx_d10_50m_625_8ch24.mxf",
                             "ffmpeg_d10_50m_525_4ch16.mxf",
                             "ffmpeg_d10_50m_625_noaudio.mxf",
                             "damaged_no_rip.mxf",
                             "ffmpeg_dv25_625_420_2mono.mxf",
                             "ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf",
                             "bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf",
                             "ffmpeg_h264_high_longgop_1080p25_2mono.mxf"};

bool haveTools() {
  return runProgram("command -v ffmpeg && command -v ffprobe && command -v mediainfo && command -v gst-discoverer-1.0")
             .status == 0;
}

// The MD5 of each picture and sound stream's packets, as ffmpeg sees them;
// the DV copy adds a data stream for its data track, which is left out.
std::string pictureAndSoundHashes(const std::string& path) {
  const std::string all = runProgram("ffmpeg -v error -i '" + path + "' -map 0 -c copy -f streamhash -hash md5 -").out;
  std::istringstream lines(all);
  std::string kept;
  for (std::string line; std::getline(lines, line);)
    if (line.find(",v,") != std::string::npos || line.find(",a,") != std::string::npos) kept += line + "\n";
  return kept;
}

// A copy of the test's own, as tests may run side by side.
std::string transwrapped(const std::string& name) {
  auto source = std::make_shared<TranswrapSource>(dataPath(name));
  const std::string test = ::testing::UnitTest::GetInstance()->current_test_info()->name();
  const std::string path = testing::TempDir() + "zelta_transwrap_" + test + "_" + name;
  auto out = std::make_shared<std::ofstream>(path, std::ios::binary);
  createZeltaDriver(source)->drive(createZeltaWriter(out));
  out->close();
  return path;
}

}  // namespace

TEST(DriverTranswrap, CopiesKeepEveryRuleOfTheKit) {
  for (const char* name : files) {
    SCOPED_TRACE(name);
    const std::string path = transwrapped(name);
    ReadRecord record;
    readThroughZeltaReader(path, record, true);
    EXPECT_EQ(record.failure, "");
    EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
    std::remove(path.c_str());
  }
}

TEST(DriverTranswrap, CopiesHoldTheSamePicturesAndSoundForFfmpegAndTheToolsReadThem) {
  if (!haveTools()) GTEST_SKIP() << "ffmpeg, ffprobe, mediainfo or gst-discoverer-1.0 is not installed";
  for (const char* name : files) {
    SCOPED_TRACE(name);
    const std::string path = transwrapped(name);
    const std::string hashes = pictureAndSoundHashes(path);
    EXPECT_NE(hashes, "");
    EXPECT_EQ(hashes, pictureAndSoundHashes(dataPath(name)));
    const ProgramRun decode = runProgram("ffmpeg -v error -i '" + path + "' -f null -");
    EXPECT_EQ(decode.status, 0);
    EXPECT_EQ(decode.err, "");
    const ProgramRun probe = runProgram("ffprobe -v error -show_streams '" + path + "'");
    EXPECT_EQ(probe.status, 0) << probe.err;
    EXPECT_EQ(probe.err, "");
    const ProgramRun info = runProgram("mediainfo '" + path + "'");
    EXPECT_NE(info.out.find("Format                                   : MXF"), std::string::npos) << info.out;
    const ProgramRun discover = runProgram("gst-discoverer-1.0 '" + path + "'");
    EXPECT_EQ(discover.status, 0) << discover.out << discover.err;
    EXPECT_NE(discover.out.find("Done discovering"), std::string::npos) << discover.out;
    std::remove(path.c_str());
  }
}
