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

// PictureDescriptor's properties in the order of its table.
const StaticTags pictureTags{
    {0x3215, propertyKeyOf(0x05, "04 05 01 13 00 00 00 00")}, {0x320C, propertyKeyOf(0x01, "04 01 03 01 04 00 00 00")},
    {0x3203, propertyKeyOf(0x01, "04 01 05 02 02 00 00 00")}, {0x3202, propertyKeyOf(0x01, "04 01 05 02 01 00 00 00")},
    {0x3216, propertyKeyOf(0x05, "04 01 03 02 08 00 00 00")}, {0x3205, propertyKeyOf(0x01, "04 01 05 01 08 00 00 00")},
    {0x3204, propertyKeyOf(0x01, "04 01 05 01 07 00 00 00")}, {0x3206, propertyKeyOf(0x01, "04 01 05 01 09 00 00 00")},
    {0x3207, propertyKeyOf(0x01, "04 01 05 01 0A 00 00 00")}, {0x3208, propertyKeyOf(0x01, "04 01 05 01 0B 00 00 00")},
    {0x3209, propertyKeyOf(0x01, "04 01 05 01 0C 00 00 00")}, {0x320A, propertyKeyOf(0x01, "04 01 05 01 0D 00 00 00")},
    {0x320B, propertyKeyOf(0x01, "04 01 05 01 0E 00 00 00")}, {0x3217, propertyKeyOf(0x05, "04 01 03 02 07 00 00 00")},
    {0x320E, propertyKeyOf(0x01, "04 01 01 01 01 00 00 00")}, {0x3218, propertyKeyOf(0x05, "04 01 03 02 09 00 00 00")},
    {0x320D, propertyKeyOf(0x02, "04 01 03 02 05 00 00 00")}, {0x320F, propertyKeyOf(0x02, "05 20 01 02 00 00 00 00")},
    {0x3210, propertyKeyOf(0x02, "04 01 02 01 01 01 02 00")}, {0x3211, propertyKeyOf(0x02, "04 18 01 01 00 00 00 00")},
    {0x3213, propertyKeyOf(0x02, "04 18 01 02 00 00 00 00")}, {0x3214, propertyKeyOf(0x02, "04 18 01 03 00 00 00 00")},
    {0x3212, propertyKeyOf(0x02, "04 01 03 01 06 00 00 00")}, {0x3201, propertyKeyOf(0x02, "04 01 06 01 00 00 00 00")},
    {0x321A, propertyKeyOf(0x02, "04 01 02 01 01 03 01 00")}, {0x3219, propertyKeyOf(0x09, "04 01 02 01 01 06 01 00")}};

const StaticTags cdciTags{
    {0x3301, propertyKeyOf(0x02, "04 01 05 03 0A 00 00 00")}, {0x3302, propertyKeyOf(0x01, "04 01 05 01 05 00 00 00")},
    {0x3308, propertyKeyOf(0x02, "04 01 05 01 10 00 00 00")}, {0x3303, propertyKeyOf(0x01, "04 01 05 01 06 00 00 00")},
    {0x330B, propertyKeyOf(0x05, "03 01 02 01 0A 00 00 00")}, {0x3307, propertyKeyOf(0x02, "04 18 01 04 00 00 00 00")},
    {0x3309, propertyKeyOf(0x02, "04 01 05 03 07 00 00 00")}, {0x3304, propertyKeyOf(0x01, "04 01 05 03 03 00 00 00")},
    {0x3305, propertyKeyOf(0x01, "04 01 05 03 04 00 00 00")}, {0x3306, propertyKeyOf(0x02, "04 01 05 03 05 00 00 00")}};

