// zelta-info --essence through the generic container splitter, against the
// durations and the per-track MD5 checksums of bmx's mxf2raw beside the
// original files. mxf2raw names a track by its number, which is octets 12
// to 15 of the element key.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::ProgramRun;
using zelta_test::runZeltaInfo;

struct Track {
  const char* number;  // key octets 12 to 15, as zelta-info prints them
  const char* md5;     // empty: not comparable, the test says why
};

struct EssenceCase {
  const char* file;
  unsigned editUnits;  // the duration in edit units
  std::vector<Track> tracks;
};

// The element of the essence JSON whose key ends in the track number.
std::string elementOf(const std::string& json, const std::string& number) {
  const std::size_t key = json.find("0D.01.03.01." + std::string(number) + "\"");
  if (key == std::string::npos) return std::string();
  const std::size_t begin = json.rfind('{', key);
  return json.substr(begin, json.find('}', key) - begin + 1);
}

std::string editUnitsOf(unsigned count) { return "\"essence\": {\"editUnits\": " + std::to_string(count) + ","; }

void expectEssence(const EssenceCase& c) {
  SCOPED_TRACE(c.file);
  const ProgramRun run = runZeltaInfo("--json --essence --md5 " + dataPath(c.file));
  ASSERT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find(editUnitsOf(c.editUnits)), std::string::npos) << run.out;
  for (const Track& track : c.tracks) {
    const std::string element = elementOf(run.out, track.number);
    ASSERT_FALSE(element.empty()) << track.number << " in " << run.out;
    EXPECT_NE(element.find("\"count\": " + std::to_string(c.editUnits) + ","), std::string::npos) << element;
    if (*track.md5 != '\0') {
      EXPECT_NE(element.find(std::string("\"md5\": \"") + track.md5 + "\""), std::string::npos) << element;
    }
  }
}

const char* const dvPicture = "a1970879150332898b1272f2af05cfd1";

TEST(ZeltaInfoEssence, FfmpegD10EditUnitsAndPictureChecksum) {
  expectEssence({"ffmpeg_d10_50m_625_noaudio.mxf", 3, {{"05.01.01.00", "21dd90cc5dbbdb51212eecf27ee4d969"}}});
}

TEST(ZeltaInfoEssence, FfmpegDVEditUnitsAndTrackChecksums) {
  expectEssence({"ffmpeg_dv25_625_420_2mono.mxf",
                 6,
                 {{"18.01.01.00", dvPicture},
                  {"16.02.03.00", "13ee3f4f5b346ab39cf3b14ad0958209"},
                  {"16.02.03.01", "ebbe2ee03266a51aab617ee8aed8d24f"}}});
}

TEST(ZeltaInfoEssence, FfmpegAVCEditUnitsAndTrackChecksums) {
  expectEssence({"ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
                 24,
                 {{"15.01.05.00", "07d2c9ab4e1a162000777214ebb89d39"},
                  {"16.02.03.00", "4de1944ff6c3671af21aed6eddfe7997"},
                  {"16.02.03.01", "e581dcf6c2d996a667d2af04a0fef440"}}});
}

TEST(ZeltaInfoEssence, FfmpegOPAtomIsOneClipWrappedElementOfAllSixFrames) {
  // Though its label says frame wrapped, ffmpeg's OP-Atom file holds one
  // element of 864000 octets at 0x1600 (mxfdump), the six DV frames of
  // 144000 octets that ffprobe lists from 5657 on: one edit unit. mxf2raw
  // stops on the file (its check exits 1) and prints the checksum of
  // nothing, so the expectation is ffmpeg's own "-c copy -f md5" of the
  // picture stream, the frames that every DV file of the set holds.
  const ProgramRun run = runZeltaInfo("--json --essence --md5 " + dataPath("ffmpeg_opatom_dv25_625_v1.mxf"));
  ASSERT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find(editUnitsOf(1)), std::string::npos) << run.out;
  const std::string element = elementOf(run.out, "18.01.01.00");
  EXPECT_NE(element.find("\"count\": 1, \"bytes\": 864000, \"md5\": \"" + std::string(dvPicture) + "\""),
            std::string::npos)
      << element;
}

