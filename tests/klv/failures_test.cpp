#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::RecordingErrorHandler;
using zelta_test::RecordingKLVHandler;
using zelta_test::klv::CountingStream;
using zelta_test::klv::Failure;
using zelta_test::klv::join;
using zelta_test::klv::parseErrorOf;
using zelta_test::klv::Seeking;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";

struct FatalRead {
  Failure failure;
  std::vector<std::string> events;
  std::vector<zelta_test::Report> reports;
  int starts = 0;
  int ends = 0;
};

FatalRead readToFailure(std::istream& stream, RecordingKLVHandler::Policy policy) {
  RecordingKLVHandler handler(policy);
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  FatalRead read;
  read.failure = parseErrorOf([&] { reader.read(stream); });
  read.events = handler.events;
  read.reports = errors.reports;
  read.starts = errors.starts;
  read.ends = errors.ends;
  return read;
}

// The read fails with the identifier and text; the error handler hears it
// exactly once as fatal, and the handler sees the stream end aborted.
void expectFatal(const ByteVector& bytes, const MXFUID& identifier, const std::string& message,
                 RecordingKLVHandler::Policy policy = RecordingKLVHandler::take, Seeking seeking = Seeking::seekable) {
  CountingStream stream(bytes, seeking);
  const FatalRead read = readToFailure(stream, policy);
  EXPECT_EQ(read.failure.message, message);
  EXPECT_EQ(read.failure.identifier, identifier);
  ASSERT_EQ(read.reports.size(), 1u);
  EXPECT_EQ(read.reports[0].severity, "fatal");
  EXPECT_EQ(read.reports[0].identifier, identifier);
  EXPECT_EQ(read.reports[0].message, message);
  ASSERT_FALSE(read.events.empty());
  EXPECT_EQ(read.events.front(), "setLocator");
  EXPECT_EQ(read.events.back(), "endStream 1");
  EXPECT_EQ(read.starts, 1);
  EXPECT_EQ(read.ends, 1);
}

}  // namespace

TEST(GenericKLVReaderFailures, StreamBadOnEntryIsReportedWithoutKLVEvents) {
  std::istringstream stream("");
  stream.setstate(std::ios_base::failbit);
  const FatalRead read = readToFailure(stream, RecordingKLVHandler::take);
  EXPECT_EQ(read.failure.message, "input stream is not good()");
  EXPECT_EQ(read.failure.identifier, streamFailureId);
  ASSERT_EQ(read.reports.size(), 1u);
  EXPECT_EQ(read.reports[0].severity, "fatal");
  EXPECT_EQ(read.reports[0].identifier, streamFailureId);
  EXPECT_EQ(read.reports[0].message, "input stream is not good()");
  EXPECT_TRUE(read.events.empty());
  EXPECT_EQ(read.ends, 1);
}

TEST(GenericKLVReaderFailures, CutInsideAKeyFailsUnsuccessfulRead) {
  expectFatal(join({bytesOf(itemKey), bytesOf("01 aa 06 0e 2b 34 01")}), streamFailureId, "unsuccessful read()");
}

TEST(GenericKLVReaderFailures, CutInsideALengthFailsUnsuccessfulRead) {
  expectFatal(join({bytesOf(itemKey), bytesOf("83 00 00")}), streamFailureId, "unsuccessful read()");
}

TEST(GenericKLVReaderFailures, KeyWithoutAnyLengthFailsUnsuccessfulRead) {
  expectFatal(bytesOf(itemKey), streamFailureId, "unsuccessful read()");
}

TEST(GenericKLVReaderFailures, CutInsideATagFailsUnsuccessfulRead) {
  expectFatal(bytesOf("06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00 06 3c"), streamFailureId, "unsuccessful read()");
}

TEST(GenericKLVReaderFailures, CutInsideATakenValueFailsUnsuccessfulRead) {
  expectFatal(join({bytesOf(itemKey), bytesOf("04 aa bb")}), streamFailureId, "unsuccessful read()");
  expectFatal(join({bytesOf(itemKey), bytesOf("04 aa bb")}), streamFailureId, "unsuccessful read()",
              RecordingKLVHandler::takeIntoBuffer);
}

TEST(GenericKLVReaderFailures, FailedSeekPastAValueFailsUnsuccessfulSeekg) {
  // A stream over memory refuses to seek beyond its end.
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("04 aa bb")});
  util::vector_istream stream(bytes);
  const FatalRead read = readToFailure(stream, RecordingKLVHandler::skip);
  EXPECT_EQ(read.failure.message, "unsuccessful seekg()");
  EXPECT_EQ(read.failure.identifier, streamFailureId);
  ASSERT_EQ(read.reports.size(), 1u);
  EXPECT_EQ(read.reports[0].message, "unsuccessful seekg()");
  EXPECT_EQ(read.events.back(), "endStream 1");
}

