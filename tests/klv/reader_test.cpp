#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;
using zelta_test::RecordingErrorHandler;
using zelta_test::RecordingKLVHandler;
using zelta_test::toString;
using zelta_test::klv::assertionOf;
using zelta_test::klv::CountingStream;
using zelta_test::klv::Failure;
using zelta_test::klv::join;
using zelta_test::klv::parseErrorOf;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";
const char* const otherItemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 16 01 01 00";
const char* const universalSetKey = "06 0e 2b 34 02 01 01 01 0d 01 01 01 01 01 01 00";
const char* const localSetKey = "06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00";
const char* const berLocalSetKey = "06 0e 2b 34 02 13 01 01 0d 01 01 01 01 01 2f 00";
const char* const variableLengthPackKey = "06 0e 2b 34 02 24 01 01 0d 01 01 01 01 01 30 00";
const char* const fixedLengthPackKey = "06 0e 2b 34 02 05 01 01 0d 01 02 01 01 02 04 00";
const char* const wrapperKey = "06 0e 2b 34 03 01 01 01 0d 01 02 01 01 01 01 00";
const char* const nonWrapperKey = "06 0e 2b 34 03 02 01 01 0d 01 02 01 01 01 01 00";
const char* const labelKey = "06 0e 2b 34 04 01 01 01 0d 01 02 01 01 01 01 00";

std::string dotted(const char* spelled) { return toString(keyOf(spelled)); }

// Events of a read of the bytes by a recording handler with the policy.
std::vector<std::string> eventsOf(const ByteVector& bytes,
                                  RecordingKLVHandler::Policy policy = RecordingKLVHandler::take) {
  CountingStream stream(bytes);
  RecordingKLVHandler handler(policy);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  return handler.events;
}

ByteVector repeated(std::size_t count, std::uint8_t octet) { return ByteVector(count, octet); }

}  // namespace

TEST(GenericKLVReader, EmptyStreamStartsThenFailsUnsuccessfulReadAndEndsAborted) {
  ByteVector bytes;
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  Failure failure = parseErrorOf([&] { reader.read(stream); });
  EXPECT_EQ(failure.message, "unsuccessful read()");
  EXPECT_EQ(failure.identifier, streamFailureId);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"setLocator", "startStream 1", "endStream 1"}));
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].severity, "fatal");
  EXPECT_EQ(errors.reports[0].identifier, streamFailureId);
  EXPECT_EQ(errors.reports[0].message, "unsuccessful read()");
  EXPECT_EQ(errors.starts, 1);
  EXPECT_EQ(errors.ends, 1);
}

TEST(GenericKLVReader, TwoElementsOfTheSameFormReportTheFormOnce) {
  const ByteVector bytes =
      join({bytesOf(itemKey), bytesOf("83 00 00 01 aa"), bytesOf(otherItemKey), bytesOf("83 00 00 02 bb cc")});
  EXPECT_EQ(eventsOf(bytes),
            (std::vector<std::string>{
                "setLocator", "startStream 1", "setLengthForm 131", "startIndividualItem " + dotted(itemKey) + " 1",
                "value 1", "endIndividualItem " + dotted(itemKey), "startIndividualItem " + dotted(otherItemKey) + " 2",
                "value 2", "endIndividualItem " + dotted(otherItemKey), "endStream 0"}));
}

TEST(GenericKLVReader, FormIsReportedAgainWhenItChanges) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("01 aa"), bytesOf(itemKey), bytesOf("83 00 00 01 bb"),
                                 bytesOf(itemKey), bytesOf("01 cc")});
  std::vector<std::string> forms;
  for (const std::string& event : eventsOf(bytes))
    if (event.rfind("setLengthForm", 0) == 0) forms.push_back(event);
  EXPECT_EQ(forms, (std::vector<std::string>{"setLengthForm 1", "setLengthForm 131", "setLengthForm 1"}));
}

namespace {

// Names a buffer of its own for every individual item, also an empty one.
class BufferNamingHandler : public RecordingKLVHandler {
public:
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    RecordingKLVHandler::startIndividualItem(key, length, buffer);
    buffer = &octet_;
    return true;
  }

private:
  std::uint8_t octet_ = 0;
};

}  // namespace

