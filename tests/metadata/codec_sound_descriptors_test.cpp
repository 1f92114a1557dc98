#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "support/codec_model.h"
#include "support/metadata_descriptor_sets.h"
#include "support/model_reading.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey blockAlignKey = propertyKeyOf(0x05, "04 02 03 02 01 00 00 00");
const KLVKey sequenceOffsetKey = propertyKeyOf(0x05, "04 02 03 02 02 00 00 00");
const KLVKey averageBytesPerSecondKey = propertyKeyOf(0x05, "04 02 03 03 05 00 00 00");
const KLVKey channelAssignmentKey = propertyKeyOf(0x07, "04 02 01 01 05 00 00 00");
const KLVKey peakEnvelopeVersionKey = propertyKeyOf(0x08, "04 02 03 01 06 00 00 00");
const KLVKey peakEnvelopeFormatKey = propertyKeyOf(0x08, "04 02 03 01 07 00 00 00");
const KLVKey pointsPerPeakValueKey = propertyKeyOf(0x08, "04 02 03 01 08 00 00 00");
const KLVKey peakEnvelopeBlockSizeKey = propertyKeyOf(0x08, "04 02 03 01 09 00 00 00");
const KLVKey peakChannelsKey = propertyKeyOf(0x08, "04 02 03 01 0A 00 00 00");
const KLVKey peakFramesKey = propertyKeyOf(0x08, "04 02 03 01 0B 00 00 00");
const KLVKey peakOfPeaksPositionKey = propertyKeyOf(0x08, "04 02 03 01 0C 00 00 00");
const KLVKey peakEnvelopeTimestampKey = propertyKeyOf(0x08, "04 02 03 01 0D 00 00 00");
const KLVKey peakEnvelopeDataStreamKey = propertyKeyOf(0x08, "04 02 03 01 0E 00 00 00");

const KLVKey emphasisKey = propertyKeyOf(0x05, "04 02 05 01 06 00 00 00");
const KLVKey blockStartOffsetKey = propertyKeyOf(0x05, "04 02 03 02 03 00 00 00");
const KLVKey auxiliaryBitsModeKey = propertyKeyOf(0x05, "04 02 05 01 01 00 00 00");
const KLVKey channelStatusDataModeKey = propertyKeyOf(0x05, "04 02 05 01 02 00 00 00");
const KLVKey fixedChannelStatusDataKey = propertyKeyOf(0x05, "04 02 05 01 03 00 00 00");

const KLVKey sampleRateKey = propertyKeyOf(0x01, "04 06 01 01 00 00 00 00");
const KLVKey essenceContainerKey = propertyKeyOf(0x02, "06 01 01 04 01 02 00 00");
const KLVKey audioSamplingRateKey = propertyKeyOf(0x05, "04 02 03 01 01 01 00 00");
const KLVKey lockedKey = propertyKeyOf(0x04, "04 02 03 01 04 00 00 00");
const KLVKey channelCountKey = propertyKeyOf(0x05, "04 02 01 01 04 00 00 00");
const KLVKey quantizationBitsKey = propertyKeyOf(0x04, "04 02 03 03 04 00 00 00");

const std::string aes3Container = "06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 03 00";
const std::string assignment = "06 0E 2B 34 04 01 01 0D 04 02 02 10 03 01 01 00";
const std::string statusOne = "85 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00";
const std::string statusTwo = "01 02 03 04 05 06 07 08 09 0A 0B 0C 0D 0E 0F 10 11 12 13 14 15 16 17 18";

AES3ChannelStatusData statusOf(const std::string& hex) {
  const ByteVector octets = bytesOf(hex);
  AES3ChannelStatusData status;
  std::copy(octets.begin(), octets.end(), status.octets.begin());
  return status;
}

// The required properties of the bases of a wave audio descriptor.
MXFPropertyMap soundBase() {
  return {{MXFInstanceUIDKey, ByteVector(16, 0x11)},
          {sampleRateKey, bytesOf("0000BB80 00000001")},
          {essenceContainerKey, bytesOf(aes3Container)},
          {audioSamplingRateKey, bytesOf("0000BB80 00000001")},
          {lockedKey, bytesOf("01")},
          {channelCountKey, bytesOf("00000001")},
          {quantizationBitsKey, bytesOf("00000018")}};
}

