// Inputs that the fuzzer once turned into faults, kept so that they stay
// plain reports.

#include <gtest/gtest.h>

#include <limits>

#include "support/mxf_streams.h"
#include "support/recording.h"

namespace {

using namespace zelta_test;

// A header partition pack whose essence container batch claims 2^32 - 2
// labels of 16 octets in a value that holds one: the read stops at the end
// of the value, and nothing near the claimed size is ever allocated.
TEST(FuzzRegression, HugeEssenceContainerCountIsAnInvalidPartitionValue) {
  MXFPartitionPack pack;
  pack.essenceContainers.push_back(KLVFillItemKey);
  ByteVector value = packValue(pack);
  const std::size_t countAt = 80;
  value[countAt] = 0xFF;
  value[countAt + 1] = 0xFF;
  value[countAt + 2] = 0xFF;
  value[countAt + 3] = 0xFE;
  const ByteVector file = element(partitionKey(2, 4), value);

  RecordingErrorHandler reports;
  MXFReader reader;
  reader.setErrorHandler(&reports);
  util::vector_istream in(file);
  EXPECT_THROW(reader.read(in), std::runtime_error);
  ASSERT_FALSE(reports.reports.empty());
  EXPECT_EQ(reports.reports.back().severity, "fatal");
  EXPECT_EQ(reports.reports.back().identifier, partitionValueId);
  EXPECT_EQ(reports.reports.back().message, "invalid partition value - assertion failure: successful read()");
}

TEST(FuzzRegression, HugeBatchCountFailsAtTheEndOfTheOctets) {
  ByteVector bytes = bytesOf("FF FF FF FF 00 00 00 10");
  bytes.resize(bytes.size() + 16, 0x06);
  std::vector<KLVKey> keys;
  try {
    internalize(bytes, keys);
    FAIL() << "no failure";
  } catch (const util::assertion_failure& failure) {
    EXPECT_STREQ(failure.what(), "assertion failure: successful read()");
  }
}

// An element whose length takes all eight octets of the long form, skipped
// on a stream over memory: the skip in two pieces fails at the first, and
// no position arithmetic overflows on the way.
TEST(FuzzRegression, SkipOfTheLargestLengthIsAnUnsuccessfulSeek) {
  const ByteVector file =
      concat({partitionPack(2, 4, packWithCounts(0, 0)), bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 01 00"),
              bytesOf("88 FF FF FF FF FF FF FF FF 00 00")});
  RecordingErrorHandler reports;
  MXFReader reader;
  reader.setErrorHandler(&reports);
  util::vector_istream in(file);
  EXPECT_THROW(reader.read(in), KLVElement::parse_error);
  ASSERT_FALSE(reports.reports.empty());
  EXPECT_EQ(reports.reports.back().identifier, streamFailureId);
  EXPECT_EQ(reports.reports.back().message, "unsuccessful seekg()");
}

}  // namespace
