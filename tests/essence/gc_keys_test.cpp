// Which keys are system elements, essence elements and which kind of
// essence element.
#include <gtest/gtest.h>

#include "mxf.h"
#include "support/recording.h"

using zelta_test::keyOf;

namespace {

KLVKey withOctet(KLVKey key, std::size_t index, std::uint8_t octet) {
  key[index] = octet;
  return key;
}

const KLVKey systemKey = keyOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00");
const KLVKey essenceKey = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00");

}  // namespace

TEST(GCKeys, SystemKeyHasOctet12Of0x14Or0x04) {
  EXPECT_TRUE(isMXFGCSystemKey(withOctet(systemKey, 12, 0x14)));
  EXPECT_TRUE(isMXFGCSystemKey(withOctet(systemKey, 12, 0x04)));
  EXPECT_FALSE(isMXFGCSystemKey(withOctet(systemKey, 12, 0x15)));
  EXPECT_FALSE(isMXFGCSystemKey(withOctet(systemKey, 12, 0x24)));
}

TEST(GCKeys, SystemKeyLeavesTheCodingOctet5AndTheVersionFree) {
  for (std::uint8_t coding : {0x00, 0x04, 0x05, 0x13, 0x53, 0x63, 0xFF})
    EXPECT_TRUE(isMXFGCSystemKey(withOctet(systemKey, 5, coding))) << int(coding);
  EXPECT_TRUE(isMXFGCSystemKey(withOctet(systemKey, 7, 0x7F)));
  EXPECT_TRUE(isMXFGCSystemKey(withOctet(withOctet(systemKey, 13, 0x00), 15, 0xFF)));
}

TEST(GCKeys, SystemKeyNeedsTheGroupCodingAndTheContainerOctets) {
  EXPECT_FALSE(isMXFGCSystemKey(withOctet(systemKey, 4, 0x01)));
  EXPECT_FALSE(isMXFGCSystemKey(withOctet(systemKey, 10, 0x02)));
  EXPECT_FALSE(isMXFGCSystemKey(withOctet(systemKey, 0, 0x07)));
}

TEST(GCKeys, EssenceKeyNeedsOctet5Of0x02AndNothingOfOctet12) {
  EXPECT_TRUE(isMXFGCEssenceKey(essenceKey));
  EXPECT_TRUE(isMXFGCEssenceKey(withOctet(essenceKey, 12, 0x19)));
  EXPECT_TRUE(isMXFGCEssenceKey(withOctet(essenceKey, 12, 0x00)));
  EXPECT_TRUE(isMXFGCEssenceKey(withOctet(essenceKey, 7, 0x0A)));
  EXPECT_FALSE(isMXFGCEssenceKey(withOctet(essenceKey, 5, 0x01)));
  EXPECT_FALSE(isMXFGCEssenceKey(withOctet(essenceKey, 4, 0x02)));
  EXPECT_FALSE(isMXFGCEssenceKey(systemKey));
}

TEST(GCKeys, KindsByOctet12) {
  EXPECT_TRUE(isMXFGCPictureKey(withOctet(essenceKey, 12, 0x15)));
  EXPECT_TRUE(isMXFGCPictureKey(withOctet(essenceKey, 12, 0x05)));
  EXPECT_TRUE(isMXFGCSoundKey(withOctet(essenceKey, 12, 0x16)));
  EXPECT_TRUE(isMXFGCSoundKey(withOctet(essenceKey, 12, 0x06)));
  EXPECT_TRUE(isMXFGCDataKey(withOctet(essenceKey, 12, 0x17)));
  EXPECT_TRUE(isMXFGCDataKey(withOctet(essenceKey, 12, 0x07)));
  EXPECT_TRUE(isMXFGCCompoundKey(withOctet(essenceKey, 12, 0x18)));
}

TEST(GCKeys, CompoundHasNoOlderOctet0x08) {
  EXPECT_FALSE(isMXFGCCompoundKey(withOctet(essenceKey, 12, 0x08)));
}

TEST(GCKeys, EachKindIsOnlyItself) {
  const KLVKey sound = withOctet(essenceKey, 12, 0x16);
  EXPECT_FALSE(isMXFGCPictureKey(sound));
  EXPECT_FALSE(isMXFGCDataKey(sound));
  EXPECT_FALSE(isMXFGCCompoundKey(sound));
  EXPECT_FALSE(isMXFGCSoundKey(withOctet(essenceKey, 12, 0x14)));
}

TEST(GCKeys, KindsNeedTheEssenceFamily) {
  EXPECT_FALSE(isMXFGCPictureKey(withOctet(essenceKey, 5, 0x01)));
  EXPECT_FALSE(isMXFGCSoundKey(withOctet(withOctet(systemKey, 12, 0x16), 5, 0x02)));
}

TEST(GCKeys, PatternMasksFreeOctet7AndTheZeroOctets) {
  const std::array<std::uint8_t, 16> systemMask{0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0x00, 0xFF, 0x00,
                                                0xFF, 0xFF, 0xFF, 0xFF, 0x00, 0x00, 0x00, 0x00};
  const std::array<std::uint8_t, 16> essenceMask{0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0x00,
                                                 0xFF, 0xFF, 0xFF, 0xFF, 0x00, 0x00, 0x00, 0x00};
  EXPECT_EQ(MXFGCSystemElementPattern.mask(), systemMask);
  EXPECT_EQ(MXFGCEssenceElementPattern.mask(), essenceMask);
}

TEST(GCKeys, SplitterAnswersByThePatterns) {
  MXFGCSplitter splitter;
  EXPECT_TRUE(splitter.isSystemKey(systemKey));
  EXPECT_TRUE(splitter.isEssenceKey(essenceKey));
  EXPECT_TRUE(splitter.isPictureKey(essenceKey));
  EXPECT_TRUE(splitter.isSoundKey(withOctet(essenceKey, 12, 0x06)));
  EXPECT_TRUE(splitter.isDataKey(withOctet(essenceKey, 12, 0x07)));
  EXPECT_TRUE(splitter.isCompoundKey(withOctet(essenceKey, 12, 0x18)));
  EXPECT_FALSE(splitter.isSystemKey(essenceKey));
  EXPECT_FALSE(splitter.isEssenceKey(systemKey));
}