const StaticTags rgbaTags{
    {0x3406, propertyKeyOf(0x05, "04 01 05 03 0B 00 00 00")}, {0x3407, propertyKeyOf(0x05, "04 01 05 03 0C 00 00 00")},
    {0x3408, propertyKeyOf(0x05, "04 01 05 03 0D 00 00 00")}, {0x3409, propertyKeyOf(0x05, "04 01 05 03 0E 00 00 00")},
    {0x3405, propertyKeyOf(0x05, "04 01 04 04 01 00 00 00")}, {0x3401, propertyKeyOf(0x02, "04 01 05 03 06 00 00 00")},
    {0x3403, propertyKeyOf(0x02, "04 01 05 03 08 00 00 00")}, {0x3404, propertyKeyOf(0x02, "04 01 05 03 09 00 00 00")}};

const KLVKey sampleRateKey = propertyKeyOf(0x01, "04 06 01 01 00 00 00 00");
const KLVKey essenceContainerKey = propertyKeyOf(0x02, "06 01 01 04 01 02 00 00");
const std::string d10Label = "06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 01";
const std::string gamma625 = "06 0E 2B 34 04 01 01 01 04 01 01 01 01 01 00 00";
const std::string coding = "06 0E 2B 34 04 01 01 01 04 01 02 02 01 02 01 01";
const std::string equations = "06 0E 2B 34 04 01 01 01 04 01 01 01 02 02 00 00";
const std::string primaries = "06 0E 2B 34 04 01 01 06 04 01 01 01 03 03 00 00";
const std::string layout = "52 08 47 08 42 08 00 00 00 00 00 00 00 00 00 00";

// Every property of a PictureDescriptor, with the required ones of its
// bases.
MXFPropertyMap pictureProperties() {
  const StaticTags& t = pictureTags;
  return {
      {MXFInstanceUIDKey, ByteVector(16, 0x11)},  {sampleRateKey, bytesOf("00000019 00000001")},
      {essenceContainerKey, bytesOf(d10Label)},   {keyOfTag(t, 0x3215), bytesOf("01")},
      {keyOfTag(t, 0x320C), bytesOf("01")},       {keyOfTag(t, 0x3203), bytesOf("000002D0")},
      {keyOfTag(t, 0x3202), bytesOf("00000130")}, {keyOfTag(t, 0x3216), bytesOf("FFFFFFFF")},
      {keyOfTag(t, 0x3205), bytesOf("000002D1")}, {keyOfTag(t, 0x3204), bytesOf("00000131")},
      {keyOfTag(t, 0x3206), bytesOf("00000002")}, {keyOfTag(t, 0x3207), bytesOf("00000003")},
      {keyOfTag(t, 0x3208), bytesOf("00000120")}, {keyOfTag(t, 0x3209), bytesOf("000002C0")},
      {keyOfTag(t, 0x320A), bytesOf("00000004")}, {keyOfTag(t, 0x320B), bytesOf("00000010")},
      {keyOfTag(t, 0x3217), bytesOf("FFFFFFFE")}, {keyOfTag(t, 0x320E), bytesOf("00000004 00000003")},
      {keyOfTag(t, 0x3218), bytesOf("09")},       {keyOfTag(t, 0x320D), bytesOf("00000002 00000004 00000007 00000140")},
      {keyOfTag(t, 0x320F), bytesOf("00")},       {keyOfTag(t, 0x3210), bytesOf(gamma625)},
      {keyOfTag(t, 0x3211), bytesOf("00000005")}, {keyOfTag(t, 0x3213), bytesOf("00000006")},
      {keyOfTag(t, 0x3214), bytesOf("00000007")}, {keyOfTag(t, 0x3212), bytesOf("02")},
      {keyOfTag(t, 0x3201), bytesOf(coding)},     {keyOfTag(t, 0x321A), bytesOf(equations)},
      {keyOfTag(t, 0x3219), bytesOf(primaries)}};
}

