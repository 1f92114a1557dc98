#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "support/metadata_descriptor_sets.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey audioSamplingRateKey = propertyKeyOf(0x05, "04 02 03 01 01 01 00 00");
const KLVKey lockedKey = propertyKeyOf(0x04, "04 02 03 01 04 00 00 00");
const KLVKey audioReferenceLevelKey = propertyKeyOf(0x01, "04 02 01 01 03 00 00 00");
const KLVKey electroSpatialFormulationKey = propertyKeyOf(0x01, "04 02 01 01 01 00 00 00");
const KLVKey channelCountKey = propertyKeyOf(0x05, "04 02 01 01 04 00 00 00");
const KLVKey quantizationBitsKey = propertyKeyOf(0x04, "04 02 03 03 04 00 00 00");
const KLVKey dialNormKey = propertyKeyOf(0x05, "04 02 07 01 00 00 00 00");
const KLVKey soundEssenceCompressionKey = propertyKeyOf(0x02, "04 02 04 02 00 00 00 00");
const KLVKey dataEssenceCodingKey = propertyKeyOf(0x03, "04 03 03 02 00 00 00 00");
const KLVKey sampleRateKey = propertyKeyOf(0x01, "04 06 01 01 00 00 00 00");
const KLVKey essenceContainerKey = propertyKeyOf(0x02, "06 01 01 04 01 02 00 00");

const std::string aes3Container = "06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 03 00";
const std::string compression = "06 0E 2B 34 04 01 01 0A 04 02 02 01 01 00 00 00";
const std::string ancillaryData = "06 0E 2B 34 04 01 01 09 0D 01 03 01 02 0E 00 00";
const std::string dataCoding = "06 0E 2B 34 04 01 01 05 0E 09 06 07 01 01 01 03";

}  // namespace

TEST(SoundDescriptorFactory, SetKeyAndStaticTags) {
  SoundDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 42 00"), factory.getSetKey());
  const StaticTags tags{{0x3D03, audioSamplingRateKey},
                        {0x3D02, lockedKey},
                        {0x3D04, audioReferenceLevelKey},
                        {0x3D05, electroSpatialFormulationKey},
                        {0x3D07, channelCountKey},
                        {0x3D01, quantizationBitsKey},
                        {0x3D0C, dialNormKey},
                        {0x3D06, soundEssenceCompressionKey}};
  for (const auto& tag : tags) EXPECT_EQ(tag.first, factory.getSetPrimer().at(tag.second)) << std::hex << tag.first;
  EXPECT_EQ(17u, factory.getSetPrimer().size());
}

TEST(DataDescriptorFactory, SetKeyAndStaticTag) {
  DataDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 43 00"), factory.getSetKey());
  EXPECT_EQ(0x3E01, factory.getSetPrimer().at(dataEssenceCodingKey));
  EXPECT_EQ(10u, factory.getSetPrimer().size());
}

TEST(SoundDescriptor, NewObjectHasAudioSamplingRateZeroOverOne) {
  const std::shared_ptr<SoundDescriptor> d = SoundDescriptor::create();
  EXPECT_EQ((MXFRational{0, 1}), d->getAudioSamplingRate());
  EXPECT_FALSE(d->getLocked());
  EXPECT_EQ(0u, d->getChannelCount());
  EXPECT_EQ(0u, d->getQuantizationBits());
  EXPECT_EQ((MXFRational{0, 0}), d->getSampleRate());
  EXPECT_FALSE(d->hasDialNorm());
  EXPECT_EQ("assertion failure: SoundDescriptor.dialNorm is present", failureOf([&] { d->getDialNorm(); }));
}