TEST(ZeltaInfoEssence, GStreamerDVEditUnitsAndTrackChecksums) {
  expectEssence({"gst_dv25_625_420_2mono.mxf",
                 6,
                 {{"18.01.01.01", dvPicture},
                  {"16.02.01.01", "43f892bb008be209eed0b45d7911ac96"},
                  {"16.02.01.02", "b653af2cc433347540baf4a31d2e13d3"}}});
}

TEST(ZeltaInfoEssence, GStreamerAVCEditUnitsAndTrackChecksums) {
  expectEssence({"gst_h264_high_longgop_1080p25_2mono.mxf",
                 24,
                 {{"15.01.05.01", "90ae521d8b6c422cd9618edeb1a1955e"},
                  {"16.02.01.01", "4de1944ff6c3671af21aed6eddfe7997"},
                  {"16.02.01.02", "e581dcf6c2d996a667d2af04a0fef440"}}});
}

TEST(ZeltaInfoEssence, BmxSinglePassEditUnitsAndTrackChecksums) {
  expectEssence({"bmx_op1a_dv25_625_singlepass.mxf",
                 6,
                 {{"18.01.01.00", dvPicture},
                  {"16.02.01.00", "13ee3f4f5b346ab39cf3b14ad0958209"},
                  {"16.02.01.01", "ebbe2ee03266a51aab617ee8aed8d24f"}}});
}

TEST(ZeltaInfoEssence, BmxBodyPartitionsEditUnitsAndTrackChecksums) {
  // The essence spans two body partitions: one container stream each, and
  // the checksums run on across them.
  expectEssence({"bmx_op1a_dv25_625_bodypart_part4.mxf",
                 6,
                 {{"18.01.01.00", dvPicture},
                  {"16.02.01.00", "13ee3f4f5b346ab39cf3b14ad0958209"},
                  {"16.02.01.01", "ebbe2ee03266a51aab617ee8aed8d24f"}}});
}

// mxf2raw checksums the PCM that it takes out of the D-10 AES3 element: the
// element itself holds a four-octet header and eight channels of 32-bit AES3
// subframes, so its MD5 cannot match and only the count is compared.
TEST(ZeltaInfoEssence, BmxD10EditUnitsAndPictureChecksumAES3ElementCounted) {
  expectEssence({"bmx_d10_50m_625_8ch24.mxf",
                 5,
                 {{"05.01.01.00", "2e5f3e694630906c3a924ee5a981c346"}, {"06.01.10.00", ""}}});
}

TEST(ZeltaInfoEssence, FileWithoutRandomIndexEditUnitsAndPictureChecksum) {
  expectEssence({"damaged_no_rip.mxf", 4, {{"05.01.01.00", "48eb365f3f05458b4eafc57536f5f67e"}, {"06.01.10.00", ""}}});
}

TEST(ZeltaInfoEssence, SystemItemsAreListedPerEditUnit) {
  // ffmpeg writes a system item in every content package of OP1a: the text
  // lists one system element ahead of the picture in each edit unit.
  const ProgramRun run = runZeltaInfo("--essence " + dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  ASSERT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find("essence: 3 edit units\n  edit unit 0\n    system "), std::string::npos) << run.out;
  EXPECT_EQ(zelta_test::occurrences(run.out, "    picture 06.0E.2B.34.01.02.01.01.0D.01.03.01.05.01.01.00 "), 3u)
      << run.out;
}

TEST(ZeltaInfoEssence, MD5WithoutEssenceIsAUsageError) {
  EXPECT_EQ(runZeltaInfo("--md5 " + dataPath("ffmpeg_d10_50m_625_noaudio.mxf")).status, 2);
}

TEST(ZeltaInfoEssence, WithoutMD5NoChecksumIsPrinted) {
  const ProgramRun run = runZeltaInfo("--json --essence " + dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  ASSERT_EQ(run.status, 0) << run.err;
  EXPECT_NE(run.out.find(editUnitsOf(3)), std::string::npos) << run.out;
  EXPECT_EQ(run.out.find("\"md5\""), std::string::npos) << run.out;
}

}  // namespace
