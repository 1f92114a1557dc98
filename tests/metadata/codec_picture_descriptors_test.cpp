#include <gtest/gtest.h>

#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "support/codec_model.h"
#include "support/metadata_descriptor_sets.h"
#include "support/model_reading.h"
#include "support/mxf_primed_sets.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const StaticTags mpegTags{
    {0x8000, propertyKeyOf(0x05, "04 01 06 02 01 02 00 00")}, {0x8001, propertyKeyOf(0x05, "04 01 06 02 01 03 00 00")},
    {0x8002, propertyKeyOf(0x05, "04 01 06 02 01 04 00 00")}, {0x8003, propertyKeyOf(0x05, "04 01 06 02 01 05 00 00")},
    {0x8004, propertyKeyOf(0x05, "04 01 06 02 01 06 00 00")}, {0x8005, propertyKeyOf(0x05, "04 01 06 02 01 07 00 00")},
    {0x8006, propertyKeyOf(0x05, "04 01 06 02 01 08 00 00")}, {0x8007, propertyKeyOf(0x05, "04 01 06 02 01 09 00 00")},
    {0x8008, propertyKeyOf(0x05, "04 01 06 02 01 0B 00 00")}, {0x8009, propertyKeyOf(0x05, "04 01 06 02 01 0A 00 00")}};

const StaticTags avcTags{
    {0x8001, propertyKeyOf(0x0E, "04 01 06 06 01 03 00 00")}, {0x8002, propertyKeyOf(0x0E, "04 01 06 06 01 04 00 00")},
    {0x8004, propertyKeyOf(0x0E, "04 01 06 06 01 06 00 00")}, {0x8005, propertyKeyOf(0x0E, "04 01 06 06 01 07 00 00")},
    {0x8006, propertyKeyOf(0x0E, "04 01 06 06 01 08 00 00")}, {0x8007, propertyKeyOf(0x0E, "04 01 06 06 01 09 00 00")},
    {0x8008, propertyKeyOf(0x0E, "04 01 06 06 01 0B 00 00")}, {0x8012, propertyKeyOf(0x0E, "04 01 06 06 01 14 00 00")},
    {0x8009, propertyKeyOf(0x0E, "04 01 06 06 01 0A 00 00")}, {0x800A, propertyKeyOf(0x0E, "04 01 06 06 01 0C 00 00")},
    {0x800B, propertyKeyOf(0x0E, "04 01 06 06 01 0D 00 00")}, {0x800C, propertyKeyOf(0x0E, "04 01 06 06 01 0E 00 00")},
    {0x800D, propertyKeyOf(0x0E, "04 01 06 06 01 0F 00 00")}, {0x800E, propertyKeyOf(0x0E, "04 01 06 06 01 10 00 00")},
    {0x800F, propertyKeyOf(0x0E, "04 01 06 06 01 11 00 00")}, {0x8010, propertyKeyOf(0x0E, "04 01 06 06 01 12 00 00")},
    {0x8011, propertyKeyOf(0x0E, "04 01 06 06 01 13 00 00")}};

const StaticTags mpeg4Tags{
    {0x8000, propertyKeyOf(0x0D, "04 01 06 02 02 02 00 00")}, {0x8001, propertyKeyOf(0x0D, "04 01 06 02 02 03 00 00")},
    {0x8002, propertyKeyOf(0x0D, "04 01 06 02 02 04 00 00")}, {0x8003, propertyKeyOf(0x0D, "04 01 06 02 02 05 00 00")},
    {0x8004, propertyKeyOf(0x0D, "04 01 06 02 02 06 00 00")}, {0x8005, propertyKeyOf(0x0D, "04 01 06 02 02 07 00 00")},
    {0x8006, propertyKeyOf(0x0D, "04 01 06 02 02 08 00 00")}, {0x8007, propertyKeyOf(0x0D, "04 01 06 02 02 09 00 00")},
    {0x8008, propertyKeyOf(0x0D, "04 01 06 02 02 0B 00 00")}, {0x8009, propertyKeyOf(0x0D, "04 01 06 02 02 0A 00 00")}};