TEST(GenericKLVReaderFailures, CutInsideASkippedValueOfAPipeFailsUnsuccessfulIgnore) {
  expectFatal(join({bytesOf(itemKey), bytesOf("04 aa bb")}), streamFailureId, "unsuccessful ignore()",
              RecordingKLVHandler::skip, Seeking::notSeekable);
}

TEST(GenericKLVReaderFailures, KeyWithoutTheSMPTEPrefixFailsInvalidSMPTEKey) {
  expectFatal(bytesOf("06 0e 2b 35 01 02 01 01 0d 01 03 01 15 01 05 00 00"), klvCodingErrorId,
              "invalid SMPTE key - 06.0E.2B.35.01.02.01.01.0D.01.03.01.15.01.05.00");
}

TEST(GenericKLVReaderFailures, UncodedOctet4FailsUnimplementedSMPTEKLVCoding) {
  expectFatal(bytesOf("06 0e 2b 34 00 02 01 01 0d 01 03 01 15 01 05 00 00"), klvCodingErrorId,
              "unimplemented SMPTE KLV coding - 06.0E.2B.34.00.02.01.01.0D.01.03.01.15.01.05.00");
  expectFatal(bytesOf("06 0e 2b 34 05 02 01 01 0d 01 03 01 15 01 05 00 00"), klvCodingErrorId,
              "unimplemented SMPTE KLV coding - 06.0E.2B.34.05.02.01.01.0D.01.03.01.15.01.05.00");
}

TEST(GenericKLVReaderFailures, UncodedGroupFailsUnimplementedSMPTEKLVCoding) {
  for (const char* octet5 : {"00", "02", "06", "07", "fa"}) {
    const std::string spelled = std::string("06 0e 2b 34 02 ") + octet5 + " 01 01 0d 01 03 01 15 01 05 00";
    std::string dotted = zelta_test::toString(zelta_test::keyOf(spelled));
    expectFatal(join({bytesOf(spelled), bytesOf("00")}), klvCodingErrorId,
                "unimplemented SMPTE KLV coding - " + dotted);
  }
}

TEST(GenericKLVReaderFailures, PackCoding0x0CFailsInvalidVariableLengthPackType) {
  expectFatal(bytesOf("06 0e 2b 34 02 0c 01 01 0d 01 01 01 01 01 30 00 00"), klvCodingErrorId,
              "invalid variable length pack type - 0x0C");
}

TEST(GenericKLVReaderFailures, WrapperCoding3FailsInvalidWrapperType) {
  expectFatal(bytesOf("06 0e 2b 34 03 03 01 01 0d 01 02 01 01 01 01 00 00"), klvCodingErrorId,
              "invalid wrapper type - 0x03");
}

TEST(GenericKLVReaderFailures, LocalSetCoding0x0BFailsInvalidLocalSetType) {
  expectFatal(bytesOf("06 0e 2b 34 02 0b 01 01 0d 01 01 01 01 01 2f 00 00"), klvCodingErrorId,
              "invalid local set type - 0x0B");
}

TEST(GenericKLVReaderFailures, LongForms0x80And0x89FailInvalidBERLongForm) {
  expectFatal(join({bytesOf(itemKey), bytesOf("80")}), berLengthErrorId, "invalid BER long form - 0x80");
  expectFatal(join({bytesOf(itemKey), bytesOf("89")}), berLengthErrorId, "invalid BER long form - 0x89");
  expectFatal(join({bytesOf(itemKey), bytesOf("ff")}), berLengthErrorId, "invalid BER long form - 0xFF");
}

TEST(GenericKLVReaderFailures, OverrunningChildFailsIncorrectUniversalSetLength) {
  // Declared 17 octets; the child takes 18.
  expectFatal(join({bytesOf("06 0e 2b 34 02 01 01 01 0d 01 01 01 01 01 01 00 11"), bytesOf(itemKey), bytesOf("01 aa")}),
              klvLengthErrorId, "incorrect universal set length");
}

TEST(GenericKLVReaderFailures, OverrunningItemFailsIncorrectLocalSetLength) {
  expectFatal(bytesOf("06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00 04 3c 0a 00 01 aa"), klvLengthErrorId,
              "incorrect local set length");
}

TEST(GenericKLVReaderFailures, OverrunningItemFailsIncorrectVariableLengthPackLength) {
  expectFatal(bytesOf("06 0e 2b 34 02 24 01 01 0d 01 01 01 01 01 30 00 02 02 aa bb"), klvLengthErrorId,
              "incorrect variable length pack length");
}

TEST(GenericKLVReaderFailures, ExceptionThatReachesTheCallerIsTheParseError) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("80")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  EXPECT_THROW(reader.read(stream), KLVElement::parse_error);
  EXPECT_EQ(handler.events.back(), "endStream 1");
}
