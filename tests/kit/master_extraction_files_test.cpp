// Master extraction of the files of three other writers: each file's outcome
// is either a master whose values agree with mediainfo's dump of the
// original (FILE.mediainfo.txt beside it), or the condition that its model
// breaks, with the reason. mediainfo counts frame lines; a master counts
// the lines of a field when the picture is interlaced.
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "kit.h"
#include "support/model_reading.h"

using namespace zelta_test;

namespace {

struct Outcome {
  std::string failure;  // the assertion's text; empty when a master came
  std::shared_ptr<ZeltaMasterMetadata> master;
  bool hasModel = false;
};

Outcome extractionOf(const std::string& name) {
  const HeaderModel header = readHeaderModel(name, createZeltaDefaultMetadataFactory);
  Outcome outcome;
  outcome.hasModel = !header.model.empty();
  if (!outcome.hasModel) return outcome;
  try {
    outcome.master = createZeltaMasterMetadata(std::dynamic_pointer_cast<const Preface>(header.model.front()));
  } catch (const util::assertion_failure& failure) {
    outcome.failure = failure.what();
  }
  return outcome;
}

// What mediainfo shows of a file: frame rate, frame count, width and
// frame height, channels and bit depth of the sound, and the video bit
// rate when it gives one (0 for none).
struct Expected {
  MXFRational rate;
  std::uint64_t frames;
  std::uint32_t width;
  std::uint32_t height;
  std::uint32_t channels;
  std::uint32_t bits;
  std::uint32_t bitRate;
};

void expectMaster(const std::string& name, const Expected& e) {
  SCOPED_TRACE(name);
  const Outcome outcome = extractionOf(name);
  ASSERT_EQ(outcome.failure, "");
  ASSERT_NE(outcome.master, nullptr);
  const ZeltaMasterMetadata& m = *outcome.master;
  EXPECT_EQ(m.getEditRate(), e.rate);
  EXPECT_EQ(m.getDuration(), e.frames);
  EXPECT_EQ(m.getDisplaySize().first, e.width);
  EXPECT_EQ(m.getDisplaySize().second * (m.isProgressive() ? 1 : 2), e.height);
  EXPECT_EQ(m.getAudioChannelCount(), e.channels);
  EXPECT_EQ(m.getQuantizationBits(), e.bits);
  if (e.bitRate != 0) {
    EXPECT_EQ(m.getBitRate(), e.bitRate);
  }
}

void expectFailure(const std::string& name, const std::string& failure) {
  SCOPED_TRACE(name);
  const Outcome outcome = extractionOf(name);
  EXPECT_TRUE(outcome.hasModel);
  EXPECT_EQ(outcome.failure, failure);
}

TEST(MasterExtractionFiles, D10FilesGiveTheirMaster) {
  // bmx/d10_50m_625_8ch24.mxf: 25.000, 5 frames, 720x576 interlaced, 8
  // channels of 24 bits; no video bit rate shown.
  expectMaster("bmx_d10_50m_625_8ch24.mxf", {{25, 1}, 5, 720, 576, 8, 24, 0});
  // ffmpeg/d10_50m_525_4ch16.mxf: 29.970, 5 frames, 720x486, 4 channels of
  // 16 bits.
  expectMaster("ffmpeg_d10_50m_525_4ch16.mxf", {{30000, 1001}, 5, 720, 486, 4, 16, 0});
  // ffmpeg/d10_50m_625_noaudio.mxf: 25.000, 3 frames, 720x576, no sound.
  expectMaster("ffmpeg_d10_50m_625_noaudio.mxf", {{25, 1}, 3, 720, 576, 0, 0, 0});
  // damaged/no_rip__ffmpeg_d10_30m_625_4ch16_cc8.mxf: 25.000, 4 frames,
  // 720x576, 8 channels of 16 bits; the random index is not needed.
  expectMaster("damaged_no_rip.mxf", {{25, 1}, 4, 720, 576, 8, 16, 0});
  // The bit rate comes from the container label: 50 and 30 Mbit/s, as the
  // writers' names of the files say.
  EXPECT_EQ(extractionOf("bmx_d10_50m_625_8ch24.mxf").master->getBitRate(), 50000000u);
  EXPECT_EQ(extractionOf("damaged_no_rip.mxf").master->getBitRate(), 30000000u);
}

TEST(MasterExtractionFiles, FfmpegDVGivesItsMaster) {
  // ffmpeg/dv25_625_420_2mono.mxf: 25.000, 6 frames, 720x576, 2 channels of
  // 16 bits in two AES3 descriptors. mediainfo's 24441600 is the rate of
  // the DIF blocks; the master gives the nominal 25 Mbit/s of the label.
  expectMaster("ffmpeg_dv25_625_420_2mono.mxf", {{25, 1}, 6, 720, 576, 2, 16, 0});
  EXPECT_EQ(extractionOf("ffmpeg_dv25_625_420_2mono.mxf").master->getBitRate(), 25000000u);
  // ffmpeg/opatom_dv25_625_v1.mxf: the picture alone.
  expectMaster("ffmpeg_opatom_dv25_625_v1.mxf", {{25, 1}, 6, 720, 576, 0, 0, 0});
}

TEST(MasterExtractionFiles, MPEGAndAVCFilesWithAES3SoundGiveTheirMaster) {
  // bmx/lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf: 25.000, 24
  // frames, 1920x1080 interlaced, 8 mono tracks of 24 bits, 50000000.
  expectMaster("bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf", {{25, 1}, 24, 1920, 1080, 8, 24, 50000000});
  // ffmpeg/mpeg2lg_422hl_1080i25_cgop_8mono.mxf: 25.000, 24 frames,
  // 1920x1080, 8 mono tracks of 24 bits; mediainfo's bit rate 0 is the
  // descriptor's.
  expectMaster("ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf", {{25, 1}, 24, 1920, 1080, 8, 24, 0});
  EXPECT_EQ(extractionOf("ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf").master->getBitRate(), 0u);
  // ffmpeg/h264_high_longgop_1080p25_2mono.mxf: 25.000, 24 frames,
  // 1920x1080 progressive, 2 mono tracks of 24 bits. mediainfo's 6000000
  // comes from the H.264 stream; the AVC sub-descriptor gives no maximum
  // bit rate, so the master's is 0.
  expectMaster("ffmpeg_h264_high_longgop_1080p25_2mono.mxf", {{25, 1}, 24, 1920, 1080, 2, 24, 0});
  EXPECT_EQ(extractionOf("ffmpeg_h264_high_longgop_1080p25_2mono.mxf").master->getBitRate(), 0u);
}

// bmx and GStreamer describe their sound with wave descriptors (mxfdump:
// MXFWaveAudioDescriptor), not the AES3 descriptors of the kit's formats.
TEST(MasterExtractionFiles, WaveSoundBreaksTheAES3Condition) {
  for (const char* name :
       {"bmx_op1a_dv25_625_bodypart_part4.mxf", "bmx_op1a_dv25_625_singlepass.mxf",
        "bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf", "bmx_op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf",
        "gst_h264_high_longgop_1080p25_2mono.mxf", "damaged_truncated_50pct.mxf"})
    expectFailure(name, "assertion failure: AES3AudioDescriptor has 1 channel");
}

// GStreamer labels its DV container 0D 01 03 01 02 02 7F 01 (mxfdump): the
// kind 0x7F names no bit rate.
TEST(MasterExtractionFiles, GStreamerDVLabelNamesNoBitRate) {
  expectFailure("gst_dv25_625_420_2mono.mxf", "assertion failure: defined DV bit rate");
}

// bmx's Avid file: the read ends at the non-SMPTE key at offset 5120, inside
// the header metadata, before the model is whole; the file whose header
// partition key is damaged has no header metadata. Neither gives a model.
TEST(MasterExtractionFiles, FilesWhoseHeaderMetadataIsCutShortGiveNoModel) {
  EXPECT_FALSE(extractionOf("bmx_avid_opatom_dv25_625_v1.mxf").hasModel);
  EXPECT_FALSE(extractionOf("damaged_flipped_header_partition_key_byte13.mxf").hasModel);
}

}  // namespace
