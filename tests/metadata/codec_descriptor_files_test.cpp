// The codec descriptors of real files, read through the whole chain with the
// codec composites beside the format's. The expected values come from the
// independent dumps of each file (mxfdump, and mediainfo where it says the
// same), named above each test.
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "metadata.h"
#include "support/codec_model.h"
#include "support/model_reading.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const std::string aes3Container = "06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 03 00";
const std::string waveContainer = "06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 01 00";

MXFMetadataModel codecModelOf(const std::string& name) {
  const HeaderModel header = readHeaderModel(name, makeCodecModelFactory);
  EXPECT_EQ("", header.failure);
  EXPECT_EQ(1, header.modelCount);
  return header.model;
}

// 48 kHz, 24-bit mono: three octets a sample.
template <typename T>
void expectMono24Bit48kHz(const std::vector<std::shared_ptr<const T>>& descriptors, const std::string& container) {
  for (const std::shared_ptr<const T>& d : descriptors) {
    EXPECT_EQ(keyOf(container), d->getEssenceContainer());
    EXPECT_EQ((MXFRational{48000, 1}), d->getAudioSamplingRate());
    EXPECT_EQ(1u, d->getChannelCount());
    EXPECT_EQ(24u, d->getQuantizationBits());
    EXPECT_EQ(3u, d->getBlockAlign());
    EXPECT_EQ(144000u, d->getAverageBytesPerSecond());
  }
}

}  // namespace

// bmx/lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf.mxfdump.txt
TEST(CodecDescriptorFiles, BmxMPEG2ClosedGOPHasMPEGVideoDescriptorAndEightAES3Descriptors) {
  const MXFMetadataModel model = codecModelOf("bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf");
  const std::vector<std::shared_ptr<const MPEGVideoDescriptor>> pictures = objectsOf<MPEGVideoDescriptor>(model);
  ASSERT_EQ(1u, pictures.size());
  const MPEGVideoDescriptor& d = *pictures[0];
  EXPECT_EQ(1920u, d.getStoredWidth());
  EXPECT_EQ(544u, d.getStoredHeight());
  EXPECT_EQ(0x82u, d.getProfileAndLevel());
  EXPECT_FALSE(d.getSingleSequence());
  EXPECT_EQ(2u, d.getCodedContentType());
  EXPECT_EQ(2u, d.getBPictureCount());
  EXPECT_FALSE(d.getLowDelay());
  EXPECT_EQ(10u, d.getMaxGOP());
  EXPECT_TRUE(d.getConstantBFrames());
  EXPECT_TRUE(d.getClosedGOP());
  EXPECT_TRUE(d.getIdenticalGOP());
  EXPECT_EQ(50000000u, d.getBitRate());

  const std::vector<std::shared_ptr<const AES3AudioDescriptor>> sounds = objectsOf<AES3AudioDescriptor>(model);
  ASSERT_EQ(8u, sounds.size());
  expectMono24Bit48kHz(sounds, aes3Container);
  AES3ChannelStatusData status;
  status.octets[0] = 0x85;
  for (const std::shared_ptr<const AES3AudioDescriptor>& sound : sounds) {
    EXPECT_TRUE(sound->getLocked());
    EXPECT_EQ(0, sound->getAudioReferenceLevel());
    EXPECT_EQ(bytesOf("01"), sound->getChannelStatusDataMode());
    EXPECT_EQ(std::vector<AES3ChannelStatusData>{status}, sound->getFixedChannelStatusData());
    EXPECT_FALSE(sound->hasEmphasis());
  }
}

// bmx/op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf.mxfdump.txt
TEST(CodecDescriptorFiles, BmxMPEG2OpenGOPHasMPEGVideoDescriptorAndEightWaveDescriptors) {
  const MXFMetadataModel model = codecModelOf("bmx_op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf");
  const std::vector<std::shared_ptr<const MPEGVideoDescriptor>> pictures = objectsOf<MPEGVideoDescriptor>(model);
  ASSERT_EQ(1u, pictures.size());
  EXPECT_FALSE(pictures[0]->getClosedGOP());
  EXPECT_FALSE(pictures[0]->getIdenticalGOP());
  EXPECT_TRUE(pictures[0]->getConstantBFrames());
  EXPECT_EQ(10u, pictures[0]->getMaxGOP());
  EXPECT_EQ(50000000u, pictures[0]->getBitRate());
  const std::vector<std::shared_ptr<const WaveAudioDescriptor>> sounds = objectsOf<WaveAudioDescriptor>(model);
  EXPECT_EQ(8u, sounds.size());
  expectMono24Bit48kHz(sounds, waveContainer);
  EXPECT_TRUE(objectsOf<AES3AudioDescriptor>(model).empty());
}