const KLVKey sampleRateKey = propertyKeyOf(0x01, "04 06 01 01 00 00 00 00");
const KLVKey essenceContainerKey = propertyKeyOf(0x02, "06 01 01 04 01 02 00 00");
const KLVKey frameLayoutKey = propertyKeyOf(0x01, "04 01 03 01 04 00 00 00");
const KLVKey storedWidthKey = propertyKeyOf(0x01, "04 01 05 02 02 00 00 00");
const KLVKey storedHeightKey = propertyKeyOf(0x01, "04 01 05 02 01 00 00 00");
const KLVKey aspectRatioKey = propertyKeyOf(0x01, "04 01 01 01 01 00 00 00");
const KLVKey videoLineMapKey = propertyKeyOf(0x02, "04 01 03 02 05 00 00 00");
const KLVKey componentDepthKey = propertyKeyOf(0x02, "04 01 05 03 0A 00 00 00");
const KLVKey horizontalSubsamplingKey = propertyKeyOf(0x01, "04 01 05 01 05 00 00 00");

const std::string mpegContainer = "06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 60 01";
const std::string avcContainer = "06 0E 2B 34 04 01 01 0A 0D 01 03 01 02 10 60 01";

// The required properties of a CDCI picture descriptor and of its bases.
MXFPropertyMap cdciBase(const std::string& container) {
  return {
      {MXFInstanceUIDKey, ByteVector(16, 0x11)},      {sampleRateKey, bytesOf("00000019 00000001")},
      {essenceContainerKey, bytesOf(container)},      {frameLayoutKey, bytesOf("01")},
      {storedWidthKey, bytesOf("00000780")},          {storedHeightKey, bytesOf("00000220")},
      {aspectRatioKey, bytesOf("00000010 00000009")}, {videoLineMapKey, bytesOf("00000002 00000004 00000015 00000248")},
      {componentDepthKey, bytesOf("00000008")},       {horizontalSubsamplingKey, bytesOf("00000002")}};
}

MXFPropertyMap mpegProperties() {
  MXFPropertyMap properties = cdciBase(mpegContainer);
  const StaticTags& t = mpegTags;
  properties.insert({{keyOfTag(t, 0x8000), bytesOf("00")},
                     {keyOfTag(t, 0x8001), bytesOf("01")},
                     {keyOfTag(t, 0x8002), bytesOf("02")},
                     {keyOfTag(t, 0x8003), bytesOf("00")},
                     {keyOfTag(t, 0x8004), bytesOf("01")},
                     {keyOfTag(t, 0x8005), bytesOf("01")},
                     {keyOfTag(t, 0x8006), bytesOf("000A")},
                     {keyOfTag(t, 0x8007), bytesOf("0002")},
                     {keyOfTag(t, 0x8008), bytesOf("02FAF080")},
                     {keyOfTag(t, 0x8009), bytesOf("82")}});
  return properties;
}

const std::string sps = "67 64 00 28 AC D9 40 78 02 27 E5 C0 44";
const std::string pps = "68 EB E3 CB 22 C0";

MXFPropertyMap avcProperties() {
  const StaticTags& t = avcTags;
  return {{MXFInstanceUIDKey, ByteVector(16, 0x22)},
          {keyOfTag(t, 0x8001), bytesOf("00")},
          {keyOfTag(t, 0x8002), bytesOf("01")},
          {keyOfTag(t, 0x8004), bytesOf("01")},
          {keyOfTag(t, 0x8005), bytesOf("00")},
          {keyOfTag(t, 0x8006), bytesOf("0030")},
          {keyOfTag(t, 0x8007), bytesOf("0003")},
          {keyOfTag(t, 0x8008), bytesOf("05F5E100")},
          {keyOfTag(t, 0x8012), bytesOf("02FAF080")},
          {keyOfTag(t, 0x8009), bytesOf("64")},
          {keyOfTag(t, 0x800A), bytesOf("00")},
          {keyOfTag(t, 0x800B), bytesOf("28")},
          {keyOfTag(t, 0x800C), bytesOf("FF")},
          {keyOfTag(t, 0x800D), bytesOf("04")},
          {keyOfTag(t, 0x800E), bytesOf("80")},
          {keyOfTag(t, 0x800F), bytesOf("C0")},
          {keyOfTag(t, 0x8010), bytesOf("00000001 0D" + sps)},
          {keyOfTag(t, 0x8011), bytesOf("00000002 06" + pps + "01 68")}};
}