TEST(SoundDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties{{MXFInstanceUIDKey, ByteVector(16, 0x11)},
                                  {sampleRateKey, bytesOf("00000019 00000001")},
                                  {essenceContainerKey, bytesOf(aes3Container)},
                                  {audioSamplingRateKey, bytesOf("0000BB80 00000001")},
                                  {lockedKey, bytesOf("01")},
                                  {audioReferenceLevelKey, bytesOf("EC")},
                                  {electroSpatialFormulationKey, bytesOf("02")},
                                  {channelCountKey, bytesOf("00000008")},
                                  {quantizationBitsKey, bytesOf("00000018")},
                                  {dialNormKey, bytesOf("E5")},
                                  {soundEssenceCompressionKey, bytesOf(compression)}};
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  SoundDescriptorFactory factory;
  const std::shared_ptr<SoundDescriptor> d =
      std::dynamic_pointer_cast<SoundDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ((MXFRational{48000, 1}), d->getAudioSamplingRate());
  EXPECT_TRUE(d->getLocked());
  EXPECT_EQ(-20, d->getAudioReferenceLevel());
  EXPECT_EQ(2, d->getElectroSpatialFormulation());
  EXPECT_EQ(8u, d->getChannelCount());
  EXPECT_EQ(24u, d->getQuantizationBits());
  EXPECT_EQ(-27, d->getDialNorm());
  EXPECT_EQ(keyOf(compression), d->getSoundEssenceCompression());
  EXPECT_EQ(properties, factory.code(d).set.properties);
}

TEST(SoundDescriptorFactory, AnyNonZeroLockedOctetReadsAsTrueAndIsWrittenAsOne) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  SoundDescriptorFactory factory;
  const std::shared_ptr<SoundDescriptor> d = std::dynamic_pointer_cast<SoundDescriptor>(
      parseWith(factory, {{MXFInstanceUIDKey, ByteVector(16, 0x11)}, {lockedKey, bytesOf("7F")}}, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(d->getLocked());
  EXPECT_EQ(bytesOf("01"), factory.code(d).set.properties.at(lockedKey));
}

TEST(SoundDescriptorFactory, SetWithoutAudioSamplingRateKeepsTheDefaultAndReportsMissing) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  SoundDescriptorFactory factory;
  const std::shared_ptr<SoundDescriptor> d =
      std::dynamic_pointer_cast<SoundDescriptor>(parseWith(factory,
                                                           {{MXFInstanceUIDKey, ByteVector(16, 0x11)},
                                                            {sampleRateKey, bytesOf("00000019 00000001")},
                                                            {essenceContainerKey, bytesOf(aes3Container)},
                                                            {lockedKey, bytesOf("00")},
                                                            {channelCountKey, bytesOf("00000001")},
                                                            {quantizationBitsKey, bytesOf("00000010")}},
                                                           errors)
                                                     .object);
  ASSERT_NE(nullptr, d);
  EXPECT_EQ(std::vector<std::string>{"error 2 missing SoundDescriptor.audioSamplingRate"}, modelReportLines(*errors));
  EXPECT_EQ((MXFRational{0, 1}), d->getAudioSamplingRate());
}

TEST(DataDescriptorFactory, ParsesDataEssenceCodingAndCodesTheSameMap) {
  const MXFPropertyMap properties{{MXFInstanceUIDKey, ByteVector(16, 0x11)},
                                  {sampleRateKey, bytesOf("00000019 00000001")},
                                  {essenceContainerKey, bytesOf(ancillaryData)},
                                  {dataEssenceCodingKey, bytesOf(dataCoding)}};
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  DataDescriptorFactory factory;
  const std::shared_ptr<DataDescriptor> d =
      std::dynamic_pointer_cast<DataDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ(keyOf(dataCoding), d->getDataEssenceCoding());
  EXPECT_EQ(properties, factory.code(d).set.properties);
  d->removeDataEssenceCoding();
  EXPECT_EQ("assertion failure: DataDescriptor.dataEssenceCoding is present",
            failureOf([&] { d->getDataEssenceCoding(); }));
  EXPECT_EQ(0u, factory.code(d).set.properties.count(dataEssenceCodingKey));
}
