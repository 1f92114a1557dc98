#include <gtest/gtest.h>

#include <iomanip>
#include <locale>
#include <map>
#include <sstream>

#include "klv.h"
#include "mxf.h"
#include "support/recording.h"

using zelta_test::keyOf;
using zelta_test::toString;

namespace {

const char* const pictureKey = "06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00";

}  // namespace

TEST(KLVKey, KeysDifferingOnlyInOctet7AreEqual) {
  KLVKey a = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00");
  KLVKey b = keyOf("06.0E.2B.34.01.02.01.0A.0D.01.03.01.15.01.05.00");
  EXPECT_TRUE(a == b);
  EXPECT_FALSE(a != b);
  EXPECT_FALSE(a < b);
  EXPECT_FALSE(b < a);
}

TEST(KLVKey, KeysDifferingOnlyInOctet7AreOneMapEntry) {
  std::map<KLVKey, int> entries;
  entries[keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00")] = 1;
  entries[keyOf("06.0E.2B.34.01.02.01.0A.0D.01.03.01.15.01.05.00")] = 2;
  ASSERT_EQ(entries.size(), 1u);
  EXPECT_EQ(entries.begin()->second, 2);
}

TEST(KLVKey, KeysDifferingInAnyOtherOctetAreUnequal) {
  KLVKey base = keyOf(pictureKey);
  for (std::size_t i = 0; i < 16; ++i) {
    if (i == 7) continue;
    KLVKey other = base;
    other[i] = static_cast<std::uint8_t>(other[i] ^ 0x40);
    EXPECT_FALSE(base == other) << "octet " << i;
    EXPECT_TRUE(base < other || other < base) << "octet " << i;
  }
}

TEST(KLVKey, OrderIgnoresOctet7) {
  // Octet 7 would put a first; the order looks past it at octet 8.
  KLVKey a = keyOf("06.0E.2B.34.01.02.01.FF.0D.01.03.01.15.01.05.00");
  KLVKey b = keyOf("06.0E.2B.34.01.02.01.00.0E.01.03.01.15.01.05.00");
  EXPECT_TRUE(a < b);
  EXPECT_FALSE(b < a);
  EXPECT_TRUE(b > a);
  EXPECT_TRUE(a <= b);
  EXPECT_TRUE(b >= a);
}

TEST(KLVKey, OrderComparesOctetsAsUnsignedBytes) {
  KLVKey low = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.7F");
  KLVKey high = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.80");
  EXPECT_TRUE(low < high);
  KLVKey earlyLow = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.80");
  KLVKey earlyHigh = keyOf("86.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00");
  EXPECT_TRUE(earlyLow < earlyHigh);
}

TEST(KLVKey, MapOrderFollowsKeyOrder) {
  std::map<KLVKey, int> entries;
  entries[keyOf("06.0E.2B.34.01.02.01.09.0D.01.03.01.15.01.05.02")] = 2;
  entries[keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.03")] = 3;
  entries[keyOf("06.0E.2B.34.01.02.01.05.0D.01.03.01.15.01.05.01")] = 1;
  std::vector<int> order;
  for (const auto& entry : entries) order.push_back(entry.second);
  EXPECT_EQ(order, (std::vector<int>{1, 2, 3}));
}

TEST(KLVKey, PrintsSixteenUppercaseOctetsJoinedByDots) {
  std::ostringstream out;
  out << keyOf("06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00");
  EXPECT_EQ(out.str(), "06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00");
}

TEST(KLVKey, PrintingRestoresFlagsAndFill) {
  std::ostringstream out;
  out << std::dec << std::nouppercase << std::setfill('*');
  std::ios_base::fmtflags before = out.flags();
  out << keyOf(pictureKey);
  EXPECT_EQ(out.flags(), before);
  EXPECT_EQ(out.fill(), '*');
  out.str("");
  out << std::setw(5) << 171;
  EXPECT_EQ(out.str(), "**171");
}

TEST(KLVKey, PrintingUnderHexAndLeftFlagsStillPadsWithZeros) {
  std::ostringstream out;
  out << std::hex << std::left << std::setfill(' ');
  out << keyOf("00 01 02 03 04 05 06 07 08 09 0A 0B 0C 0D 0E 0F");
  EXPECT_EQ(out.str(), "00.01.02.03.04.05.06.07.08.09.0A.0B.0C.0D.0E.0F");
  out.str("");
  out << 171;
  EXPECT_EQ(out.str(), "ab");
}

TEST(KLVKey, PrintingUnderShowbaseUppercaseWidthAndFillKeepsItsForm) {
  std::ostringstream out;
  out << std::hex << std::showbase << std::nouppercase << std::showpos << std::internal << std::setfill('#');
  const std::ios_base::fmtflags before = out.flags();
  out << std::setw(60) << keyOf(pictureKey);
  EXPECT_EQ(out.str(), pictureKey);
  EXPECT_EQ(out.flags(), before);
  EXPECT_EQ(out.fill(), '#');
  EXPECT_EQ(out.width(), 0);
}

TEST(KLVKey, PrintingUnderAGroupingLocaleKeepsItsForm) {
  struct Grouping : std::numpunct<char> {
    char do_thousands_sep() const override { return ','; }
    std::string do_grouping() const override { return "\1"; }
  };
  std::ostringstream out;
  out.imbue(std::locale(out.getloc(), new Grouping));
  out << keyOf(pictureKey);
  EXPECT_EQ(out.str(), pictureKey);
}

TEST(KLVKey, DefaultIsAllZeros) { EXPECT_EQ(toString(KLVKey()), "00.00.00.00.00.00.00.00.00.00.00.00.00.00.00.00"); }

TEST(KLVKeyPattern, ZeroOctetsOfPatternAreWildcards) {
  KLVKeyPattern pattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02});
  EXPECT_TRUE(pattern.matches(keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.11.01.00")));
  EXPECT_TRUE(pattern.matches(keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.2F.00")));
  EXPECT_TRUE(pattern.matches(keyOf("06.0E.2B.34.02.00.00.00.00.00.00.00.00.00.00.00")));
}

TEST(KLVKeyPattern, PatternRequiresItsNonZeroOctets) {
  KLVKeyPattern pattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02});
  EXPECT_FALSE(pattern.matches(keyOf("06.0E.2B.34.01.01.01.01.03.01.02.10.01.00.00.00")));
  EXPECT_FALSE(pattern.matches(keyOf("06.0E.2B.35.02.05.01.01.0D.01.02.01.01.11.01.00")));
  EXPECT_FALSE(pattern.matches(keyOf("07.0E.2B.34.02.05.01.01.0D.01.02.01.01.11.01.00")));
}

TEST(KLVKeyPattern, MaskIsFullForNonZeroOctetsAndEmptyForOctet7) {
  KLVKeyPattern pattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x00, 0x01, 0x01, 0x0D, 0x00, 0x00,
                                                     0x00, 0x00, 0x00, 0x00, 0x05});
  std::array<std::uint8_t, 16> expected{0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0x00, 0xFF, 0x00,
                                        0xFF, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0xFF};
  EXPECT_EQ(pattern.mask(), expected);
}