MXFPropertyMap mpeg4Properties() {
  const StaticTags& t = mpeg4Tags;
  return {{MXFInstanceUIDKey, ByteVector(16, 0x33)}, {keyOfTag(t, 0x8000), bytesOf("01")},
          {keyOfTag(t, 0x8001), bytesOf("00")},      {keyOfTag(t, 0x8002), bytesOf("01")},
          {keyOfTag(t, 0x8003), bytesOf("01")},      {keyOfTag(t, 0x8004), bytesOf("01")},
          {keyOfTag(t, 0x8005), bytesOf("00")},      {keyOfTag(t, 0x8006), bytesOf("000F")},
          {keyOfTag(t, 0x8007), bytesOf("0000")},    {keyOfTag(t, 0x8008), bytesOf("08F0D180")},
          {keyOfTag(t, 0x8009), bytesOf("F5")}};
}

AVCParameterSetArray setsOf(const std::vector<std::string>& hexes) {
  AVCParameterSetArray sets;
  for (const std::string& hex : hexes) sets.parameterSets.push_back(bytesOf(hex));
  return sets;
}

// Codes a model through the composite of the codec descriptors.
std::string codingFailure(const std::shared_ptr<MetadataRoot>& root) {
  RecordingMetadataHandler next;
  MXFMetadataModelCoder coder(&next, makeCodecModelFactory());
  return failureOf([&] { coder.model({root}); });
}

std::shared_ptr<MPEGVideoDescriptor> mpegDescriptor() {
  const std::shared_ptr<MPEGVideoDescriptor> d = MPEGVideoDescriptor::create();
  d->setSampleRate(MXFRational{25, 1});
  d->setEssenceContainer(keyOf(mpegContainer));
  d->setFrameLayout(1);
  d->setStoredWidth(1920);
  d->setStoredHeight(544);
  d->setAspectRatio(MXFRational{16, 9});
  d->setVideoLineMap({21, 584});
  d->setComponentDepth(8);
  d->setHorizontalSubsampling(2);
  return d;
}

template <typename T>
void expectSurvivesTheModelCoderAndParser(const std::shared_ptr<T>& object) {
  const RewrittenModel rewritten = rewriteModel({object}, makeCodecModelFactory);
  EXPECT_TRUE(rewritten.reports.empty());
  CodecModelFactory factory;
  EXPECT_EQ("", modelDifference({object}, rewritten.model, factory));
  EXPECT_EQ(1u, objectsOf<T>(rewritten.model).size());
}

}  // namespace

TEST(MPEGVideoDescriptorFactory, SetKeyAndStaticTags) {
  MPEGVideoDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 51 00"), factory.getSetKey());
  expectTags(factory.getSetPrimer(), mpegTags);
  EXPECT_EQ(CDCIPictureDescriptorFactory().getSetPrimer().size() + mpegTags.size(), factory.getSetPrimer().size());
}

TEST(AVCVideoSubDescriptorFactory, SetKeyAndStaticTags) {
  AVCVideoSubDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 6E 00"), factory.getSetKey());
  expectTags(factory.getSetPrimer(), avcTags);
  EXPECT_EQ(SubDescriptorFactory().getSetPrimer().size() + avcTags.size(), factory.getSetPrimer().size());
}