// ffmpeg/mpeg2lg_422hl_1080i25_cgop_8mono.mxf.mxfdump.txt: ffmpeg gives the
// MPEG properties dynamic tags of its own, which the keys resolve; mediainfo
// agrees on 4:2:2@High, closed GOP, B-pictures.
TEST(CodecDescriptorFiles, FfmpegMPEG2HasMPEGVideoDescriptorAndEightAES3Descriptors) {
  const MXFMetadataModel model = codecModelOf("ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf");
  const std::vector<std::shared_ptr<const MPEGVideoDescriptor>> pictures = objectsOf<MPEGVideoDescriptor>(model);
  ASSERT_EQ(1u, pictures.size());
  const MPEGVideoDescriptor& d = *pictures[0];
  EXPECT_EQ(0u, d.getBitRate());
  EXPECT_EQ(0x82u, d.getProfileAndLevel());
  EXPECT_FALSE(d.getLowDelay());
  EXPECT_TRUE(d.getClosedGOP());
  EXPECT_EQ(10u, d.getMaxGOP());
  EXPECT_EQ(2u, d.getBPictureCount());
  EXPECT_FALSE(d.hasSingleSequence());
  EXPECT_FALSE(d.hasConstantBFrames());
  EXPECT_FALSE(d.hasIdenticalGOP());
  EXPECT_FALSE(d.hasCodedContentType());

  const std::vector<std::shared_ptr<const AES3AudioDescriptor>> sounds = objectsOf<AES3AudioDescriptor>(model);
  EXPECT_EQ(8u, sounds.size());
  expectMono24Bit48kHz(sounds, aes3Container);
  for (const std::shared_ptr<const AES3AudioDescriptor>& sound : sounds) {
    EXPECT_FALSE(sound->hasChannelStatusDataMode());
    EXPECT_FALSE(sound->hasFixedChannelStatusData());
  }
}

// ffmpeg/h264_high_longgop_1080p25_2mono.mxf.mxfdump.txt: the picture is a
// plain CDCI descriptor with one sub-descriptor (its dynamic tag 81.00), a
// set that the dump leaves out but whose keys its primer names under 82.00
// to 82.02: decodingDelay, profile and level. mediainfo gives High@L4, that
// is profile 100 and level 40. The sound is AES3.
TEST(CodecDescriptorFiles, FfmpegH264HasAVCSubDescriptorUnderTheCDCIDescriptorAndTwoAES3Descriptors) {
  const MXFMetadataModel model = codecModelOf("ffmpeg_h264_high_longgop_1080p25_2mono.mxf");
  EXPECT_TRUE(objectsOf<MPEGVideoDescriptor>(model).empty());
  const std::vector<std::shared_ptr<const CDCIPictureDescriptor>> pictures = objectsOf<CDCIPictureDescriptor>(model);
  ASSERT_EQ(1u, pictures.size());
  ASSERT_EQ(1u, pictures[0]->getGenericSubDescriptorCount());
  const std::vector<std::shared_ptr<const AVCVideoSubDescriptor>> avc = objectsOf<AVCVideoSubDescriptor>(model);
  ASSERT_EQ(1u, avc.size());
  EXPECT_EQ(avc[0], pictures[0]->getGenericSubDescriptorAt(0));
  EXPECT_TRUE(avc[0]->hasDecodingDelay());
  EXPECT_EQ(100u, avc[0]->getProfile());
  EXPECT_EQ(40u, avc[0]->getLevel());
  EXPECT_FALSE(avc[0]->hasSequenceParameterSetArray());

  const std::vector<std::shared_ptr<const AES3AudioDescriptor>> sounds = objectsOf<AES3AudioDescriptor>(model);
  EXPECT_EQ(2u, sounds.size());
  expectMono24Bit48kHz(sounds, aes3Container);
}

