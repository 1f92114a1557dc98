#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const std::string gamma625 = "06 0E 2B 34 04 01 01 01 04 01 01 01 01 01 00 00";
const std::string gamma525 = "06 0E 2B 34 04 01 01 01 04 01 01 01 01 02 00 00";

// The label with kind and wrapping; octet 7 is 02, so that the result can
// be told to hold the label as given.
KLVKey dvLabel(std::uint8_t kind, std::uint8_t wrapping) {
  KLVKey key = keyOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 02 00 00");
  key[14] = kind;
  key[15] = wrapping;
  return key;
}

KLVKey d10Label(std::uint8_t kind, std::uint8_t wrapping) {
  KLVKey key = keyOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 01 00 00");
  key[14] = kind;
  key[15] = wrapping;
  return key;
}

ByteVector octetsOf(const KLVKey& key) { return ByteVector(key.data(), key.data() + 16); }

// What differs between the line standards, as the tables give it.
struct Expected {
  MXFRational sampleRate;
  std::uint32_t storedHeight;
  std::uint32_t displayHeight;
  std::int32_t displayYOffset;
  std::vector<std::int32_t> videoLineMap;
  std::string captureGamma;
  std::string pictureEssenceCoding;
  std::uint32_t horizontalSubsampling;
  std::uint32_t verticalSubsampling;
  std::uint8_t colourSiting;
};

void expectDescriptor(const Expected& e, const KLVKey& label, const CDCIPictureDescriptor& d) {
  EXPECT_EQ(e.sampleRate, d.getSampleRate());
  EXPECT_EQ(octetsOf(label), octetsOf(d.getEssenceContainer()));
  EXPECT_EQ(1, d.getSignalStandard());
  EXPECT_EQ(1, d.getFrameLayout());
  EXPECT_EQ(720u, d.getStoredWidth());
  EXPECT_EQ(720u, d.getSampledWidth());
  EXPECT_EQ(720u, d.getDisplayWidth());
  EXPECT_EQ(e.storedHeight, d.getStoredHeight());
  EXPECT_EQ(e.storedHeight, d.getSampledHeight());
  EXPECT_EQ(e.displayHeight, d.getDisplayHeight());
  EXPECT_EQ(0, d.getStoredF2Offset());
  EXPECT_EQ(0, d.getSampledXOffset());
  EXPECT_EQ(0, d.getSampledYOffset());
  EXPECT_EQ(0, d.getDisplayXOffset());
  EXPECT_EQ(e.displayYOffset, d.getDisplayYOffset());
  EXPECT_EQ(0, d.getDisplayF2Offset());
  EXPECT_EQ((MXFRational{4, 3}), d.getAspectRatio());
  EXPECT_EQ(e.videoLineMap, d.getVideoLineMap());
  EXPECT_EQ(bytesOf(e.captureGamma), octetsOf(d.getCaptureGamma()));
  EXPECT_EQ(0u, d.getImageAlignmentOffset());
  EXPECT_EQ(0u, d.getImageStartOffset());
  EXPECT_EQ(0u, d.getImageEndOffset());
  EXPECT_EQ(1, d.getFieldDominance());
  EXPECT_EQ(bytesOf(e.pictureEssenceCoding), octetsOf(d.getPictureEssenceCoding()));
  EXPECT_EQ(8u, d.getComponentDepth());
  EXPECT_EQ(e.horizontalSubsampling, d.getHorizontalSubsampling());
  EXPECT_EQ(e.verticalSubsampling, d.getVerticalSubsampling());
  EXPECT_EQ(e.colourSiting, d.getColourSiting());
  EXPECT_FALSE(d.getReversedByteOrder());
  EXPECT_EQ(0, d.getPaddingBits());
  EXPECT_EQ(16u, d.getBlackReferenceLevel());
  EXPECT_EQ(235u, d.getWhiteReferenceLevel());
  EXPECT_EQ(225u, d.getColourRange());
  EXPECT_FALSE(d.hasActiveFormatDescriptor());
  EXPECT_FALSE(d.hasAlphaTransparency());
  EXPECT_FALSE(d.hasCodingEquations());
  EXPECT_FALSE(d.hasColourPrimaries());
  EXPECT_FALSE(d.hasAlphaSamplingDepth());
  EXPECT_FALSE(d.hasLinkedTrackID());
}

struct DVRow {
  std::uint8_t kind;
  bool is625;
  std::string codingTail;
  std::uint32_t horizontalSubsampling;
  std::uint32_t verticalSubsampling;
};

