// Index table segments written by MXFIndexCoder, checked octet by octet.
#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "mxf.h"
#include "support/mxf_index_segments.h"
#include "support/mxf_streams.h"

using namespace zelta_test;

namespace {

MXFIndexTableSegment constantSizeSegment() {
  MXFIndexTableSegment segment;
  segment.instanceUID = MXFUID(std::array<std::uint8_t, 16>{0xA0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15});
  segment.indexEditRate = MXFRational{25, 1};
  segment.indexDuration = 6;
  segment.editUnitByteCount = 0x250BC;
  segment.indexSID = 1;
  segment.bodySID = 2;
  return segment;
}

// Key, four-octet length, then for each item tag, two-octet length, value.
const char* const constantSizeSegmentOctets =
    "06 0E 2B 34 02 53 01 01 0D 01 02 01 01 10 01 00 83 00 00 61 "
    "3C 0A 00 10 A0 01 02 03 04 05 06 07 08 09 0A 0B 0C 0D 0E 0F "
    "3F 0B 00 08 00 00 00 19 00 00 00 01 "
    "3F 0C 00 08 00 00 00 00 00 00 00 00 "
    "3F 0D 00 08 00 00 00 00 00 00 00 06 "
    "3F 05 00 04 00 02 50 BC "
    "3F 06 00 04 00 00 00 01 "
    "3F 07 00 04 00 00 00 02 "
    "3F 08 00 01 00 "
    "3F 0A 00 08 00 00 00 00 00 00 00 00";

MXFUID codedInstanceUID(const ByteVector& bytes) {
  IndexRun run;
  parseIndex(bytes, run);
  return run.index.segments.at(0).instanceUID;
}

}  // namespace

TEST(MXFIndexCoder, ConstantSizeTableWritesEmptyArrayWithCountAndLengthZero) {
  EXPECT_EQ(codeIndex({constantSizeSegment()}, 512), bytesOf(constantSizeSegmentOctets));
}

TEST(MXFIndexCoder, EmptyArrayEntryLengthIsZeroAndEntriesTakeTheFirstShape) {
  MXFIndexTableSegment segment = sampleSegment();
  const ByteVector bytes = codeIndex({segment}, 512);
  // Three entries of 11 + 2 x 4 octets.
  const ByteVector batch = bytesOf("00 00 00 03 00 00 00 13");
  EXPECT_NE(std::search(bytes.begin(), bytes.end(), batch.begin(), batch.end()), bytes.end());
  segment.indexEntryArray[1].sliceOffsets.push_back(7);
  EXPECT_EQ(assertionTextOf([&] { codeIndex({segment}, 512); }), "assertion failure: valid entry externalize()");
}

TEST(MXFIndexCoder, ZeroInstanceUIDGetsADifferentIdentifierEachTime) {
  MXFIndexTableSegment segment = constantSizeSegment();
  segment.instanceUID = MXFUID();
  const MXFUID first = codedInstanceUID(codeIndex({segment}, 512));
  const MXFUID second = codedInstanceUID(codeIndex({segment}, 512));
  EXPECT_NE(first, MXFUID());
  EXPECT_NE(second, MXFUID());
  EXPECT_NE(first, second);
  EXPECT_EQ(segment.instanceUID, MXFUID());
}

TEST(MXFIndexCoder, SingleSegmentIsFollowedByNoFill) {
  EXPECT_EQ(codeIndex({constantSizeSegment()}, 512).size(), bytesOf(constantSizeSegmentOctets).size());
}

TEST(MXFIndexCoder, EachSegmentButTheLastIsFilledToTheKag) {
  const ByteVector bytes = codeIndex({constantSizeSegment(), constantSizeSegment()}, 256);
  const ByteVector one = bytesOf(constantSizeSegmentOctets);
  ASSERT_EQ(bytes.size(), 256 + one.size());
  EXPECT_EQ(ByteVector(bytes.begin(), bytes.begin() + one.size()), one);
  // The fill: 256 - 117 - 20 octets of zeros under a four-octet length.
  EXPECT_EQ(ByteVector(bytes.begin() + one.size(), bytes.begin() + one.size() + 20),
            bytesOf("06 0E 2B 34 01 01 01 01 03 01 02 10 01 00 00 00 83 00 00 77"));
  EXPECT_EQ(ByteVector(bytes.begin() + 256, bytes.end()), one);
}

TEST(MXFIndexCoder, OptionalPropertiesFollowTheTableOrder) {
  MXFIndexTableSegment segment = constantSizeSegment();
  segment.posTableCount = 1;
  segment.deltaEntryArray = {{-1, 0, 0x200}};
  segment.editUnitByteCount = 0;
  segment.indexEntryArray = {{0, 0, 0x80, 0, {}, {{1, 2}}}};
  const ByteVector bytes = codeIndex({segment}, 512);
  const ByteVector tail = bytesOf(
      "3F 08 00 01 00 "
      "3F 0E 00 01 01 "
      "3F 09 00 0E 00 00 00 01 00 00 00 06 FF 00 00 00 02 00 "
      "3F 0A 00 1B 00 00 00 01 00 00 00 13 00 00 80 00 00 00 00 00 00 00 00 00 00 00 01 00 00 00 02");
  ASSERT_GE(bytes.size(), tail.size());
  EXPECT_EQ(ByteVector(bytes.end() - tail.size(), bytes.end()), tail);
}

TEST(MXFIndexCoder, SegmentOutsideAnIndexFailsAndStartTwiceFails) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFIndexCoder coder(&writer);
  EXPECT_TRUE(coder.codesAllIndexProperties());
  EXPECT_EQ(assertionTextOf([&] { coder.indexTableSegment(constantSizeSegment()); }),
            "assertion failure: before index table segment");
  coder.startIndex();
  EXPECT_EQ(assertionTextOf([&] { coder.startIndex(); }), "assertion failure: before start");
}

TEST(MXFIndexCoder, CanBeRestartedAfterEndIndex) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFIndexCoder coder(&writer);
  for (int round = 0; round < 2; ++round) {
    coder.startIndex();
    coder.indexTableSegment(constantSizeSegment());
    coder.endIndex();
  }
  EXPECT_EQ(out.str().size(), 2 * bytesOf(constantSizeSegmentOctets).size());
}