TEST(MPEG4VideoSubDescriptorFactory, SetKeyAndStaticTags) {
  MPEG4VideoSubDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 68 00"), factory.getSetKey());
  expectTags(factory.getSetPrimer(), mpeg4Tags);
  EXPECT_EQ(SubDescriptorFactory().getSetPrimer().size() + mpeg4Tags.size(), factory.getSetPrimer().size());
}

TEST(VBIDataDescriptorFactory, SetKeyAndTheDataDescriptorsProperties) {
  VBIDataDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 5B 00"), factory.getSetKey());
  EXPECT_EQ(DataDescriptorFactory().getSetPrimer(), factory.getSetPrimer());
}

TEST(ANCDataDescriptorFactory, SetKeyAndTheDataDescriptorsProperties) {
  ANCDataDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 5C 00"), factory.getSetKey());
  EXPECT_EQ(DataDescriptorFactory().getSetPrimer(), factory.getSetPrimer());
}

TEST(MPEGVideoDescriptor, NewObjectHasNoOptionalValues) {
  const std::shared_ptr<MPEGVideoDescriptor> d = MPEGVideoDescriptor::create();
  EXPECT_FALSE(d->hasSingleSequence());
  EXPECT_FALSE(d->hasClosedGOP());
  EXPECT_FALSE(d->hasMaxGOP());
  EXPECT_FALSE(d->hasBPictureCount());
  EXPECT_FALSE(d->hasBitRate());
  EXPECT_FALSE(d->hasProfileAndLevel());
  EXPECT_EQ("assertion failure: MPEGVideoDescriptor.bitRate is present", failureOf([&] { d->getBitRate(); }));
  d->setMaxGOP(12);
  EXPECT_EQ(12u, d->getMaxGOP());
  d->removeMaxGOP();
  EXPECT_EQ("assertion failure: MPEGVideoDescriptor.maxGOP is present", failureOf([&] { d->getMaxGOP(); }));
}

TEST(AVCVideoSubDescriptor, NewObjectHasNoOptionalValues) {
  const std::shared_ptr<AVCVideoSubDescriptor> d = AVCVideoSubDescriptor::create();
  EXPECT_FALSE(d->hasProfile());
  EXPECT_FALSE(d->hasLevel());
  EXPECT_FALSE(d->hasSequenceParameterSetArray());
  EXPECT_FALSE(d->hasPictureParameterSetArray());
  EXPECT_EQ("assertion failure: AVCVideoSubDescriptor.sequenceParameterSetArray is present",
            failureOf([&] { d->getSequenceParameterSetArray(); }));
  d->setPictureParameterSetArray(setsOf({pps}));
  EXPECT_TRUE(d->hasPictureParameterSetArray());
  d->removePictureParameterSetArray();
  EXPECT_FALSE(d->hasPictureParameterSetArray());
}

TEST(MPEG4VideoSubDescriptor, NewObjectHasNoOptionalValues) {
  const std::shared_ptr<MPEG4VideoSubDescriptor> d = MPEG4VideoSubDescriptor::create();
  EXPECT_FALSE(d->hasConstantBVOPs());
  EXPECT_FALSE(d->hasMaxGOV());
  EXPECT_FALSE(d->hasBVOPCount());
  EXPECT_EQ("assertion failure: MPEG4VideoSubDescriptor.closedGOV is present", failureOf([&] { d->getClosedGOV(); }));
}

