#include <gtest/gtest.h>

#include "mxf.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

MXFPartitionPack everyFieldSet() {
  MXFPartitionPack pack;
  pack.majorVersion = 0x0102;
  pack.minorVersion = 0x0304;
  pack.kagSize = 0x05060708;
  pack.thisPartition = 0x1112131415161718;
  pack.previousPartition = 0x2122232425262728;
  pack.footerPartition = 0x3132333435363738;
  pack.headerByteCount = 0x4142434445464748;
  pack.indexByteCount = 0x5152535455565758;
  pack.indexSID = 0x61626364;
  pack.bodyOffset = 0x7172737475767778;
  pack.bodySID = 0x81828384;
  pack.operationalPattern = keyOf("06.0E.2B.34.04.01.01.01.0D.01.02.01.01.01.09.00");
  pack.essenceContainers = {keyOf("06.0E.2B.34.04.01.01.02.0D.01.03.01.02.01.01.01"),
                            keyOf("06.0E.2B.34.04.01.01.03.0D.01.03.01.02.06.01.00")};
  return pack;
}

}  // namespace

TEST(MXFPartitionPack, DefaultsAreVersionOneTwoAndZeros) {
  MXFPartitionPack pack;
  ByteVector expected = bytesOf("0001 0002");
  expected.resize(80 + 4, 0);
  ByteVector itemSize = bytesOf("00000010");
  expected.insert(expected.end(), itemSize.begin(), itemSize.end());
  ByteVector written;
  externalize(written, pack, true);
  EXPECT_EQ(expected, written);
}

TEST(MXFPartitionPack, InternalizeReadsEveryFieldAndSkipsTheExcessOfItemSizeTwenty) {
  MXFPartitionPack read;
  internalize(packValue(everyFieldSet(), 20), read);
  EXPECT_EQ(0x0102, read.majorVersion);
  EXPECT_EQ(0x0304, read.minorVersion);
  EXPECT_EQ(0x05060708u, read.kagSize);
  EXPECT_EQ(0x1112131415161718u, read.thisPartition);
  EXPECT_EQ(0x2122232425262728u, read.previousPartition);
  EXPECT_EQ(0x3132333435363738u, read.footerPartition);
  EXPECT_EQ(0x4142434445464748u, read.headerByteCount);
  EXPECT_EQ(0x5152535455565758u, read.indexByteCount);
  EXPECT_EQ(0x61626364u, read.indexSID);
  EXPECT_EQ(0x7172737475767778u, read.bodyOffset);
  EXPECT_EQ(0x81828384u, read.bodySID);
  EXPECT_EQ("06.0E.2B.34.04.01.01.01.0D.01.02.01.01.01.09.00", toString(read.operationalPattern));
  ASSERT_EQ(2u, read.essenceContainers.size());
  EXPECT_EQ("06.0E.2B.34.04.01.01.02.0D.01.03.01.02.01.01.01", toString(read.essenceContainers[0]));
  EXPECT_EQ("06.0E.2B.34.04.01.01.03.0D.01.03.01.02.06.01.00", toString(read.essenceContainers[1]));
  EXPECT_TRUE(read == everyFieldSet());
}

TEST(MXFPartitionPack, ExternalizeWritesItemSizeSixteen) {
  ByteVector written;
  externalize(written, everyFieldSet(), true);
  EXPECT_EQ(packValue(everyFieldSet(), 16), written);
  ByteVector head(written.begin(), written.begin() + 24);
  EXPECT_EQ(bytesOf("0102 0304 05060708 1112131415161718 2122232425262728"), head);
  ByteVector batchHeader(written.begin() + 80, written.begin() + 88);
  EXPECT_EQ(bytesOf("00000002 00000010"), batchHeader);
}

TEST(MXFPartitionPack, RoundTripFromItemSizeTwentyKeepsEveryField) {
  MXFPartitionPack read;
  internalize(packValue(everyFieldSet(), 20), read);
  ByteVector written;
  externalize(written, read, true);
  MXFPartitionPack again;
  internalize(written, again);
  EXPECT_TRUE(again == everyFieldSet());
  EXPECT_EQ(88u + 2 * 16, written.size());
}

TEST(MXFPartitionPack, EqualityLooksAtEveryField) {
  MXFPartitionPack base = everyFieldSet();
  std::vector<void (*)(MXFPartitionPack&)> changes = {
      [](MXFPartitionPack& p) { p.majorVersion++; },      [](MXFPartitionPack& p) { p.minorVersion++; },
      [](MXFPartitionPack& p) { p.kagSize++; },           [](MXFPartitionPack& p) { p.thisPartition++; },
      [](MXFPartitionPack& p) { p.previousPartition++; }, [](MXFPartitionPack& p) { p.footerPartition++; },
      [](MXFPartitionPack& p) { p.headerByteCount++; },   [](MXFPartitionPack& p) { p.indexByteCount++; },
      [](MXFPartitionPack& p) { p.indexSID++; },          [](MXFPartitionPack& p) { p.bodyOffset++; },
      [](MXFPartitionPack& p) { p.bodySID++; },           [](MXFPartitionPack& p) { p.operationalPattern[15]++; },
      [](MXFPartitionPack& p) { p.essenceContainers.pop_back(); }};
  for (auto change : changes) {
    MXFPartitionPack other = base;
    change(other);
    EXPECT_FALSE(other == base);
    EXPECT_TRUE(other != base);
  }
}

TEST(MXFPartitionPack, EqualityIgnoresTheVersionOctetOfLabels) {
  MXFPartitionPack a = everyFieldSet();
  MXFPartitionPack b = a;
  b.operationalPattern[7] = 0x7F;
  EXPECT_TRUE(a == b);
}

TEST(MXFPartitionPack, LeftoverOctetsFailValidExternalLength) {
  ByteVector value = packValue(everyFieldSet());
  value.push_back(0);
  MXFPartitionPack read;
  EXPECT_EQ("assertion failure: valid external length", assertionTextOf([&] { internalize(value, read); }));
}

TEST(MXFPartitionPack, ShortValueFailsSuccessfulGet) {
  ByteVector value = packValue(everyFieldSet());
  value.resize(40);
  MXFPartitionPack read;
  EXPECT_EQ("assertion failure: successful get()", assertionTextOf([&] { internalize(value, read); }));
}

TEST(MXFPartitionPack, ItemSizeBelowSixteenFailsValidExternalLength) {
  ByteVector value = packValue(everyFieldSet());
  value[87] = 15;
  MXFPartitionPack read;
  EXPECT_EQ("assertion failure: valid external length", assertionTextOf([&] { internalize(value, read); }));
}