void expectPictureValues(const PictureDescriptor& d) {
  EXPECT_EQ((MXFRational{25, 1}), d.getSampleRate());
  EXPECT_EQ(keyOf(d10Label), d.getEssenceContainer());
  EXPECT_EQ(1, d.getSignalStandard());
  EXPECT_EQ(1, d.getFrameLayout());
  EXPECT_EQ(720u, d.getStoredWidth());
  EXPECT_EQ(304u, d.getStoredHeight());
  EXPECT_EQ(-1, d.getStoredF2Offset());
  EXPECT_EQ(721u, d.getSampledWidth());
  EXPECT_EQ(305u, d.getSampledHeight());
  EXPECT_EQ(2, d.getSampledXOffset());
  EXPECT_EQ(3, d.getSampledYOffset());
  EXPECT_EQ(288u, d.getDisplayHeight());
  EXPECT_EQ(704u, d.getDisplayWidth());
  EXPECT_EQ(4, d.getDisplayXOffset());
  EXPECT_EQ(16, d.getDisplayYOffset());
  EXPECT_EQ(-2, d.getDisplayF2Offset());
  EXPECT_EQ((MXFRational{4, 3}), d.getAspectRatio());
  EXPECT_EQ(9, d.getActiveFormatDescriptor());
  EXPECT_EQ((std::vector<std::int32_t>{7, 320}), d.getVideoLineMap());
  EXPECT_EQ(0, d.getAlphaTransparency());
  EXPECT_EQ(keyOf(gamma625), d.getCaptureGamma());
  EXPECT_EQ(5u, d.getImageAlignmentOffset());
  EXPECT_EQ(6u, d.getImageStartOffset());
  EXPECT_EQ(7u, d.getImageEndOffset());
  EXPECT_EQ(2, d.getFieldDominance());
  EXPECT_EQ(keyOf(coding), d.getPictureEssenceCoding());
  EXPECT_EQ(keyOf(equations), d.getCodingEquations());
  EXPECT_EQ(keyOf(primaries), d.getColourPrimaries());
}

}  // namespace

TEST(PictureDescriptorFactory, SetKeyAndStaticTags) {
  PictureDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 27 00"), factory.getSetKey());
  expectTags(factory.getSetPrimer(), pictureTags);
  EXPECT_EQ(35u, factory.getSetPrimer().size());
}

TEST(CDCIPictureDescriptorFactory, SetKeyAndStaticTags) {
  CDCIPictureDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 28 00"), factory.getSetKey());
  expectTags(factory.getSetPrimer(), cdciTags);
  expectTags(factory.getSetPrimer(), pictureTags);
  EXPECT_EQ(45u, factory.getSetPrimer().size());
}

TEST(RGBAPictureDescriptorFactory, SetKeyAndStaticTags) {
  RGBAPictureDescriptorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 29 00"), factory.getSetKey());
  expectTags(factory.getSetPrimer(), rgbaTags);
  EXPECT_EQ(43u, factory.getSetPrimer().size());
}

TEST(PictureDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  const MXFPropertyMap properties = pictureProperties();
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  PictureDescriptorFactory factory;
  const std::shared_ptr<PictureDescriptor> d =
      std::dynamic_pointer_cast<PictureDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  expectPictureValues(*d);
  EXPECT_EQ(properties, factory.code(d).set.properties);
}

