// zelta-info --master: the clip's master metadata collapsed from the model,
// against mediainfo's dump and mxf2raw's summary of the original files, or
// the condition that the model breaks.
#include <gtest/gtest.h>

#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::ProgramRun;
using zelta_test::runZeltaInfo;

bool has(const std::string& text, const std::string& what) { return text.find(what) != std::string::npos; }

// ffmpeg/d10_50m_525_4ch16.mxf: mediainfo 29.970 fps, 5 frames, 720x486
// interlaced, 4 channels of 16 bits at 48000; mxf2raw start timecode
// 01:00:00;00 (drop frame, frame 107892).
const char* const ffmpegD10 = "ffmpeg_d10_50m_525_4ch16.mxf";

TEST(ZeltaInfoMaster, JsonGivesTheValuesInTheOrderOfTheMastersOperations) {
  const ProgramRun run = runZeltaInfo("--json --master " + dataPath(ffmpegD10));
  EXPECT_EQ(run.status, 0) << run.err;
  const std::size_t master = run.out.find("\"master\": {\"prefaceVersion\": ");
  ASSERT_NE(master, std::string::npos) << run.out;
  const std::string values = run.out.substr(master);
  for (const char* expected :
       {"\"essenceFormat\": \"D10\"", "\"editRate\": \"30000/1001\"", "\"bitRate\": 50000000", "\"progressive\": false",
        "\"displaySize\": [720, 243]", "\"audioChannelCount\": 4", "\"quantizationBits\": 16",
        "\"audioSamplingRates\": [\"48000/1\", \"48000/1\", \"48000/1\", \"48000/1\"]", "\"dropFrame\": true",
        "\"startTimecode\": 107892", "\"duration\": 5"})
    EXPECT_TRUE(has(values, expected)) << expected;
  // The order of the operations, the identification's fields in its place.
  const char* const order[] = {"prefaceVersion",
                               "companyName",
                               "productUID",
                               "creationDate",
                               "essenceFormat",
                               "materialPackageUID",
                               "editRate",
                               "bitRate",
                               "displaySize",
                               "subsampling",
                               "profileAndLevel",
                               "audioChannelCount",
                               "fixedChannelStatusData",
                               "duration",
                               "bodySID"};
  std::size_t last = 0;
  for (const char* name : order) {
    const std::size_t at = values.find(std::string("\"") + name + "\": ");
    ASSERT_NE(at, std::string::npos) << name;
    EXPECT_GT(at + 1, last) << name;
    last = at;
  }
}

TEST(ZeltaInfoMaster, TextGivesOneLinePerValueUnderMaster) {
  const ProgramRun run = runZeltaInfo("--master " + dataPath(ffmpegD10));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_TRUE(has(run.out, "master:\n  prefaceVersion: 259\n")) << run.out;
  EXPECT_TRUE(has(run.out, "\n  editRate: 30000/1001\n")) << run.out;
  EXPECT_TRUE(has(run.out, "\n  audioSamplingRates: [48000/1, 48000/1, 48000/1, 48000/1]\n")) << run.out;
  EXPECT_TRUE(has(run.out, "\n  bodySID: 1\n")) << run.out;
}

// bmx writes wave descriptors, which the kit's formats do not use.
TEST(ZeltaInfoMaster, ModelThatBreaksAConditionGivesItsTextAndExitOne) {
  const std::string file = dataPath("bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf");
  const ProgramRun text = runZeltaInfo("--master " + file);
  EXPECT_EQ(text.status, 1);
  EXPECT_TRUE(has(text.out, "master: not collapsed: assertion failure: AES3AudioDescriptor has 1 channel\n"))
      << text.out;
  const ProgramRun json = runZeltaInfo("--json --master " + file);
  EXPECT_EQ(json.status, 1);
  EXPECT_TRUE(has(json.out, "\"master\": {\"failure\": \"assertion failure: AES3AudioDescriptor has 1 channel\"}"))
      << json.out;
}

TEST(ZeltaInfoMaster, FileWithoutHeaderMetadataHasNoMaster) {
  const ProgramRun run = runZeltaInfo("--json --master " + dataPath("damaged_flipped_header_partition_key_byte13.mxf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_TRUE(has(run.out, "\"master\": null")) << run.out;
}

TEST(ZeltaInfoMaster, WithoutTheOptionThereIsNoMaster) {
  const ProgramRun run = runZeltaInfo("--json " + dataPath(ffmpegD10));
  EXPECT_EQ(run.status, 0);
  EXPECT_FALSE(has(run.out, "\"master\"")) << run.out;
}

}  // namespace