TEST(KLVKeyPattern, Octet7NeverTakesPart) {
  KLVKeyPattern pattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x05, 0x01, 0x01, 0x0D});
  EXPECT_TRUE(pattern.matches(keyOf("06.0E.2B.34.02.05.01.7F.0D.01.02.01.01.11.01.00")));
}

TEST(KLVKeyPattern, HandMaskNarrowsAFamily) {
  KLVKeyPattern wide(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02});
  KLVKeyPattern narrow = wide.withMask(15, 0xFF);
  KLVKey key = keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.11.01.01");
  EXPECT_TRUE(wide.matches(key));
  EXPECT_FALSE(narrow.matches(key));
  EXPECT_TRUE(narrow.matches(keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.11.01.00")));
}

TEST(MXFUID, EqualityAndOrderUseAllSixteenOctets) {
  MXFUID a(std::array<std::uint8_t, 16>{0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15});
  MXFUID b = a;
  EXPECT_TRUE(a == b);
  b[7] = 0x70;
  EXPECT_TRUE(a != b);
  EXPECT_TRUE(a < b);
  EXPECT_FALSE(b < a);
}

TEST(ErrorIdentifiers, StreamFailureIdOctets) {
  MXFUID expected(std::array<std::uint8_t, 16>{0x4C, 0x4A, 0x00, 0x01, 0x95, 0xD8, 0x11, 0xE1, 0xBB, 0xB2, 0x10, 0x9A,
                                               0xDD, 0x4A, 0xC6, 0x8C});
  EXPECT_EQ(streamFailureId, expected);
}

TEST(ErrorIdentifiers, NamedIdentifiersHaveTheirHeadsAndTheFixedTail) {
  struct Named {
    MXFUID id;
    const char* head;
  };
  const Named named[] = {
      {streamFailureId, "4C 4A 00 01"},
      {klvCodingErrorId, "4C 4B 00 01"},
      {berLengthErrorId, "4C 4B 00 02"},
      {klvLengthErrorId, "4C 4B 00 03"},
      {fillItemKeyVersionId, "4C 4B 00 04"},
      {unexpectedElementId, "4C 4C 00 01"},
      {runInErrorId, "4C 4C 00 02"},
      {randomIndexMissingId, "4C 4C 00 03"},
      {headerByteCountKagId, "4C 4C 00 04"},
      {indexByteCountKagId, "4C 4C 00 05"},
      {randomIndexValueId, "4C 4C 00 06"},
      {partitionByteCountId, "4C 4C 01 01"},
      {partitionValueId, "4C 4C 01 02"},
      {partitionVersionErrorId, "4C 4C 02 01"},
      {partitionVersionRangeId, "4C 4C 02 02"},
  };
  for (const Named& n : named) {
    ByteVector expected = zelta_test::bytesOf(std::string(n.head) + " 95 D8 11 E1 BB B2 10 9A DD 4A C6 8C");
    EXPECT_EQ(ByteVector(n.id.data(), n.id.data() + 16), expected) << n.head;
  }
}

TEST(ErrorIdentifiers, FamilyRootsHaveCodeZero) {
  const MXFUID roots[] = {streamFamilyId, klvFamilyId,   structureFamilyId,    genericContainerFamilyId,
                          sdticpFamilyId, modelFamilyId, kitValidatorFamilyId, proxySystemFamilyId};
  std::uint8_t family = 0x4A;
  for (const MXFUID& root : roots) {
    ByteVector expected = zelta_test::bytesOf("4C 00 00 00 95 D8 11 E1 BB B2 10 9A DD 4A C6 8C");
    expected[1] = family++;
    EXPECT_EQ(ByteVector(root.data(), root.data() + 16), expected);
  }
}