TEST(CDCIPictureDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  MXFPropertyMap properties = pictureProperties();
  const StaticTags& t = cdciTags;
  properties[keyOfTag(t, 0x3301)] = bytesOf("0000000A");
  properties[keyOfTag(t, 0x3302)] = bytesOf("00000002");
  properties[keyOfTag(t, 0x3308)] = bytesOf("00000001");
  properties[keyOfTag(t, 0x3303)] = bytesOf("05");
  properties[keyOfTag(t, 0x330B)] = bytesOf("01");
  properties[keyOfTag(t, 0x3307)] = bytesOf("FFFA");
  properties[keyOfTag(t, 0x3309)] = bytesOf("00000008");
  properties[keyOfTag(t, 0x3304)] = bytesOf("00000040");
  properties[keyOfTag(t, 0x3305)] = bytesOf("000003AC");
  properties[keyOfTag(t, 0x3306)] = bytesOf("00000381");
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  CDCIPictureDescriptorFactory factory;
  const std::shared_ptr<CDCIPictureDescriptor> d =
      std::dynamic_pointer_cast<CDCIPictureDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  expectPictureValues(*d);
  EXPECT_EQ(10u, d->getComponentDepth());
  EXPECT_EQ(2u, d->getHorizontalSubsampling());
  EXPECT_EQ(1u, d->getVerticalSubsampling());
  EXPECT_EQ(5, d->getColourSiting());
  EXPECT_TRUE(d->getReversedByteOrder());
  EXPECT_EQ(-6, d->getPaddingBits());
  EXPECT_EQ(8u, d->getAlphaSamplingDepth());
  EXPECT_EQ(64u, d->getBlackReferenceLevel());
  EXPECT_EQ(940u, d->getWhiteReferenceLevel());
  EXPECT_EQ(897u, d->getColourRange());
  EXPECT_EQ(properties, factory.code(d).set.properties);
}

TEST(RGBAPictureDescriptorFactory, ParsesEveryPropertyAndCodesTheSameMap) {
  MXFPropertyMap properties = pictureProperties();
  const StaticTags& t = rgbaTags;
  properties[keyOfTag(t, 0x3406)] = bytesOf("000003AC");
  properties[keyOfTag(t, 0x3407)] = bytesOf("00000040");
  properties[keyOfTag(t, 0x3408)] = bytesOf("000003FF");
  properties[keyOfTag(t, 0x3409)] = bytesOf("00000000");
  properties[keyOfTag(t, 0x3405)] = bytesOf("03");
  properties[keyOfTag(t, 0x3401)] = bytesOf(layout);
  properties[keyOfTag(t, 0x3403)] = bytesOf("00000003 00000001 0A 0B 0C");
  properties[keyOfTag(t, 0x3404)] = bytesOf("41 08 00 00 00 00 00 00 00 00 00 00 00 00 00 00");
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  RGBAPictureDescriptorFactory factory;
  const std::shared_ptr<RGBAPictureDescriptor> d =
      std::dynamic_pointer_cast<RGBAPictureDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_TRUE(errors->reports.empty());
  expectPictureValues(*d);
  EXPECT_EQ(940u, d->getComponentMaxReferenceLevel());
  EXPECT_EQ(64u, d->getComponentMinReferenceLevel());
  EXPECT_EQ(1023u, d->getAlphaMaxReferenceLevel());
  EXPECT_EQ(0u, d->getAlphaMinReferenceLevel());
  EXPECT_EQ(3, d->getScanningDirection());
  RGBALayout pixels;
  pixels.components[0] = {0x52, 8};
  pixels.components[1] = {0x47, 8};
  pixels.components[2] = {0x42, 8};
  EXPECT_EQ(pixels, d->getPixelLayout());
  EXPECT_EQ(bytesOf("0A 0B 0C"), d->getPalette());
  RGBALayout palette;
  palette.components[0] = {0x41, 8};
  EXPECT_EQ(palette, d->getPaletteLayout());
  EXPECT_EQ(properties, factory.code(d).set.properties);
}

TEST(RGBAPictureDescriptorFactory, PixelLayoutOf15OctetsIsReportedAsInvalidSize) {
  MXFPropertyMap properties = pictureProperties();
  properties[keyOfTag(rgbaTags, 0x3401)] = bytesOf("52 08 47 08 42 08 00 00 00 00 00 00 00 00 00");
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  RGBAPictureDescriptorFactory factory;
  const std::shared_ptr<RGBAPictureDescriptor> d =
      std::dynamic_pointer_cast<RGBAPictureDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_EQ(std::vector<std::string>{"error 3 invalid RGBAPictureDescriptor.pixelLayout value - assertion failure: "
                                     "valid size"},
            modelReportLines(*errors));
  EXPECT_EQ(invalidPropertyValueId, errors->reports.at(0).identifier);
  EXPECT_EQ(RGBALayout(), d->getPixelLayout());
}

