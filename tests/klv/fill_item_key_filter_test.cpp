#include <gtest/gtest.h>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;
using zelta_test::RecordingErrorHandler;
using zelta_test::RecordingKLVHandler;
using zelta_test::klv::CountingStream;
using zelta_test::klv::join;

namespace {

ByteVector fillItem(const char* versionOctet) {
  return join({bytesOf("06 0e 2b 34 01 01 01"), bytesOf(versionOctet), bytesOf("03 01 02 10 01 00 00 00 02 00 00")});
}

std::vector<zelta_test::Report> warningsOf(const ByteVector& bytes, std::uint8_t streamVersion = 0) {
  CountingStream stream(bytes);
  setFillItemKeyVersion(stream, streamVersion);
  RecordingKLVHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  reader.read(stream);
  return errors.reports;
}

}  // namespace

TEST(KLVFillItemKeyFilter, VersionsOneAndTwoWithoutStreamVersionGiveNoWarning) {
  EXPECT_TRUE(warningsOf(join({fillItem("01"), fillItem("02"), fillItem("01")})).empty());
}

TEST(KLVFillItemKeyFilter, VersionThreeGivesOneWarningHoweverManyFollow) {
  const std::vector<zelta_test::Report> reports =
      warningsOf(join({fillItem("01"), fillItem("03"), fillItem("03"), fillItem("03"), fillItem("05")}));
  ASSERT_EQ(reports.size(), 1u);
  EXPECT_EQ(reports[0].severity, "warning");
  EXPECT_EQ(reports[0].identifier, fillItemKeyVersionId);
  EXPECT_EQ(reports[0].message, "unexpected fill item key version - 0x03");
}

TEST(KLVFillItemKeyFilter, StreamVersionMustBeMatchedExactly) {
  EXPECT_TRUE(warningsOf(join({fillItem("02"), fillItem("02")}), 2).empty());
  const std::vector<zelta_test::Report> reports = warningsOf(join({fillItem("02"), fillItem("01")}), 2);
  ASSERT_EQ(reports.size(), 1u);
  EXPECT_EQ(reports[0].message, "unexpected fill item key version - 0x01");
}

TEST(KLVFillItemKeyFilter, OtherKeysAreNotLookedAt) {
  EXPECT_TRUE(warningsOf(bytesOf("06 0e 2b 34 01 01 01 07 03 01 02 10 02 00 00 00 00")).empty());
}

TEST(KLVFillItemKeyFilter, EventIsForwardedWithTheKeyAsItCame) {
  RecordingKLVHandler next;
  RecordingErrorHandler errors;
  KLVFillItemKeyFilter filter(&next, 0, &errors);
  filter.startStream(true);
  KLVKey key = KLVFillItemKey;
  key[7] = 3;
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(filter.startIndividualItem(key, 0, buffer));
  filter.endIndividualItem(key);
  EXPECT_EQ(next.events, (std::vector<std::string>{
                             "startStream 1", "startIndividualItem 06.0E.2B.34.01.01.01.03.03.01.02.10.01.00.00.00 0",
                             "endIndividualItem 06.0E.2B.34.01.01.01.03.03.01.02.10.01.00.00.00"}));
  EXPECT_EQ(errors.reports.size(), 1u);
}

TEST(KLVFillItemKeyFilter, EachStreamMayWarnOnce) {
  DullKLVHandler next;
  RecordingErrorHandler errors;
  KLVFillItemKeyFilter filter(&next, 0, &errors);
  KLVKey key = KLVFillItemKey;
  key[7] = 9;
  std::uint8_t* buffer = nullptr;
  for (int stream = 0; stream < 2; ++stream) {
    filter.startStream(true);
    filter.startIndividualItem(key, 0, buffer);
    filter.endIndividualItem(key);
    filter.endStream(false);
  }
  ASSERT_EQ(errors.reports.size(), 2u);
  EXPECT_EQ(errors.reports[1].message, "unexpected fill item key version - 0x09");
}

TEST(KLVFillItemKeyFilter, WithoutErrorHandlerStaysSilent) {
  DullKLVHandler next;
  KLVFillItemKeyFilter filter(&next, 0, nullptr);
  filter.startStream(true);
  KLVKey key = KLVFillItemKey;
  key[7] = 3;
  std::uint8_t* buffer = nullptr;
  EXPECT_FALSE(filter.startIndividualItem(key, 0, buffer));
}