MXFPropertyMap waveProperties() {
  MXFPropertyMap properties = soundBase();
  properties.insert({{blockAlignKey, bytesOf("0003")},
                     {sequenceOffsetKey, bytesOf("02")},
                     {averageBytesPerSecondKey, bytesOf("00023280")},
                     {channelAssignmentKey, bytesOf(assignment)},
                     {peakEnvelopeVersionKey, bytesOf("00000001")},
                     {peakEnvelopeFormatKey, bytesOf("00000002")},
                     {pointsPerPeakValueKey, bytesOf("00000003")},
                     {peakEnvelopeBlockSizeKey, bytesOf("00000100")},
                     {peakChannelsKey, bytesOf("00000002")},
                     {peakFramesKey, bytesOf("00000040")},
                     {peakOfPeaksPositionKey, bytesOf("FFFFFFFF FFFFFFFE")},
                     {peakEnvelopeTimestampKey, bytesOf("07EA 0B 19 02 03 04 05")},
                     {peakEnvelopeDataStreamKey, bytesOf("00000003 00000001 0A0B0C")}});
  return properties;
}

MXFPropertyMap aes3Properties() {
  MXFPropertyMap properties = waveProperties();
  properties.insert({{emphasisKey, bytesOf("07")},
                     {blockStartOffsetKey, bytesOf("00C0")},
                     {auxiliaryBitsModeKey, bytesOf("01")},
                     {channelStatusDataModeKey, bytesOf("00000002 00000001 0102")},
                     {fixedChannelStatusDataKey, bytesOf("00000002 00000018" + statusOne + statusTwo)}});
  return properties;
}

// A wave audio descriptor with every property of its own and of its bases.
void fillWave(WaveAudioDescriptor& d) {
  d.setSampleRate(MXFRational{48000, 1});
  d.setLinkedTrackID(3);
  d.setContainerDuration(24);
  d.setEssenceContainer(keyOf(aes3Container));
  d.setAudioSamplingRate(MXFRational{48000, 1});
  d.setLocked(true);
  d.setAudioReferenceLevel(-20);
  d.setChannelCount(1);
  d.setQuantizationBits(24);
  d.setBlockAlign(3);
  d.setSequenceOffset(2);
  d.setAverageBytesPerSecond(144000);
  d.setChannelAssignment(keyOf(assignment));
  d.setPeakEnvelopeVersion(1);
  d.setPeakEnvelopeFormat(2);
  d.setPointsPerPeakValue(3);
  d.setPeakEnvelopeBlockSize(256);
  d.setPeakChannels(2);
  d.setPeakFrames(64);
  d.setPeakOfPeaksPosition(-2);
  d.setPeakEnvelopeTimestamp(MXFTimestamp{2026, 11, 25, 2, 3, 4, 5});
  d.setPeakEnvelopeDataStream(bytesOf("0A0B0C"));
}

}  // namespace

TEST(WaveAudioDescriptorFactory, SetKeyAndStaticTags) {
  WaveAudioDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 48 00"), factory.getSetKey());
  const StaticTags tags{{0x3D0A, blockAlignKey},
                        {0x3D0B, sequenceOffsetKey},
                        {0x3D09, averageBytesPerSecondKey},
                        {0x3D32, channelAssignmentKey},
                        {0x3D29, peakEnvelopeVersionKey},
                        {0x3D2A, peakEnvelopeFormatKey},
                        {0x3D2B, pointsPerPeakValueKey},
                        {0x3D2C, peakEnvelopeBlockSizeKey},
                        {0x3D2D, peakChannelsKey},
                        {0x3D2E, peakFramesKey},
                        {0x3D2F, peakOfPeaksPositionKey},
                        {0x3D30, peakEnvelopeTimestampKey},
                        {0x3D31, peakEnvelopeDataStreamKey}};
  for (const auto& tag : tags) EXPECT_EQ(tag.first, factory.getSetPrimer().at(tag.second)) << std::hex << tag.first;
  EXPECT_EQ(SoundDescriptorFactory().getSetPrimer().size() + tags.size(), factory.getSetPrimer().size());
}

TEST(AES3AudioDescriptorFactory, SetKeyAndStaticTags) {
  AES3AudioDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 47 00"), factory.getSetKey());
  const StaticTags tags{{0x3D0D, emphasisKey},
                        {0x3D0F, blockStartOffsetKey},
                        {0x3D08, auxiliaryBitsModeKey},
                        {0x3D10, channelStatusDataModeKey},
                        {0x3D11, fixedChannelStatusDataKey}};
  for (const auto& tag : tags) EXPECT_EQ(tag.first, factory.getSetPrimer().at(tag.second)) << std::hex << tag.first;
  EXPECT_EQ(WaveAudioDescriptorFactory().getSetPrimer().size() + tags.size(), factory.getSetPrimer().size());
}

