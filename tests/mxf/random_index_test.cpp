#include <gtest/gtest.h>

#include "mxf.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

TEST(MXFRandomIndexEntry, InternalizeReadsEntriesInOrder) {
  ByteVector value = bytesOf("00000000 0000000000000000  00000001 0000000000012345  00000030");
  std::vector<MXFRandomIndexEntry> entries;
  internalize(value, entries, 0x83);
  ASSERT_EQ(2u, entries.size());
  EXPECT_EQ(0u, entries[0].bodySID);
  EXPECT_EQ(0u, entries[0].byteOffset);
  EXPECT_EQ(1u, entries[1].bodySID);
  EXPECT_EQ(0x12345u, entries[1].byteOffset);
}

TEST(MXFRandomIndexEntry, OverallLengthCountsKeyLengthAndValueOfTheForm) {
  // 16 + 1 + 16 for short form, 16 + 9 + 16 for form 0x88.
  std::vector<MXFRandomIndexEntry> entries;
  EXPECT_EQ("no failure",
            assertionTextOf([&] { internalize(bytesOf("00000001 0000000000000010 00000021"), entries, 1); }));
  EXPECT_EQ("no failure",
            assertionTextOf([&] { internalize(bytesOf("00000001 0000000000000010 00000029"), entries, 0x88); }));
}

TEST(MXFRandomIndexEntry, WrongOverallLengthFailsCorrectOverallLength) {
  std::vector<MXFRandomIndexEntry> entries;
  EXPECT_EQ("assertion failure: correct overall length",
            assertionTextOf([&] { internalize(bytesOf("00000001 0000000000000010 00000021"), entries, 0x83); }));
}

TEST(MXFRandomIndexEntry, FormZeroDoesNotCheckTheOverallLength) {
  std::vector<MXFRandomIndexEntry> entries;
  internalize(bytesOf("00000001 0000000000000010 FFFFFFFF"), entries, 0);
  ASSERT_EQ(1u, entries.size());
  EXPECT_EQ(16u, entries[0].byteOffset);
}

TEST(MXFRandomIndexEntry, SizeNotFourPlusTwelvesFailsValidExternalLength) {
  std::vector<MXFRandomIndexEntry> entries;
  EXPECT_EQ("assertion failure: valid external length",
            assertionTextOf([&] { internalize(bytesOf("00000001 0000000000000010 0000002400"), entries, 0); }));
  EXPECT_EQ("assertion failure: valid external length",
            assertionTextOf([&] { internalize(bytesOf("000000"), entries, 0); }));
}

TEST(MXFRandomIndexEntry, OnlyTheOverallLengthIsNoEntry) {
  std::vector<MXFRandomIndexEntry> entries{MXFRandomIndexEntry{}};
  internalize(bytesOf("00000018"), entries, 0x83);
  EXPECT_TRUE(entries.empty());
}

TEST(MXFRandomIndexEntry, NoFormYetFailsValidBERLengthForm) {
  std::vector<MXFRandomIndexEntry> entries;
  EXPECT_EQ("assertion failure: valid BER length form",
            assertionTextOf([&] { internalize(bytesOf("00000018"), entries, KLVNoLengthForm); }));
}

TEST(MXFRandomIndexEntry, ExternalizeWritesEntriesAndOverallLength) {
  std::vector<MXFRandomIndexEntry> entries{{0, 0}, {1, 0x12345}};
  ByteVector bytes = bytesOf("FF");
  externalize(bytes, entries, 0x83);
  EXPECT_EQ(bytesOf("00000000 0000000000000000  00000001 0000000000012345  00000030"), bytes);
  externalize(bytes, entries, 1);
  EXPECT_EQ(bytesOf("00000000 0000000000000000  00000001 0000000000012345  0000002D"), bytes);
}

TEST(MXFRandomIndexEntry, ExternalizedValueReadsBack) {
  std::vector<MXFRandomIndexEntry> entries{{7, 0xFFFFFFFFFFFFFFFF}, {0xFFFFFFFF, 3}};
  ByteVector bytes;
  externalize(bytes, entries, 0x84);
  std::vector<MXFRandomIndexEntry> read;
  internalize(bytes, read, 0x84);
  EXPECT_EQ(entries, read);
  EXPECT_EQ(randomIndexValue({{7, 0xFFFFFFFFFFFFFFFF}, {0xFFFFFFFF, 3}}).size(), bytes.size());
}