TEST(MPEGVideoDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties = mpegProperties();
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<MPEGVideoDescriptor> d =
      parsedAs<MPEGVideoDescriptorFactory, MPEGVideoDescriptor>(properties, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_FALSE(d->getSingleSequence());
  EXPECT_TRUE(d->getConstantBFrames());
  EXPECT_EQ(2u, d->getCodedContentType());
  EXPECT_FALSE(d->getLowDelay());
  EXPECT_TRUE(d->getClosedGOP());
  EXPECT_TRUE(d->getIdenticalGOP());
  EXPECT_EQ(10u, d->getMaxGOP());
  EXPECT_EQ(2u, d->getBPictureCount());
  EXPECT_EQ(50000000u, d->getBitRate());
  EXPECT_EQ(0x82u, d->getProfileAndLevel());
  EXPECT_EQ(1920u, d->getStoredWidth());
  EXPECT_EQ(properties, MPEGVideoDescriptorFactory().code(d).set.properties);
}

TEST(AVCVideoSubDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties = avcProperties();
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<AVCVideoSubDescriptor> d =
      parsedAs<AVCVideoSubDescriptorFactory, AVCVideoSubDescriptor>(properties, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_FALSE(d->getConstantBPicture());
  EXPECT_EQ(1u, d->getCodedContentKind());
  EXPECT_TRUE(d->getClosedGOP());
  EXPECT_FALSE(d->getIdenticalGOP());
  EXPECT_EQ(48u, d->getMaxGOP());
  EXPECT_EQ(3u, d->getBPictureCount());
  EXPECT_EQ(100000000u, d->getMaximumBitRate());
  EXPECT_EQ(50000000u, d->getAverageBitRate());
  EXPECT_EQ(0x64u, d->getProfile());
  EXPECT_EQ(0u, d->getProfileConstraint());
  EXPECT_EQ(0x28u, d->getLevel());
  EXPECT_EQ(0xFFu, d->getDecodingDelay());
  EXPECT_EQ(4u, d->getMaximumRefFrames());
  EXPECT_EQ(0x80u, d->getSequenceParameterSetFlag());
  EXPECT_EQ(0xC0u, d->getPictureParameterSetFlag());
  EXPECT_EQ(setsOf({sps}), d->getSequenceParameterSetArray());
  EXPECT_EQ(setsOf({pps, "68"}), d->getPictureParameterSetArray());
  EXPECT_EQ(properties, AVCVideoSubDescriptorFactory().code(d).set.properties);
}

TEST(MPEG4VideoSubDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties = mpeg4Properties();
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<MPEG4VideoSubDescriptor> d =
      parsedAs<MPEG4VideoSubDescriptorFactory, MPEG4VideoSubDescriptor>(properties, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_TRUE(d->getSingleSequence());
  EXPECT_FALSE(d->getConstantBVOPs());
  EXPECT_EQ(1u, d->getCodedContentType());
  EXPECT_TRUE(d->getLowDelay());
  EXPECT_TRUE(d->getClosedGOV());
  EXPECT_FALSE(d->getIdenticalGOV());
  EXPECT_EQ(15u, d->getMaxGOV());
  EXPECT_EQ(0u, d->getBVOPCount());
  EXPECT_EQ(150000000u, d->getBitRate());
  EXPECT_EQ(0xF5u, d->getProfileAndLevel());
  EXPECT_EQ(properties, MPEG4VideoSubDescriptorFactory().code(d).set.properties);
}

TEST(AVCVideoSubDescriptorFactory, ParameterSetArrayWithCountZeroIsFourOctets) {
  const std::shared_ptr<AVCVideoSubDescriptor> d = AVCVideoSubDescriptor::create();
  d->setSequenceParameterSetArray(AVCParameterSetArray());
  const KLVKey key = keyOfTag(avcTags, 0x8010);
  EXPECT_EQ(bytesOf("00000000"), AVCVideoSubDescriptorFactory().code(d).set.properties.at(key));

  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<AVCVideoSubDescriptor> read = parsedAs<AVCVideoSubDescriptorFactory, AVCVideoSubDescriptor>(
      {{MXFInstanceUIDKey, ByteVector(16, 0x22)}, {key, bytesOf("00000000")}}, errors);
  ASSERT_NE(nullptr, read);
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_TRUE(read->hasSequenceParameterSetArray());
  EXPECT_TRUE(read->getSequenceParameterSetArray().parameterSets.empty());
}

TEST(AVCVideoSubDescriptorFactory, ParameterSetOf256OctetsFailsValidParameterSet) {
  const std::shared_ptr<AVCVideoSubDescriptor> d = AVCVideoSubDescriptor::create();
  AVCParameterSetArray sets;
  sets.parameterSets.push_back(ByteVector(255, 0x67));
  d->setSequenceParameterSetArray(sets);
  const KLVKey key = keyOfTag(avcTags, 0x8010);
  AVCVideoSubDescriptorFactory factory;
  const ByteVector coded = factory.code(d).set.properties.at(key);
  ASSERT_EQ(4u + 1u + 255u, coded.size());
  EXPECT_EQ(0xFF, coded[4]);

  sets.parameterSets.push_back(ByteVector(256, 0x68));
  d->setSequenceParameterSetArray(sets);
  EXPECT_EQ("assertion failure: valid parameter set", failureOf([&] { factory.code(d); }));
}

TEST(AVCVideoSubDescriptorFactory, ParameterSetArrayWithOctetsLeftOverIsReportedAsInvalidLength) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  const std::shared_ptr<AVCVideoSubDescriptor> d = parsedAs<AVCVideoSubDescriptorFactory, AVCVideoSubDescriptor>(
      {{MXFInstanceUIDKey, ByteVector(16, 0x22)}, {keyOfTag(avcTags, 0x8011), bytesOf("00000001 01 68 00")}}, errors);
  ASSERT_NE(nullptr, d);
  EXPECT_EQ((std::vector<std::string>{"error 3 invalid AVCVideoSubDescriptor.pictureParameterSetArray value - "
                                      "assertion failure: valid external length"}),
            modelReportLines(*errors));
  EXPECT_FALSE(d->hasPictureParameterSetArray());
}

TEST(MXFMetadataModelCoder, MPEGVideoDescriptorAndAVCSubDescriptorUnderOneTagFailConsistentPrimerEntry) {
  const std::shared_ptr<MPEGVideoDescriptor> d = mpegDescriptor();
  d->setMaxGOP(10);
  const std::shared_ptr<AVCVideoSubDescriptor> avc = AVCVideoSubDescriptor::create();
  avc->setMaxGOP(48);
  d->addGenericSubDescriptor(avc);
  EXPECT_EQ("assertion failure: consistent primer entry", codingFailure(d));
}

TEST(MXFMetadataModelCoder, MPEGVideoDescriptorAndMPEG4SubDescriptorUnderOneTagFailConsistentPrimerEntry) {
  const std::shared_ptr<MPEGVideoDescriptor> d = mpegDescriptor();
  d->setBitRate(50000000);
  const std::shared_ptr<MPEG4VideoSubDescriptor> mpeg4 = MPEG4VideoSubDescriptor::create();
  mpeg4->setBitRate(150000000);
  d->addGenericSubDescriptor(mpeg4);
  EXPECT_EQ("assertion failure: consistent primer entry", codingFailure(d));
}

TEST(MXFMetadataModelCoder, CodecDescriptorsWithoutACommonTagKeepTheirStaticTags) {
  const std::shared_ptr<MPEGVideoDescriptor> d = mpegDescriptor();
  d->setMaxGOP(10);
  const std::shared_ptr<AVCVideoSubDescriptor> avc = AVCVideoSubDescriptor::create();
  avc->setLevel(0x28);
  d->addGenericSubDescriptor(avc);
  RecordingMetadataHandler next;
  MXFMetadataModelCoder coder(&next, makeCodecModelFactory());
  coder.model({d});
  ASSERT_EQ(1u, next.primers.size());
  ASSERT_EQ(2u, next.sets.size());
  const MXFPrimerEntries& primer = next.primers[0];
  const auto has = [&](std::uint16_t tag, const KLVKey& key) {
    for (const MXFPrimerEntry& entry : primer)
      if (entry.tag == tag) return entry.key == key;
    return false;
  };
  EXPECT_TRUE(has(0x8006, keyOfTag(mpegTags, 0x8006)));
  EXPECT_TRUE(has(0x800B, keyOfTag(avcTags, 0x800B)));
}

TEST(MPEGVideoDescriptor, EveryPropertySurvivesTheModelCoderAndParser) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  expectSurvivesTheModelCoderAndParser(
      parsedAs<MPEGVideoDescriptorFactory, MPEGVideoDescriptor>(mpegProperties(), errors));
}

TEST(AVCVideoSubDescriptor, EveryPropertySurvivesTheModelCoderAndParser) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  expectSurvivesTheModelCoderAndParser(
      parsedAs<AVCVideoSubDescriptorFactory, AVCVideoSubDescriptor>(avcProperties(), errors));
}

