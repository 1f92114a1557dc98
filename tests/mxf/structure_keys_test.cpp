#include <gtest/gtest.h>

#include "mxf.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

TEST(MXFPartitionPackKey, SpellsKindAndStatusInOctetsThirteenAndFourteen) {
  EXPECT_EQ("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.02.04.00",
            toString(MXFPartitionPackKey(MXFHeaderPartition, MXFClosedComplete)));
  EXPECT_EQ("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.03.01.00",
            toString(MXFPartitionPackKey(MXFBodyPartition, MXFOpenIncomplete)));
  EXPECT_EQ("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.04.02.00",
            toString(MXFPartitionPackKey(MXFFooterPartition, MXFClosedIncomplete)));
}

TEST(MXFPartitionPackKey, RefusesAKindOutsideTheFamily) {
  EXPECT_EQ("assertion failure: valid partition key",
            assertionTextOf([] { MXFPartitionPackKey(static_cast<MXFPartitionKind>(5), MXFOpenComplete); }));
}

TEST(MXFRandomIndexPackKey, IsTheRandomIndexLabel) {
  EXPECT_EQ("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.11.01.00", toString(MXFRandomIndexPackKey));
}

TEST(isMXFPartitionKey, AcceptsEveryKindAndStatus) {
  for (std::uint8_t kind = 2; kind <= 4; ++kind)
    for (std::uint8_t status = 1; status <= 4; ++status) EXPECT_TRUE(isMXFPartitionKey(partitionKey(kind, status)));
}

TEST(isMXFPartitionKey, AcceptsAnyNonZeroVersion) {
  EXPECT_TRUE(isMXFPartitionKey(partitionKey(2, 4, 0x02)));
  EXPECT_TRUE(isMXFPartitionKey(partitionKey(2, 4, 0xFF)));
}

TEST(isMXFPartitionKey, RefusesVersionZero) { EXPECT_FALSE(isMXFPartitionKey(partitionKey(3, 4, 0x00))); }

TEST(isMXFPartitionKey, RefusesKindsAndStatusesOutsideTheirRanges) {
  EXPECT_FALSE(isMXFPartitionKey(partitionKey(1, 4)));
  EXPECT_FALSE(isMXFPartitionKey(partitionKey(5, 4)));
  EXPECT_FALSE(isMXFPartitionKey(partitionKey(3, 0)));
  EXPECT_FALSE(isMXFPartitionKey(partitionKey(3, 5)));
}

TEST(isMXFPartitionKey, RefusesANonZeroLastOctet) {
  EXPECT_FALSE(isMXFPartitionKey(keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.02.04.01")));
}

TEST(isMXFPartitionKey, RefusesOtherLeadingOctets) {
  EXPECT_FALSE(isMXFPartitionKey(keyOf("06.0E.2B.34.02.53.01.01.0D.01.02.01.01.02.04.00")));
  EXPECT_FALSE(isMXFPartitionKey(keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.02.02.04.00")));
  EXPECT_FALSE(isMXFPartitionKey(randomIndexKey()));
}

TEST(isMXFRandomIndexKey, IgnoresTheVersionOctetOnly) {
  EXPECT_TRUE(isMXFRandomIndexKey(keyOf("06.0E.2B.34.02.05.01.7F.0D.01.02.01.01.11.01.00")));
  EXPECT_FALSE(isMXFRandomIndexKey(keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.11.02.00")));
  EXPECT_FALSE(isMXFRandomIndexKey(partitionKey(4, 4)));
}

TEST(getMXFPartitionKind, ReadsOctetThirteen) {
  EXPECT_EQ(MXFHeaderPartition, getMXFPartitionKind(partitionKey(2, 1)));
  EXPECT_EQ(MXFBodyPartition, getMXFPartitionKind(partitionKey(3, 1)));
  EXPECT_EQ(MXFFooterPartition, getMXFPartitionKind(partitionKey(4, 1)));
}

TEST(getMXFPartitionStatus, ReadsOctetFourteen) {
  EXPECT_EQ(MXFOpenIncomplete, getMXFPartitionStatus(partitionKey(2, 1)));
  EXPECT_EQ(MXFClosedIncomplete, getMXFPartitionStatus(partitionKey(2, 2)));
  EXPECT_EQ(MXFOpenComplete, getMXFPartitionStatus(partitionKey(2, 3)));
  EXPECT_EQ(MXFClosedComplete, getMXFPartitionStatus(partitionKey(2, 4)));
}

TEST(getMXFPartitionKind, RefusesAKeyThatIsNoPartitionKey) {
  EXPECT_EQ("assertion failure: valid partition key", assertionTextOf([] { getMXFPartitionKind(randomIndexKey()); }));
  EXPECT_EQ("assertion failure: valid partition key",
            assertionTextOf([] { getMXFPartitionStatus(partitionKey(2, 5)); }));
}