Expected dvExpected(const DVRow& row, std::uint8_t colourSiting625) {
  const std::string coding = "06 0E 2B 34 04 01 01 01 04 01 02 02 02 " + row.codingTail;
  if (row.is625)
    return {
        {25, 1},        288, 288, 0, {23, 335}, gamma625, coding, row.horizontalSubsampling, row.verticalSubsampling,
        colourSiting625};
  return {{30000, 1001},           240, 240, 0, {23, 285}, gamma525, coding, row.horizontalSubsampling,
          row.verticalSubsampling, 0};
}

void PrintTo(const DVRow& row, std::ostream* out) { *out << "DV kind " << static_cast<int>(row.kind); }

class DVPictureDescriptorRow : public ::testing::TestWithParam<DVRow> {};

TEST_P(DVPictureDescriptorRow, FillsEveryPropertyOfTheTable) {
  const DVRow& row = GetParam();
  for (std::uint8_t wrapping : {0x01, 0x02}) {
    const KLVKey label = dvLabel(row.kind, wrapping);
    const std::shared_ptr<CDCIPictureDescriptor> d = createDVPictureDescriptor(label, 0x0103);
    ASSERT_NE(nullptr, d);
    expectDescriptor(dvExpected(row, 5), label, *d);
  }
}

TEST_P(DVPictureDescriptorRow, ColourSitingOf625LinesIsUnknownBelowPrefaceVersion0103) {
  const DVRow& row = GetParam();
  const KLVKey label = dvLabel(row.kind, 0x01);
  expectDescriptor(dvExpected(row, 255), label, *createDVPictureDescriptor(label, 0x0102));
}

INSTANTIATE_TEST_SUITE_P(EveryKind, DVPictureDescriptorRow,
                         ::testing::Values(DVRow{0x01, false, "01 01 00", 4, 1}, DVRow{0x02, true, "01 02 00", 2, 2},
                                           DVRow{0x03, false, "01 03 00", 4, 1}, DVRow{0x04, true, "01 04 00", 2, 2},
                                           DVRow{0x40, false, "02 01 00", 4, 1}, DVRow{0x41, true, "02 02 00", 4, 1},
                                           DVRow{0x50, false, "02 03 00", 2, 1}, DVRow{0x51, true, "02 04 00", 2, 1}),
                         [](const ::testing::TestParamInfo<DVRow>& info) {
                           return "Kind" + std::to_string(info.param.kind);
                         });

struct D10Row {
  std::uint8_t kind;
  bool is625;
  std::string codingOctet;
};

Expected d10Expected(const D10Row& row) {
  const std::string coding = "06 0E 2B 34 04 01 01 01 04 01 02 02 01 02 01 " + row.codingOctet;
  if (row.is625) return {{25, 1}, 304, 288, 16, {7, 320}, gamma625, coding, 2, 1, 0};
  return {{30000, 1001}, 256, 243, 13, {7, 270}, gamma525, coding, 2, 1, 0};
}

void PrintTo(const D10Row& row, std::ostream* out) { *out << "D-10 kind " << static_cast<int>(row.kind); }

class D10PictureDescriptorRow : public ::testing::TestWithParam<D10Row> {};

TEST_P(D10PictureDescriptorRow, FillsEveryPropertyOfTheTable) {
  const D10Row& row = GetParam();
  for (std::uint8_t wrapping : {0x01, 0x02, 0x7F}) {
    const KLVKey label = d10Label(row.kind, wrapping);
    const std::shared_ptr<CDCIPictureDescriptor> d = createD10PictureDescriptor(label);
    ASSERT_NE(nullptr, d);
    expectDescriptor(d10Expected(row), label, *d);
  }
}

INSTANTIATE_TEST_SUITE_P(EveryKind, D10PictureDescriptorRow,
                         ::testing::Values(D10Row{0x01, true, "01"}, D10Row{0x02, false, "02"},
                                           D10Row{0x03, true, "03"}, D10Row{0x04, false, "04"},
                                           D10Row{0x05, true, "05"}, D10Row{0x06, false, "06"}),
                         [](const ::testing::TestParamInfo<D10Row>& info) {
                           return "Kind" + std::to_string(info.param.kind);
                         });

}  // namespace

TEST(DVPictureDescriptor, WrappingThreeFailsValidDVEssenceContainer) {
  EXPECT_EQ("assertion failure: valid DV essence container",
            failureOf([] { createDVPictureDescriptor(dvLabel(0x02, 0x03), 0x0103); }));
}

TEST(DVPictureDescriptor, WrappingZeroFailsValidDVEssenceContainer) {
  EXPECT_EQ("assertion failure: valid DV essence container",
            failureOf([] { createDVPictureDescriptor(dvLabel(0x02, 0x00), 0x0103); }));
}