TEST(MPEG4VideoSubDescriptor, EveryPropertySurvivesTheModelCoderAndParser) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  expectSurvivesTheModelCoderAndParser(
      parsedAs<MPEG4VideoSubDescriptorFactory, MPEG4VideoSubDescriptor>(mpeg4Properties(), errors));
}

TEST(VBIDataDescriptor, SurvivesTheModelCoderAndParser) {
  const std::shared_ptr<VBIDataDescriptor> d = VBIDataDescriptor::create();
  d->setSampleRate(MXFRational{25, 1});
  d->setEssenceContainer(keyOf("06 0E 2B 34 04 01 01 09 0D 01 03 01 02 0D 00 00"));
  d->setDataEssenceCoding(keyOf("06 0E 2B 34 04 01 01 05 0E 09 06 07 01 01 01 03"));
  expectSurvivesTheModelCoderAndParser(d);
}

TEST(ANCDataDescriptor, SurvivesTheModelCoderAndParser) {
  const std::shared_ptr<ANCDataDescriptor> d = ANCDataDescriptor::create();
  d->setSampleRate(MXFRational{25, 1});
  d->setEssenceContainer(keyOf("06 0E 2B 34 04 01 01 09 0D 01 03 01 02 0E 00 00"));
  d->setLinkedTrackID(4);
  expectSurvivesTheModelCoderAndParser(d);
}