TEST(GenericKLVReader, ZeroLengthValueWithBufferGivesOneValueEvent) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("00")});
  CountingStream stream(bytes);
  BufferNamingHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                                      "startIndividualItem " + dotted(itemKey) + " 0", "value 0",
                                                      "endIndividualItem " + dotted(itemKey), "endStream 0"}));
}

TEST(GenericKLVReader, ZeroLengthValueWithoutBufferGivesNoValueEvent) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("00")});
  EXPECT_EQ(eventsOf(bytes), (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                                       "startIndividualItem " + dotted(itemKey) + " 0",
                                                       "endIndividualItem " + dotted(itemKey), "endStream 0"}));
}

TEST(GenericKLVReader, ValueOf65536OctetsWithoutBufferIsOneValueEvent) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("83 01 00 00"), repeated(65536, 0x5A)});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(handler.events[4], "value 65536");
  EXPECT_EQ(handler.events[5], "endIndividualItem " + dotted(itemKey));
  EXPECT_EQ(handler.values, repeated(65536, 0x5A));
}

TEST(GenericKLVReader, ValueOf65537OctetsWithoutBufferIsTwoValueEvents) {
  ByteVector value = repeated(65537, 0x11);
  value.back() = 0x22;
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("83 01 00 01"), value});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_EQ(handler.events[4], "value 65536");
  EXPECT_EQ(handler.events[5], "value 1");
  EXPECT_EQ(handler.events[6], "endIndividualItem " + dotted(itemKey));
  EXPECT_EQ(handler.values, value);
}

TEST(GenericKLVReader, StopPositionInsideAnElementFinishesTheElementFirst) {
  // Three elements of 21 octets each.
  const ByteVector one = join({bytesOf(itemKey), bytesOf("04 01 02 03 04")});
  const ByteVector bytes = join({one, one, one});
  const std::vector<std::pair<std::streamoff, int>> stops = {{5, 1}, {21, 1}, {22, 2}, {42, 2}, {43, 3}};
  for (const auto& stop : stops) {
    CountingStream stream(bytes);
    RecordingKLVHandler handler;
    GenericKLVReader reader;
    reader.setHandler(&handler);
    reader.read(stream, std::streampos(stop.first));
    int elements = 0;
    for (const std::string& event : handler.events) elements += event.rfind("endIndividualItem", 0) == 0;
    EXPECT_EQ(elements, stop.second) << "stop " << stop.first;
    EXPECT_EQ(handler.events.back(), "endStream 0");
  }
}

TEST(GenericKLVReader, StopPositionIsTestedOnlyBetweenTopLevelElements) {
  // A universal set of two items, then one more item; the stop falls inside
  // the set's first child.
  const ByteVector child = join({bytesOf(itemKey), bytesOf("02 aa bb")});
  const ByteVector bytes = join({bytesOf(universalSetKey), bytesOf("26"), child, child, child});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream, std::streampos(20));
  int items = 0;
  for (const std::string& event : handler.events) items += event.rfind("endIndividualItem", 0) == 0;
  EXPECT_EQ(items, 2);
  EXPECT_EQ(handler.events[handler.events.size() - 2], "endUniversalSet " + dotted(universalSetKey));
}

TEST(GenericKLVReader, LongFormOf0x80FailsInvalidBERLongForm) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("80 00")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  Failure failure = parseErrorOf([&] { reader.read(stream); });
  EXPECT_EQ(failure.message, "invalid BER long form - 0x80");
  EXPECT_EQ(failure.identifier, berLengthErrorId);
}

TEST(GenericKLVReader, LongFormOf0x89FailsInvalidBERLongForm) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("89 00 00 00 00 00 00 00 00 01 aa")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  Failure failure = parseErrorOf([&] { reader.read(stream); });
  EXPECT_EQ(failure.message, "invalid BER long form - 0x89");
  EXPECT_EQ(failure.identifier, berLengthErrorId);
}