TEST(DVPictureDescriptor, VersionOctetZeroFailsValidDVEssenceContainer) {
  KLVKey label = dvLabel(0x02, 0x01);
  label[7] = 0x00;
  EXPECT_EQ("assertion failure: valid DV essence container",
            failureOf([&] { createDVPictureDescriptor(label, 0x0103); }));
}

TEST(DVPictureDescriptor, D10LabelFailsValidDVEssenceContainer) {
  EXPECT_EQ("assertion failure: valid DV essence container",
            failureOf([] { createDVPictureDescriptor(d10Label(0x01, 0x01), 0x0103); }));
}

TEST(DVPictureDescriptor, Kind60IsValidButFailsSupportedDVEssenceContainer) {
  EXPECT_EQ("assertion failure: supported DV essence container",
            failureOf([] { createDVPictureDescriptor(dvLabel(0x60, 0x01), 0x0103); }));
}

TEST(DVPictureDescriptor, KindsWithoutADescriptorFailSupportedDVEssenceContainer) {
  for (std::uint8_t kind : {0x3F, 0x61, 0x62, 0x63, 0x7F, 0x05, 0x00})
    EXPECT_EQ("assertion failure: supported DV essence container",
              failureOf([&] { createDVPictureDescriptor(dvLabel(kind, 0x02), 0x0103); }))
        << static_cast<int>(kind);
}

TEST(DVPictureDescriptor, Lines525KeepColourSitingZeroAtAnyPrefaceVersion) {
  EXPECT_EQ(0, createDVPictureDescriptor(dvLabel(0x01, 0x01), 0x0102)->getColourSiting());
  EXPECT_EQ(0, createDVPictureDescriptor(dvLabel(0x01, 0x01), 0x0103)->getColourSiting());
}

TEST(DVPictureDescriptor, Lines625ColourSitingIsFiveFromPrefaceVersion0103And255Below) {
  EXPECT_EQ(255, createDVPictureDescriptor(dvLabel(0x02, 0x01), 0x0102)->getColourSiting());
  EXPECT_EQ(5, createDVPictureDescriptor(dvLabel(0x02, 0x01), 0x0103)->getColourSiting());
  EXPECT_EQ(5, createDVPictureDescriptor(dvLabel(0x02, 0x01), 0x0104)->getColourSiting());
}

TEST(D10PictureDescriptor, Wrapping7FIsAccepted) {
  const std::shared_ptr<CDCIPictureDescriptor> d = createD10PictureDescriptor(d10Label(0x01, 0x7F));
  ASSERT_NE(nullptr, d);
  EXPECT_EQ(304u, d->getStoredHeight());
}

TEST(D10PictureDescriptor, OtherWrappingsFailValidD10EssenceContainer) {
  for (std::uint8_t wrapping : {0x00, 0x03, 0x7E, 0xFF})
    EXPECT_EQ("assertion failure: valid D-10 essence container",
              failureOf([&] { createD10PictureDescriptor(d10Label(0x01, wrapping)); }))
        << static_cast<int>(wrapping);
}

TEST(D10PictureDescriptor, KindsOutsideOneToSixFailValidD10EssenceContainer) {
  for (std::uint8_t kind : {0x00, 0x07, 0x7F})
    EXPECT_EQ("assertion failure: valid D-10 essence container",
              failureOf([&] { createD10PictureDescriptor(d10Label(kind, 0x01)); }))
        << static_cast<int>(kind);
}

TEST(D10PictureDescriptor, VersionOctetZeroFailsValidD10EssenceContainer) {
  KLVKey label = d10Label(0x01, 0x01);
  label[7] = 0x00;
  EXPECT_EQ("assertion failure: valid D-10 essence container", failureOf([&] { createD10PictureDescriptor(label); }));
}

TEST(D10PictureDescriptor, DVLabelFailsValidD10EssenceContainer) {
  EXPECT_EQ("assertion failure: valid D-10 essence container",
            failureOf([] { createD10PictureDescriptor(dvLabel(0x01, 0x01)); }));
}

TEST(D10PictureDescriptor, ResultCodesAsACompleteSet) {
  CDCIPictureDescriptorFactory factory;
  const MXFCodedObject coded = factory.code(createD10PictureDescriptor(d10Label(0x02, 0x01)));
  EXPECT_EQ(bytesOf("00000002 00000004 00000007 0000010E"),
            coded.set.properties.at(keyOf("06 0E 2B 34 01 01 01 02 04 01 03 02 05 00 00 00")));
  EXPECT_EQ(bytesOf("00007530 000003E9"),
            coded.set.properties.at(keyOf("06 0E 2B 34 01 01 01 01 04 06 01 01 00 00 00 00")));
}
