#include <gtest/gtest.h>

#include <sstream>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::keyOf;
using zelta_test::klv::assertionOf;

TEST(KLVTagTypeOctets, AreOneTwoAndFour) {
  EXPECT_EQ(KLVTagTypeOctets(0), 1u);
  EXPECT_EQ(KLVTagTypeOctets(1), 2u);
  EXPECT_EQ(KLVTagTypeOctets(2), 4u);
}

TEST(KLVTagTypeOctets, TagTypeThreeFailsValidTagType) {
  EXPECT_EQ(assertionOf([] { KLVTagTypeOctets(3); }), "assertion failure: valid tag type");
}

TEST(KLVFixedLengthTypeOctets, AreOneTwoAndFour) {
  EXPECT_EQ(KLVFixedLengthTypeOctets(1), 1u);
  EXPECT_EQ(KLVFixedLengthTypeOctets(2), 2u);
  EXPECT_EQ(KLVFixedLengthTypeOctets(3), 4u);
}

TEST(KLVFixedLengthTypeOctets, BERAndTypeFourFailValidLengthType) {
  EXPECT_EQ(assertionOf([] { KLVFixedLengthTypeOctets(0); }), "assertion failure: valid length type");
  EXPECT_EQ(assertionOf([] { KLVFixedLengthTypeOctets(4); }), "assertion failure: valid length type");
}

TEST(KLVLengthTypeLabel, NamesEachLengthType) {
  EXPECT_STREQ(KLVLengthTypeLabel(0), "BER");
  EXPECT_STREQ(KLVLengthTypeLabel(1), "Fixed 1 byte");
  EXPECT_STREQ(KLVLengthTypeLabel(2), "Fixed 2 byte");
  EXPECT_STREQ(KLVLengthTypeLabel(3), "Fixed 4 byte");
  EXPECT_EQ(assertionOf([] { KLVLengthTypeLabel(4); }), "assertion failure: valid length type");
}

TEST(LengthFormOctets, ShortFormIsOneAndLongFormCountsItsOctets) {
  EXPECT_EQ(lengthFormOctets(0x01), 1u);
  EXPECT_EQ(lengthFormOctets(0x81), 2u);
  EXPECT_EQ(lengthFormOctets(0x83), 4u);
  EXPECT_EQ(lengthFormOctets(0x88), 9u);
}

TEST(LengthFormOctets, NoFormAndOtherShortValuesFailValidBERLengthForm) {
  EXPECT_EQ(assertionOf([] { lengthFormOctets(0x80); }), "assertion failure: valid BER length form");
  EXPECT_EQ(assertionOf([] { lengthFormOctets(0x00); }), "assertion failure: valid BER length form");
  EXPECT_EQ(assertionOf([] { lengthFormOctets(0x02); }), "assertion failure: valid BER length form");
}

TEST(LengthTypeOctets, BERFollowsTheFormAndFixedTypesTheirSize) {
  EXPECT_EQ(lengthTypeOctets(0, 0x83), 4u);
  EXPECT_EQ(lengthTypeOctets(0, 0x01), 1u);
  EXPECT_EQ(lengthTypeOctets(2, 0x83), 2u);
  EXPECT_EQ(lengthTypeOctets(3, 0x80), 4u);
}

namespace {

KLVKey groupKey(std::uint8_t octet5) {
  KLVKey key = keyOf("06 0e 2b 34 02 00 01 01 0d 01 01 01 01 01 2f 00");
  key[5] = octet5;
  return key;
}

}  // namespace

TEST(KLVLocalSetCoding, AcceptsExactlyTheTwelveCodings) {
  struct Row {
    std::uint8_t octet5;
    KLVTagType tagType;
    KLVLengthType lengthType;
  };
  const Row rows[] = {{0x03, 0, 0}, {0x13, 1, 0}, {0x1B, 2, 0}, {0x23, 0, 1}, {0x33, 1, 1}, {0x3B, 2, 1},
                      {0x43, 0, 2}, {0x53, 1, 2}, {0x5B, 2, 2}, {0x63, 0, 3}, {0x73, 1, 3}, {0x7B, 2, 3}};
  int accepted = 0;
  for (unsigned octet5 = 0; octet5 < 256; ++octet5) {
    KLVTagType tagType = 0xEE;
    KLVLengthType lengthType = 0xEE;
    if (!KLVLocalSetCoding(groupKey(static_cast<std::uint8_t>(octet5)), tagType, lengthType)) continue;
    ++accepted;
    bool listed = false;
    for (const Row& row : rows)
      if (row.octet5 == octet5) {
        listed = true;
        EXPECT_EQ(tagType, row.tagType) << octet5;
        EXPECT_EQ(lengthType, row.lengthType) << octet5;
      }
    EXPECT_TRUE(listed) << octet5;
  }
  EXPECT_EQ(accepted, 12);
}