TEST(MXFMPEGMetadataModelFactory, SubFactoriesInSearchOrder) {
  MXFMPEGMetadataModelFactory factory;
  ASSERT_EQ(3u, factory.getFactories().size());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<MPEGVideoDescriptorFactory>(factory.getFactories()[0]));
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<MPEG4VideoSubDescriptorFactory>(factory.getFactories()[1]));
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<AVCVideoSubDescriptorFactory>(factory.getFactories()[2]));
}

TEST(MXFAES3MetadataModelFactory, SubFactoriesInSearchOrder) {
  MXFAES3MetadataModelFactory factory;
  ASSERT_EQ(2u, factory.getFactories().size());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<WaveAudioDescriptorFactory>(factory.getFactories()[0]));
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<AES3AudioDescriptorFactory>(factory.getFactories()[1]));
}

TEST(MXFVBIANCMetadataModelFactory, SubFactoriesInSearchOrder) {
  MXFVBIANCMetadataModelFactory factory;
  ASSERT_EQ(2u, factory.getFactories().size());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<VBIDataDescriptorFactory>(factory.getFactories()[0]));
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<ANCDataDescriptorFactory>(factory.getFactories()[1]));
}

TEST(MXFFormatMetadataModelFactory, LeavesTheCodecDescriptorsToTheirOwnComposites) {
  MXFFormatMetadataModelFactory format;
  EXPECT_FALSE(format.canParse(MPEGVideoDescriptorFactory().getSetKey()));
  EXPECT_FALSE(format.canParse(AES3AudioDescriptorFactory().getSetKey()));
  EXPECT_FALSE(format.canCode(typeid(WaveAudioDescriptor)));
  CodecModelFactory codec;
  EXPECT_TRUE(codec.canParse(MPEGVideoDescriptorFactory().getSetKey()));
  EXPECT_TRUE(codec.canParse(ANCDataDescriptorFactory().getSetKey()));
  EXPECT_TRUE(codec.canCode(typeid(AVCVideoSubDescriptor)));
}