TEST(WaveAudioDescriptor, NewObjectHasZeroRequiredValuesAndNoOptionalOnes) {
  const std::shared_ptr<WaveAudioDescriptor> d = WaveAudioDescriptor::create();
  EXPECT_EQ(0u, d->getBlockAlign());
  EXPECT_EQ(0u, d->getAverageBytesPerSecond());
  EXPECT_EQ((MXFRational{0, 1}), d->getAudioSamplingRate());
  EXPECT_FALSE(d->hasSequenceOffset());
  EXPECT_FALSE(d->hasChannelAssignment());
  EXPECT_FALSE(d->hasPeakEnvelopeDataStream());
  EXPECT_EQ("assertion failure: WaveAudioDescriptor.sequenceOffset is present",
            failureOf([&] { d->getSequenceOffset(); }));
  EXPECT_EQ("assertion failure: WaveAudioDescriptor.peakEnvelopeTimestamp is present",
            failureOf([&] { d->getPeakEnvelopeTimestamp(); }));
}

TEST(WaveAudioDescriptor, OptionalValueIsPresentUntilRemoved) {
  const std::shared_ptr<WaveAudioDescriptor> d = WaveAudioDescriptor::create();
  d->setPeakChannels(2);
  EXPECT_TRUE(d->hasPeakChannels());
  EXPECT_EQ(2u, d->getPeakChannels());
  d->removePeakChannels();
  EXPECT_FALSE(d->hasPeakChannels());
  EXPECT_EQ("assertion failure: WaveAudioDescriptor.peakChannels is present", failureOf([&] { d->getPeakChannels(); }));
}

TEST(AES3AudioDescriptor, NewObjectHasNoOptionalValues) {
  const std::shared_ptr<AES3AudioDescriptor> d = AES3AudioDescriptor::create();
  EXPECT_FALSE(d->hasEmphasis());
  EXPECT_FALSE(d->hasBlockStartOffset());
  EXPECT_FALSE(d->hasAuxiliaryBitsMode());
  EXPECT_FALSE(d->hasChannelStatusDataMode());
  EXPECT_FALSE(d->hasFixedChannelStatusData());
  EXPECT_EQ("assertion failure: AES3AudioDescriptor.fixedChannelStatusData is present",
            failureOf([&] { d->getFixedChannelStatusData(); }));
  EXPECT_EQ(0u, d->getBlockAlign());
}