TEST(KLVLocalSetCoding, BERTagsOfOctet0BAreRefused) {
  KLVTagType tagType = 0;
  KLVLengthType lengthType = 0;
  EXPECT_FALSE(KLVLocalSetCoding(groupKey(0x0B), tagType, lengthType));
}

TEST(KLVLocalSetCoding, KeyOutsideTheGroupFamilyFailsValidLocalSetKey) {
  KLVTagType tagType = 0;
  KLVLengthType lengthType = 0;
  const KLVKey item = keyOf("06 0e 2b 34 01 53 01 01 0d 01 01 01 01 01 2f 00");
  EXPECT_EQ(assertionOf([&] { KLVLocalSetCoding(item, tagType, lengthType); }),
            "assertion failure: valid local set key");
}

TEST(KLVLocalSetCoding, RegistryVersionIsNoPartOfTheFamily) {
  KLVKey key = groupKey(0x53);
  key[7] = 0x7F;
  KLVTagType tagType = 0;
  KLVLengthType lengthType = 0;
  EXPECT_TRUE(KLVLocalSetCoding(key, tagType, lengthType));
}

TEST(KLVVariableLengthPackCoding, MapsTheFourCodings) {
  const std::pair<std::uint8_t, KLVLengthType> rows[] = {{0x04, 0}, {0x24, 1}, {0x44, 2}, {0x64, 3}};
  for (const auto& row : rows) {
    KLVLengthType lengthType = 0xEE;
    EXPECT_TRUE(KLVVariableLengthPackCoding(groupKey(row.first), lengthType));
    EXPECT_EQ(lengthType, row.second);
  }
  KLVLengthType lengthType = 0;
  EXPECT_FALSE(KLVVariableLengthPackCoding(groupKey(0x0C), lengthType));
  EXPECT_FALSE(KLVVariableLengthPackCoding(groupKey(0x84), lengthType));
}

TEST(KLVVariableLengthPackCoding, KeyOutsideTheGroupFamilyFailsValidVariableLengthPackKey) {
  KLVLengthType lengthType = 0;
  EXPECT_EQ(assertionOf([&] {
              KLVVariableLengthPackCoding(keyOf("06 0e 2b 34 03 04 01 01 0d 01 01 01 01 01 2f 00"), lengthType);
            }),
            "assertion failure: valid variable length pack key");
}

TEST(KLVWrapperCoding, OctetOneIsAWrapperAndTwoIsNot) {
  bool isWrapper = false;
  EXPECT_TRUE(KLVWrapperCoding(keyOf("06 0e 2b 34 03 01 01 01 0d 01 01 01 01 01 01 00"), isWrapper));
  EXPECT_TRUE(isWrapper);
  EXPECT_TRUE(KLVWrapperCoding(keyOf("06 0e 2b 34 03 02 01 01 0d 01 01 01 01 01 01 00"), isWrapper));
  EXPECT_FALSE(isWrapper);
  EXPECT_FALSE(KLVWrapperCoding(keyOf("06 0e 2b 34 03 03 01 01 0d 01 01 01 01 01 01 00"), isWrapper));
}

TEST(KLVWrapperCoding, KeyOutsideTheWrapperFamilyFailsValidWrapperKey) {
  bool isWrapper = false;
  EXPECT_EQ(assertionOf([&] { KLVWrapperCoding(groupKey(0x01), isWrapper); }), "assertion failure: valid wrapper key");
}

TEST(FillItemKeyVersion, IsUnsetOnANewStream) {
  std::istringstream stream;
  EXPECT_EQ(getFillItemKeyVersion(stream), 0);
}

TEST(FillItemKeyVersion, IsKeptPerStream) {
  std::istringstream first;
  std::ostringstream second;
  setFillItemKeyVersion(first, 2);
  setFillItemKeyVersion(second, 1);
  EXPECT_EQ(getFillItemKeyVersion(first), 2);
  EXPECT_EQ(getFillItemKeyVersion(second), 1);
  setFillItemKeyVersion(first, 0);
  EXPECT_EQ(getFillItemKeyVersion(first), 0);
}

TEST(KLVFillItemKey, IsTheFillKeyOfVersionOne) {
  EXPECT_EQ(zelta_test::toString(KLVFillItemKey), "06.0E.2B.34.01.01.01.01.03.01.02.10.01.00.00.00");
}