TEST(GenericKLVReader, LongFormOf0x88WithEightOctetsIsAccepted) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("88 00 00 00 00 00 00 00 03 aa bb cc")});
  EXPECT_EQ(eventsOf(bytes), (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 136",
                                                       "startIndividualItem " + dotted(itemKey) + " 3", "value 3",
                                                       "endIndividualItem " + dotted(itemKey), "endStream 0"}));
}

TEST(GenericKLVReader, LocalSetItemThatOverrunsIsDeliveredBeforeIncorrectLocalSetLength) {
  // Declared 6 octets; the one item takes 2 + 2 + 4.
  const ByteVector bytes = join({bytesOf(localSetKey), bytesOf("06 3c 0a 00 04 01 02 03 04")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  Failure failure = parseErrorOf([&] { reader.read(stream); });
  EXPECT_EQ(failure.message, "incorrect local set length");
  EXPECT_EQ(failure.identifier, klvLengthErrorId);
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                      "startLocalSet " + dotted(localSetKey) + " 6 1 2", "startLocalItem 15370 4",
                                      "value 4", "endLocalItem 15370", "endStream 1"}));
  EXPECT_EQ(handler.values, bytesOf("01 02 03 04"));
}

TEST(GenericKLVReader, LocalSetCoding0x0BNeverStartsTheLocalSet) {
  const ByteVector bytes = join({bytesOf("06 0e 2b 34 02 0b 01 01 0d 01 01 01 01 01 2f 00"), bytesOf("00")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  Failure failure = parseErrorOf([&] { reader.read(stream); });
  EXPECT_EQ(failure.message, "invalid local set type - 0x0B");
  EXPECT_EQ(failure.identifier, klvCodingErrorId);
  for (const std::string& event : handler.events) EXPECT_EQ(event.rfind("startLocalSet", 0), std::string::npos);
}

TEST(GenericKLVReader, LabelConsumesNoLength) {
  // The octet after the label is the first of the next key.
  const ByteVector bytes = join({bytesOf(labelKey), bytesOf(itemKey), bytesOf("01 aa")});
  EXPECT_EQ(eventsOf(bytes), (std::vector<std::string>{"setLocator", "startStream 1", "startLabel " + dotted(labelKey),
                                                       "endLabel " + dotted(labelKey), "setLengthForm 1",
                                                       "startIndividualItem " + dotted(itemKey) + " 1", "value 1",
                                                       "endIndividualItem " + dotted(itemKey), "endStream 0"}));
}

TEST(GenericKLVReader, LabelAtTheEndOfTheStreamEndsIt) {
  EXPECT_EQ(eventsOf(bytesOf(labelKey)),
            (std::vector<std::string>{"setLocator", "startStream 1", "startLabel " + dotted(labelKey),
                                      "endLabel " + dotted(labelKey), "endStream 0"}));
}

TEST(GenericKLVReader, UniversalSetContentsAreNestedElements) {
  const ByteVector bytes = join({bytesOf(universalSetKey), bytesOf("83 00 00 35"), bytesOf(itemKey), bytesOf("01 aa"),
                                 bytesOf(labelKey), bytesOf(otherItemKey), bytesOf("02 bb cc")});
  EXPECT_EQ(
      eventsOf(bytes),
      (std::vector<std::string>{
          "setLocator", "startStream 1", "setLengthForm 131", "startUniversalSet " + dotted(universalSetKey) + " 53",
          "setLengthForm 1", "startIndividualItem " + dotted(itemKey) + " 1", "value 1",
          "endIndividualItem " + dotted(itemKey), "startLabel " + dotted(labelKey), "endLabel " + dotted(labelKey),
          "startIndividualItem " + dotted(otherItemKey) + " 2", "value 2", "endIndividualItem " + dotted(otherItemKey),
          "endUniversalSet " + dotted(universalSetKey), "endStream 0"}));
}

TEST(GenericKLVReader, DeclinedUniversalSetIsSkippedWhole) {
  const ByteVector bytes = join({bytesOf(universalSetKey), bytesOf("12"), bytesOf(itemKey), bytesOf("01 aa"),
                                 bytesOf(otherItemKey), bytesOf("01 bb")});
  EXPECT_EQ(
      eventsOf(bytes, RecordingKLVHandler::skip),
      (std::vector<std::string>{
          "setLocator", "startStream 1", "setLengthForm 1", "startUniversalSet " + dotted(universalSetKey) + " 18",
          "endUniversalSet " + dotted(universalSetKey), "startIndividualItem " + dotted(otherItemKey) + " 1",
          "endIndividualItem " + dotted(otherItemKey), "endStream 0"}));
}

TEST(GenericKLVReader, LocalSetItemsCarryTagsAndFixedLengths) {
  const ByteVector bytes = join({bytesOf(localSetKey), bytesOf("0b 3c 0a 00 02 aa bb 01 02 00 01 cc")});
  EXPECT_EQ(eventsOf(bytes),
            (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                      "startLocalSet " + dotted(localSetKey) + " 11 1 2", "startLocalItem 15370 2",
                                      "value 2", "endLocalItem 15370", "startLocalItem 258 1", "value 1",
                                      "endLocalItem 258", "endLocalSet " + dotted(localSetKey), "endStream 0"}));
}

TEST(GenericKLVReader, LocalSetOfBERLengthsReportsEachLengthForm) {
  const ByteVector bytes =
      join({bytesOf(berLocalSetKey), bytesOf("83 00 00 0d 01 01 02 aa bb 01 02 82 00 03 cc dd ee")});
  EXPECT_EQ(eventsOf(bytes),
            (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 131",
                                      "startLocalSet " + dotted(berLocalSetKey) + " 13 1 0", "setLengthForm 1",
                                      "startLocalItem 257 2", "value 2", "endLocalItem 257", "setLengthForm 130",
                                      "startLocalItem 258 3", "value 3", "endLocalItem 258",
                                      "endLocalSet " + dotted(berLocalSetKey), "endStream 0"}));
}

