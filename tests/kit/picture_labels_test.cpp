#include "kit/picture_labels.h"

#include <gtest/gtest.h>

#include <string>

#include "core/failure.h"
#include "kit/kit_labels.h"

using zelta::AVCPictureKind;
using zelta::getAVCPictureCoding;
using zelta::getMPEGPictureCoding;
using zelta_test::failureOf;
using zelta_test::keyOf;
using zelta_test::octetsOf;

namespace {

const std::string compression = "06 0E 2B 34 04 01 01 ";

AVCPictureKind intraKind(std::uint32_t bitRate, std::uint32_t height, bool progressive, MXFRational rate) {
  AVCPictureKind kind;
  kind.profileConstraint = 16;
  kind.bitRate = bitRate;
  kind.displayHeight = height;
  kind.progressive = progressive;
  kind.editRate = rate;
  return kind;
}

TEST(PictureLabels, HalfSizeIs540LinesAFrameOr270AField) {
  EXPECT_TRUE(zelta::isHalfSizeHeight(540, true));
  EXPECT_TRUE(zelta::isHalfSizeHeight(270, false));
  EXPECT_FALSE(zelta::isHalfSizeHeight(540, false));
  EXPECT_FALSE(zelta::isHalfSizeHeight(1080, true));
}

TEST(PictureLabels, MPEGNormalSizeByProfileAndLevel) {
  EXPECT_EQ(getMPEGPictureCoding(68, false, false).octets(), octetsOf(compression + "03 04 01 02 02 01 03 03 00"));
  EXPECT_EQ(getMPEGPictureCoding(70, false, false).octets(), octetsOf(compression + "08 04 01 02 02 01 05 03 00"));
  EXPECT_EQ(getMPEGPictureCoding(72, false, false).octets(), octetsOf(compression + "03 04 01 02 02 01 01 11 00"));
  EXPECT_EQ(getMPEGPictureCoding(130, false, false).octets(), octetsOf(compression + "03 04 01 02 02 01 04 03 00"));
  EXPECT_EQ(getMPEGPictureCoding(133, false, false).octets(), octetsOf(compression + "03 04 01 02 02 01 02 03 00"));
}

TEST(PictureLabels, MPEGHalfSizeTakesThePrivateForms) {
  EXPECT_EQ(getMPEGPictureCoding(68, false, true).octets(), octetsOf(compression + "03 0E 06 41 02 01 03 03 01"));
  EXPECT_EQ(getMPEGPictureCoding(70, false, true).octets(), octetsOf(compression + "03 0E 06 41 02 01 05 03 01"));
  EXPECT_EQ(getMPEGPictureCoding(130, false, true).octets(), octetsOf(compression + "03 0E 06 41 02 01 04 03 01"));
  EXPECT_EQ(failureOf([] { getMPEGPictureCoding(133, false, true); }), "assertion failure: recognized profileAndLevel");
}

TEST(PictureLabels, MPEGOtherCodeFailsRecognizedProfileAndLevel) {
  EXPECT_EQ(failureOf([] { getMPEGPictureCoding(69, false, false); }), "assertion failure: recognized profileAndLevel");
  EXPECT_EQ(failureOf([] { getMPEGPictureCoding(68, true, false); }), "assertion failure: recognized profileAndLevel");
}

TEST(PictureLabels, SimpleStudioLevels) {
  const struct {
    std::uint16_t level;
    const char* label;
  } rows[] = {{225, "03 04 01 02 02 01 20 10 01"}, {226, "03 04 01 02 02 01 20 10 02"},
              {227, "03 04 01 02 02 01 20 10 03"}, {228, "03 04 01 02 02 01 20 10 04"},
              {235, "0B 04 01 02 02 01 20 10 05"}, {236, "0B 04 01 02 02 01 20 10 06"}};
  for (const auto& row : rows) {
    const KLVKey label = getMPEGPictureCoding(row.level, true, false);
    EXPECT_EQ(label.octets(), octetsOf(compression + row.label)) << row.level;
    EXPECT_TRUE(zelta::isSimpleStudioCoding(label));
  }
  EXPECT_FALSE(zelta::isSimpleStudioCoding(getMPEGPictureCoding(130, false, false)));
  EXPECT_FALSE(zelta::isSimpleStudioCoding(keyOf(compression + "03 04 01 02 02 01 20 10 07")));
}

TEST(PictureLabels, AVCByProfileNotIntra) {
  const struct {
    std::uint8_t profile;
    const char* label;
  } rows[] = {{44, "0D 04 01 02 02 01 32 50 01"},  {66, "0D 04 01 02 02 01 31 10 01"},
              {77, "0D 04 01 02 02 01 31 20 01"},  {88, "0D 04 01 02 02 01 31 30 01"},
              {100, "0D 04 01 02 02 01 31 40 01"}, {110, "0D 04 01 02 02 01 31 50 01"},
              {122, "0D 04 01 02 02 01 31 60 01"}, {244, "0D 04 01 02 02 01 31 70 01"}};
  for (const auto& row : rows)
    EXPECT_EQ(getAVCPictureCoding(row.profile, AVCPictureKind()).octets(), octetsOf(compression + row.label))
        << int(row.profile);
}

TEST(PictureLabels, AVCByProfileIntra) {
  const AVCPictureKind intra = intraKind(0, 0, true, {25, 1});
  const struct {
    std::uint8_t profile;
    const char* label;
  } rows[] = {{44, "0D 04 01 02 02 01 32 50 01"},  {66, "0D 04 01 02 02 01 31 10 01"},
              {77, "0D 04 01 02 02 01 31 20 01"},  {88, "0D 04 01 02 02 01 31 30 01"},
              {100, "0D 04 01 02 02 01 31 40 01"}, {110, "0A 04 01 02 02 01 32 20 01"},
              {122, "0A 04 01 02 02 01 32 30 01"}, {244, "0D 04 01 02 02 01 32 40 01"}};
  for (const auto& row : rows)
    EXPECT_EQ(getAVCPictureCoding(row.profile, intra).octets(), octetsOf(compression + row.label)) << int(row.profile);
}

TEST(PictureLabels, AVCOtherProfileFailsRecognizedProfileAndLevel) {
  EXPECT_EQ(failureOf([] { getAVCPictureCoding(118, AVCPictureKind()); }),
            "assertion failure: recognized profileAndLevel");
}

TEST(PictureLabels, AVCClassLabelsOfProfile110) {
  const struct {
    std::uint32_t height;
    bool progressive;
    MXFRational rate;
    const char* tail;
  } rows[] = {{540, false, {30000, 1001}, "32 21 01"},  {540, false, {25, 1}, "32 21 02"},
              {1080, true, {24000, 1001}, "32 21 03"},  {1080, true, {30000, 1001}, "32 21 03"},
              {1080, false, {60000, 1001}, "32 21 03"}, {1080, true, {25, 1}, "32 21 04"},
              {1080, true, {50, 1}, "32 21 04"},        {720, true, {60000, 1001}, "32 21 08"},
              {720, true, {50, 1}, "32 21 09"}};
  for (const auto& row : rows) {
    const KLVKey label = getAVCPictureCoding(110, intraKind(50000000, row.height, row.progressive, row.rate));
    EXPECT_EQ(label.octets(), octetsOf(compression + "0A 04 01 02 02 01 " + row.tail)) << row.tail;
  }
}

TEST(PictureLabels, AVCClassLabelsOfProfile122) {
  EXPECT_EQ(getAVCPictureCoding(122, intraKind(90000000, 540, false, {25, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 31 02"));
  EXPECT_EQ(getAVCPictureCoding(122, intraKind(115000000, 720, true, {50, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 31 09"));
}

TEST(PictureLabels, AVCClassNeedsItsBitRateWindow) {
  EXPECT_EQ(getAVCPictureCoding(110, intraKind(45000000, 540, false, {25, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 21 02"));
  EXPECT_EQ(getAVCPictureCoding(110, intraKind(55000000, 540, false, {25, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 21 02"));
  EXPECT_EQ(getAVCPictureCoding(110, intraKind(44999999, 540, false, {25, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 20 01"));
  EXPECT_EQ(getAVCPictureCoding(110, intraKind(55000001, 540, false, {25, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 20 01"));
  EXPECT_EQ(getAVCPictureCoding(122, intraKind(50000000, 540, false, {25, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 30 01"));
}

TEST(PictureLabels, AVCClassNeedsItsSizeRateAndLayout) {
  EXPECT_EQ(getAVCPictureCoding(110, intraKind(50000000, 540, true, {25, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 20 01"));
  EXPECT_EQ(getAVCPictureCoding(110, intraKind(50000000, 720, false, {50, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 20 01"));
  EXPECT_EQ(getAVCPictureCoding(110, intraKind(50000000, 1080, true, {24, 1})).octets(),
            octetsOf(compression + "0A 04 01 02 02 01 32 20 01"));
}

TEST(PictureLabels, AVCLabelsGiveBackProfileConstraintAndBitRateClass) {
  const auto plain = zelta::getAVCCoding(keyOf(compression + "0D 04 01 02 02 01 31 50 01"));
  ASSERT_TRUE(plain.has_value());
  EXPECT_EQ(plain->profile, 110);
  EXPECT_EQ(plain->profileConstraint, 0);
  EXPECT_EQ(plain->bitRateClass, 0u);
  const auto intra = zelta::getAVCCoding(keyOf(compression + "0A 04 01 02 02 01 32 40 01"));
  ASSERT_TRUE(intra.has_value());
  EXPECT_EQ(intra->profile, 244);
  EXPECT_EQ(intra->profileConstraint, 16);
  const auto class50 = zelta::getAVCCoding(keyOf(compression + "0A 04 01 02 02 01 32 21 08"));
  ASSERT_TRUE(class50.has_value());
  EXPECT_EQ(class50->profile, 110);
  EXPECT_EQ(class50->profileConstraint, 16);
  EXPECT_EQ(class50->bitRateClass, 50000000u);
  const auto class100 = zelta::getAVCCoding(keyOf(compression + "0A 04 01 02 02 01 32 31 03"));
  ASSERT_TRUE(class100.has_value());
  EXPECT_EQ(class100->profile, 122);
  EXPECT_EQ(class100->bitRateClass, 100000000u);
  const auto shared = zelta::getAVCCoding(keyOf(compression + "0D 04 01 02 02 01 31 10 01"));
  ASSERT_TRUE(shared.has_value());
  EXPECT_EQ(shared->profile, 66);
  EXPECT_EQ(shared->profileConstraint, 0);
  EXPECT_FALSE(zelta::getAVCCoding(keyOf(compression + "0A 04 01 02 02 01 32 21 05")).has_value());
}

TEST(PictureLabels, RawCodesBothWays) {
  const struct {
    std::uint16_t code;
    const char* tail;
  } rows[] = {{785, "03 01 01"}, {786, "03 01 02"}, {801, "03 02 01"}, {802, "03 02 02"},  {817, "03 03 01"},
              {818, "03 03 02"}, {833, "03 04 01"}, {834, "03 04 02"}, {1057, "04 02 01"}, {1073, "04 03 01"}};
  for (const auto& row : rows) {
    const KLVKey label = zelta::getRawPictureCoding(row.code);
    EXPECT_EQ(label.octets(), octetsOf(compression + "06 0E 06 04 01 02 " + row.tail)) << row.code;
    EXPECT_EQ(zelta::getRawCode(label), row.code);
  }
}

TEST(PictureLabels, RawCodeZeroIs801) {
  EXPECT_EQ(zelta::getRawPictureCoding(0).octets(), octetsOf(compression + "06 0E 06 04 01 02 03 02 01"));
}

TEST(PictureLabels, RawUnknownCodeOrLabelFailsRecognizedProfileAndLevel) {
  EXPECT_EQ(failureOf([] { zelta::getRawPictureCoding(800); }), "assertion failure: recognized profileAndLevel");
  EXPECT_EQ(failureOf([] { zelta::getRawCode(keyOf(compression + "06 0E 06 04 01 02 03 05 01")); }),
            "assertion failure: recognized profileAndLevel");
}

}  // namespace