TEST(RGBAPictureDescriptorFactory, PaletteLayoutOf17OctetsIsReportedAsInvalidSize) {
  MXFPropertyMap properties = pictureProperties();
  properties[keyOfTag(rgbaTags, 0x3401)] = bytesOf(layout);
  properties[keyOfTag(rgbaTags, 0x3404)] = bytesOf(layout + " 00");
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  RGBAPictureDescriptorFactory factory;
  const std::shared_ptr<RGBAPictureDescriptor> d =
      std::dynamic_pointer_cast<RGBAPictureDescriptor>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, d);
  EXPECT_EQ(std::vector<std::string>{"error 3 invalid RGBAPictureDescriptor.paletteLayout value - assertion failure: "
                                     "valid size"},
            modelReportLines(*errors));
  EXPECT_FALSE(d->hasPaletteLayout());
}

TEST(RGBAPictureDescriptorFactory, SetWithoutPixelLayoutReportsMissing) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  RGBAPictureDescriptorFactory factory;
  parseWith(factory, pictureProperties(), errors);
  EXPECT_EQ(std::vector<std::string>{"error 2 missing RGBAPictureDescriptor.pixelLayout"}, modelReportLines(*errors));
}

TEST(CDCIPictureDescriptorFactory, SetWithoutAnyPropertyReportsRequiredOnesFromTheMostDerivedClassDown) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  CDCIPictureDescriptorFactory factory;
  parseWith(factory, {{MXFInstanceUIDKey, ByteVector(16, 0x11)}}, errors);
  EXPECT_EQ((std::vector<std::string>{
                "error 2 missing CDCIPictureDescriptor.componentDepth",
                "error 2 missing CDCIPictureDescriptor.horizontalSubsampling",
                "error 2 missing PictureDescriptor.frameLayout", "error 2 missing PictureDescriptor.storedWidth",
                "error 2 missing PictureDescriptor.storedHeight", "error 2 missing PictureDescriptor.aspectRatio",
                "error 2 missing PictureDescriptor.videoLineMap", "error 2 missing FileDescriptor.sampleRate",
                "error 2 missing FileDescriptor.essenceContainer"}),
            modelReportLines(*errors));
}

TEST(CDCIPictureDescriptor, NewObjectHasNoOptionalValues) {
  const std::shared_ptr<CDCIPictureDescriptor> d = CDCIPictureDescriptor::create();
  EXPECT_EQ(0u, d->getComponentDepth());
  EXPECT_EQ(0u, d->getStoredWidth());
  EXPECT_TRUE(d->getVideoLineMap().empty());
  EXPECT_FALSE(d->hasColourSiting());
  EXPECT_EQ("assertion failure: CDCIPictureDescriptor.colourSiting is present",
            failureOf([&] { d->getColourSiting(); }));
  EXPECT_EQ("assertion failure: PictureDescriptor.captureGamma is present", failureOf([&] { d->getCaptureGamma(); }));
  d->setColourSiting(0);
  EXPECT_TRUE(d->hasColourSiting());
  d->removeColourSiting();
  EXPECT_FALSE(d->hasColourSiting());
}

TEST(CDCIPictureDescriptorFactory, OptionalValueOfTheDefaultIsWrittenWhenSet) {
  const std::shared_ptr<CDCIPictureDescriptor> d = CDCIPictureDescriptor::create();
  CDCIPictureDescriptorFactory factory;
  EXPECT_EQ(0u, factory.code(d).set.properties.count(keyOfTag(cdciTags, 0x3307)));
  d->setPaddingBits(0);
  EXPECT_EQ(bytesOf("0000"), factory.code(d).set.properties.at(keyOfTag(cdciTags, 0x3307)));
}