TEST(GenericKLVReader, DeclinedLocalSetSendsNoItems) {
  const ByteVector bytes = join({bytesOf(localSetKey), bytesOf("06 3c 0a 00 02 aa bb")});
  EXPECT_EQ(eventsOf(bytes, RecordingKLVHandler::skip),
            (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                      "startLocalSet " + dotted(localSetKey) + " 6 1 2",
                                      "endLocalSet " + dotted(localSetKey), "endStream 0"}));
}

TEST(GenericKLVReader, VariableLengthPackItemsCarryTheirLengths) {
  const ByteVector bytes = join({bytesOf(variableLengthPackKey), bytesOf("05 02 aa bb 01 cc")});
  EXPECT_EQ(eventsOf(bytes),
            (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                      "startVariableLengthPack " + dotted(variableLengthPackKey) + " 5 1",
                                      "startVariableLengthItem 2", "value 2", "endVariableLengthItem",
                                      "startVariableLengthItem 1", "value 1", "endVariableLengthItem",
                                      "endVariableLengthPack " + dotted(variableLengthPackKey), "endStream 0"}));
}

TEST(GenericKLVReader, FixedLengthPackIsOneValue) {
  const ByteVector bytes = join({bytesOf(fixedLengthPackKey), bytesOf("02 aa bb")});
  EXPECT_EQ(eventsOf(bytes, RecordingKLVHandler::takeIntoBuffer),
            (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                      "startFixedLengthPack " + dotted(fixedLengthPackKey) + " 2", "value 2",
                                      "endFixedLengthPack " + dotted(fixedLengthPackKey), "endStream 0"}));
}

TEST(GenericKLVReader, WrapperKindComesFromKeyOctet5) {
  const ByteVector bytes = join({bytesOf(wrapperKey), bytesOf("01 aa"), bytesOf(nonWrapperKey), bytesOf("00")});
  EXPECT_EQ(eventsOf(bytes),
            (std::vector<std::string>{
                "setLocator", "startStream 1", "setLengthForm 1", "startWrapper " + dotted(wrapperKey) + " 1 1",
                "value 1", "endWrapper " + dotted(wrapperKey), "startWrapper " + dotted(nonWrapperKey) + " 0 0",
                "endWrapper " + dotted(nonWrapperKey), "endStream 0"}));
}