TEST(WaveAudioDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties = waveProperties();
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<WaveAudioDescriptor> d =
      parsedAs<WaveAudioDescriptorFactory, WaveAudioDescriptor>(properties, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ(3u, d->getBlockAlign());
  EXPECT_EQ(2u, d->getSequenceOffset());
  EXPECT_EQ(144000u, d->getAverageBytesPerSecond());
  EXPECT_EQ(keyOf(assignment), d->getChannelAssignment());
  EXPECT_EQ(1u, d->getPeakEnvelopeVersion());
  EXPECT_EQ(2u, d->getPeakEnvelopeFormat());
  EXPECT_EQ(3u, d->getPointsPerPeakValue());
  EXPECT_EQ(256u, d->getPeakEnvelopeBlockSize());
  EXPECT_EQ(2u, d->getPeakChannels());
  EXPECT_EQ(64u, d->getPeakFrames());
  EXPECT_EQ(-2, d->getPeakOfPeaksPosition());
  EXPECT_EQ((MXFTimestamp{2026, 11, 25, 2, 3, 4, 5}), d->getPeakEnvelopeTimestamp());
  EXPECT_EQ(bytesOf("0A0B0C"), d->getPeakEnvelopeDataStream());
  EXPECT_TRUE(d->getLocked());
  EXPECT_EQ(properties, WaveAudioDescriptorFactory().code(d).set.properties);
}

TEST(AES3AudioDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties = aes3Properties();
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<AES3AudioDescriptor> d =
      parsedAs<AES3AudioDescriptorFactory, AES3AudioDescriptor>(properties, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ(7u, d->getEmphasis());
  EXPECT_EQ(0xC0u, d->getBlockStartOffset());
  EXPECT_EQ(1u, d->getAuxiliaryBitsMode());
  EXPECT_EQ(bytesOf("0102"), d->getChannelStatusDataMode());
  EXPECT_EQ((std::vector<AES3ChannelStatusData>{statusOf(statusOne), statusOf(statusTwo)}),
            d->getFixedChannelStatusData());
  EXPECT_EQ(3u, d->getBlockAlign());
  EXPECT_EQ(properties, AES3AudioDescriptorFactory().code(d).set.properties);
}

TEST(WaveAudioDescriptorFactory, SetWithoutBlockAlignOrAverageBytesPerSecondReportsThemMissingAndKeepsZero) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<WaveAudioDescriptor> d =
      parsedAs<WaveAudioDescriptorFactory, WaveAudioDescriptor>(soundBase(), errors);
  ASSERT_NE(nullptr, d);
  EXPECT_EQ((std::vector<std::string>{"error 2 missing WaveAudioDescriptor.blockAlign",
                                      "error 2 missing WaveAudioDescriptor.averageBytesPerSecond"}),
            modelReportLines(*errors));
  EXPECT_EQ(0u, d->getBlockAlign());
  EXPECT_EQ(0u, d->getAverageBytesPerSecond());
  EXPECT_EQ(1u, d->getChannelCount());
}

TEST(AES3AudioDescriptorFactory, ChannelStatusBatchWithItemSize32ReadsEachRecordsOctetsAndSkipsEight) {
  MXFPropertyMap properties = waveProperties();
  properties[fixedChannelStatusDataKey] =
      bytesOf("00000002 00000020" + statusOne + "FFFFFFFF FFFFFFFF" + statusTwo + "EEEEEEEE EEEEEEEE");
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<AES3AudioDescriptor> d =
      parsedAs<AES3AudioDescriptorFactory, AES3AudioDescriptor>(properties, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ((std::vector<AES3ChannelStatusData>{statusOf(statusOne), statusOf(statusTwo)}),
            d->getFixedChannelStatusData());
  EXPECT_EQ(bytesOf("00000002 00000018" + statusOne + statusTwo),
            AES3AudioDescriptorFactory().code(d).set.properties.at(fixedChannelStatusDataKey));
}

TEST(AES3AudioDescriptorFactory, ChannelStatusBatchWithItemSizeBelow24IsReportedAsInvalid) {
  MXFPropertyMap properties = waveProperties();
  properties[fixedChannelStatusDataKey] = bytesOf("00000001 00000010" + statusOne);
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<AES3AudioDescriptor> d =
      parsedAs<AES3AudioDescriptorFactory, AES3AudioDescriptor>(properties, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_EQ((std::vector<std::string>{"error 3 invalid AES3AudioDescriptor.fixedChannelStatusData value - "
                                      "assertion failure: valid external length"}),
            modelReportLines(*errors));
  EXPECT_FALSE(d->hasFixedChannelStatusData());
}

TEST(WaveAudioDescriptor, EveryPropertySurvivesTheModelCoderAndParser) {
  const std::shared_ptr<WaveAudioDescriptor> d = WaveAudioDescriptor::create();
  fillWave(*d);
  const RewrittenModel rewritten = rewriteModel({d}, makeCodecModelFactory);
  EXPECT_TRUE(rewritten.reports.empty());
  CodecModelFactory factory;
  EXPECT_EQ("", modelDifference({d}, rewritten.model, factory));
  ASSERT_EQ(1u, objectsOf<WaveAudioDescriptor>(rewritten.model).size());
  EXPECT_EQ(144000u, objectsOf<WaveAudioDescriptor>(rewritten.model)[0]->getAverageBytesPerSecond());
}

TEST(AES3AudioDescriptor, EveryPropertySurvivesTheModelCoderAndParser) {
  const std::shared_ptr<AES3AudioDescriptor> d = AES3AudioDescriptor::create();
  fillWave(*d);
  d->setEmphasis(7);
  d->setBlockStartOffset(192);
  d->setAuxiliaryBitsMode(1);
  d->setChannelStatusDataMode(bytesOf("0102"));
  d->setFixedChannelStatusData({statusOf(statusOne), statusOf(statusTwo)});
  const RewrittenModel rewritten = rewriteModel({d}, makeCodecModelFactory);
  EXPECT_TRUE(rewritten.reports.empty());
  CodecModelFactory factory;
  EXPECT_EQ("", modelDifference({d}, rewritten.model, factory));
  const std::vector<std::shared_ptr<const AES3AudioDescriptor>> read = objectsOf<AES3AudioDescriptor>(rewritten.model);
  ASSERT_EQ(1u, read.size());
  EXPECT_EQ(d->getFixedChannelStatusData(), read[0]->getFixedChannelStatusData());
  EXPECT_EQ(192u, read[0]->getBlockStartOffset());
}