// gst/h264_high_longgop_1080p25_2mono.mxf.mxfdump.txt: GStreamer describes
// the H.264 picture with an MPEGVideoDescriptor that has none of the MPEG
// properties.
TEST(CodecDescriptorFiles, GstH264HasMPEGVideoDescriptorAndTwoWaveDescriptors) {
  const MXFMetadataModel model = codecModelOf("gst_h264_high_longgop_1080p25_2mono.mxf");
  const std::vector<std::shared_ptr<const MPEGVideoDescriptor>> pictures = objectsOf<MPEGVideoDescriptor>(model);
  ASSERT_EQ(1u, pictures.size());
  const MPEGVideoDescriptor& d = *pictures[0];
  EXPECT_EQ(keyOf("06 0E 2B 34 04 01 01 0A 04 01 02 02 01 30 00 00"), d.getPictureEssenceCoding());
  EXPECT_EQ(keyOf("06 0E 2B 34 04 01 01 0A 0D 01 03 01 02 10 60 01"), d.getEssenceContainer());
  EXPECT_EQ(1920u, d.getStoredWidth());
  EXPECT_EQ(1080u, d.getStoredHeight());
  EXPECT_EQ((MXFRational{16, 9}), d.getAspectRatio());
  EXPECT_FALSE(d.hasBitRate());
  EXPECT_FALSE(d.hasProfileAndLevel());
  EXPECT_FALSE(d.hasMaxGOP());
  EXPECT_TRUE(objectsOf<AVCVideoSubDescriptor>(model).empty());

  const std::vector<std::shared_ptr<const WaveAudioDescriptor>> sounds = objectsOf<WaveAudioDescriptor>(model);
  EXPECT_EQ(2u, sounds.size());
  expectMono24Bit48kHz(sounds, waveContainer);
  for (const std::shared_ptr<const WaveAudioDescriptor>& sound : sounds) {
    EXPECT_FALSE(sound->getLocked());
    EXPECT_EQ(keyOf("06 0E 2B 34 04 01 01 01 04 02 02 01 7F 00 00 00"), sound->getSoundEssenceCompression());
  }
}

// bmx/op1a_h264_high422_longgop_1080p25_2mono.mxf.mxfdump.txt
TEST(CodecDescriptorFiles, BmxH264HasTwoWaveDescriptors) {
  const MXFMetadataModel model = codecModelOf("bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf");
  const std::vector<std::shared_ptr<const WaveAudioDescriptor>> sounds = objectsOf<WaveAudioDescriptor>(model);
  EXPECT_EQ(2u, sounds.size());
  expectMono24Bit48kHz(sounds, waveContainer);
  EXPECT_EQ(24, sounds[0]->getContainerDuration());
}

// The DV files' two 16-bit mono sounds at 48 kHz: two octets a sample.
// bmx/op1a_dv25_625_bodypart_part4.mxf.mxfdump.txt, bmx/op1a_dv25_625_singlepass.mxf.mxfdump.txt and
// gst/dv25_625_420_2mono.mxf.mxfdump.txt (MXFWaveAudioDescriptor, container 06 01 00),
// ffmpeg/dv25_625_420_2mono.mxf.mxfdump.txt (MXFAES3PCMDescriptor, container 06 03 00): AudioSamplingRate
// 00 00 bb 80 / 1, ChannelCount 1, QuantizationBits 0x10, BlockAlign 2, AvgBps 0x017700.
TEST(CodecDescriptorFiles, DVFilesHaveTwoSixteenBitMonoSoundDescriptors) {
  struct File {
    const char* name;
    bool aes3;
  };
  for (const File& file :
       {File{"bmx_op1a_dv25_625_bodypart_part4.mxf", false}, File{"bmx_op1a_dv25_625_singlepass.mxf", false},
        File{"gst_dv25_625_420_2mono.mxf", false}, File{"ffmpeg_dv25_625_420_2mono.mxf", true}}) {
    SCOPED_TRACE(file.name);
    const MXFMetadataModel model = codecModelOf(file.name);
    std::vector<std::shared_ptr<const WaveAudioDescriptor>> sounds;
    for (const auto& d : objectsOf<WaveAudioDescriptor>(model)) sounds.push_back(d);
    for (const auto& d : objectsOf<AES3AudioDescriptor>(model)) sounds.push_back(d);
    EXPECT_EQ(file.aes3 ? 2u : 0u, objectsOf<AES3AudioDescriptor>(model).size());
    ASSERT_EQ(2u, sounds.size());
    for (const std::shared_ptr<const WaveAudioDescriptor>& d : sounds) {
      EXPECT_EQ(keyOf(file.aes3 ? aes3Container : waveContainer), d->getEssenceContainer());
      EXPECT_EQ((MXFRational{48000, 1}), d->getAudioSamplingRate());
      EXPECT_EQ(1u, d->getChannelCount());
      EXPECT_EQ(16u, d->getQuantizationBits());
      EXPECT_EQ(2u, d->getBlockAlign());
      EXPECT_EQ(96000u, d->getAverageBytesPerSecond());
    }
  }
}

// Every file read with the codec composites codes again and reads back to
// the same model.
TEST(CodecDescriptorFiles, ModelsWithCodecDescriptorsSurviveTheModelCoderAndParser) {
  for (const std::string name :
       {"bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf", "ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf",
        "ffmpeg_h264_high_longgop_1080p25_2mono.mxf", "gst_h264_high_longgop_1080p25_2mono.mxf"}) {
    const MXFMetadataModel model = codecModelOf(name);
    const RewrittenModel rewritten = rewriteModel(model, makeCodecModelFactory);
    CodecModelFactory factory;
    EXPECT_EQ("", modelDifference(model, rewritten.model, factory)) << name;
  }
}