TEST(GenericKLVReader, GroupCodingUsesOnlyTheLowThreeBitsOfOctet5) {
  // 0x0D selects a fixed length pack as 0x05 does.
  const char* const key = "06 0e 2b 34 02 0d 01 01 0d 01 02 01 01 02 04 00";
  const ByteVector bytes = join({bytesOf(key), bytesOf("01 aa")});
  EXPECT_EQ(eventsOf(bytes)[3], "startFixedLengthPack " + dotted(key) + " 1");
}

TEST(GenericKLVReader, KeyIsPassedAsReadWithItsRegistryVersion) {
  const char* const key = "06 0e 2b 34 01 02 01 7f 0d 01 03 01 15 01 05 00";
  const ByteVector bytes = join({bytesOf(key), bytesOf("00")});
  EXPECT_EQ(eventsOf(bytes)[3], "startIndividualItem 06.0E.2B.34.01.02.01.7F.0D.01.03.01.15.01.05.00 0");
}

TEST(GenericKLVReader, DarkElementIsSkippedByADullHandler) {
  const ByteVector bytes = join({bytesOf("06 0e 2b 34 01 7f 7f 7f 7f 7f 7f 7f 7f 7f 7f 7f"), bytesOf("03 aa bb cc"),
                                 bytesOf(itemKey), bytesOf("00")});
  CountingStream stream(bytes);
  DullKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  EXPECT_TRUE(stream.eof());
  EXPECT_FALSE(stream.bad());
}

TEST(GenericKLVReader, ReadWithoutHandlerFailsHandlerIsPresent) {
  ByteVector bytes = join({bytesOf(itemKey), bytesOf("00")});
  CountingStream stream(bytes);
  GenericKLVReader reader;
  EXPECT_EQ(assertionOf([&] { reader.read(stream); }), "assertion failure: handler is present");
}

TEST(GenericKLVReader, GetErrorHandlerWithoutOneFailsErrorHandlerIsPresent) {
  GenericKLVReader reader;
  EXPECT_EQ(assertionOf([&] { reader.getErrorHandler(); }), "assertion failure: error handler is present");
  RecordingErrorHandler errors;
  reader.setErrorHandler(&errors);
  EXPECT_EQ(reader.getErrorHandler(), &errors);
}

TEST(GenericKLVReader, ErrorHandlerHearsStartAndEndOfAGoodRead) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("00")});
  CountingStream stream(bytes);
  RecordingKLVHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  reader.read(stream);
  EXPECT_EQ(errors.starts, 1);
  EXPECT_EQ(errors.ends, 1);
  EXPECT_TRUE(errors.reports.empty());
}

namespace {

// Throws from the first start event, as a client might.
class ThrowingHandler : public DullKLVHandler {
public:
  bool startIndividualItem(const KLVKey&, std::uint64_t, std::uint8_t*&) override {
    throw std::logic_error("client gave up");
  }
  void endStream(bool aborted) override { endStreams.push_back(aborted); }
  std::vector<bool> endStreams;
};

}  // namespace

TEST(GenericKLVReader, ClientExceptionEndsTheStreamAbortedAndPassesUnreported) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("00")});
  CountingStream stream(bytes);
  ThrowingHandler handler;
  RecordingErrorHandler errors;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.setErrorHandler(&errors);
  EXPECT_THROW(reader.read(stream), std::logic_error);
  EXPECT_EQ(handler.endStreams, std::vector<bool>{true});
  EXPECT_TRUE(errors.reports.empty());
  EXPECT_EQ(errors.ends, 1);
}

TEST(GenericKLVReader, ReaderCanReadOneStreamAfterAnother) {
  const ByteVector bytes = join({bytesOf(itemKey), bytesOf("01 aa")});
  GenericKLVReader reader;
  RecordingKLVHandler handler;
  reader.setHandler(&handler);
  CountingStream first(bytes);
  reader.read(first);
  CountingStream second(bytes);
  reader.read(second);
  EXPECT_EQ(handler.events.size(), 14u);
  EXPECT_EQ(handler.events[7], "setLocator");
  EXPECT_EQ(handler.events[9], "setLengthForm 1");
}
