#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "klv.h"
#include "support/klv_output.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;
using zelta_test::RecordingKLVHandler;
using zelta_test::toString;
using zelta_test::klv::assertionOf;
using zelta_test::klv::join;
using zelta_test::klv::outputOf;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";
const char* const universalSetKey = "06 0e 2b 34 02 01 01 01 0d 01 01 01 01 01 01 00";
const char* const localSetKey = "06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00";
const char* const berLocalSetKey = "06 0e 2b 34 02 13 01 01 0d 01 01 01 01 01 2f 00";
const char* const berTaggedSetKey = "06 0e 2b 34 02 0b 01 01 0d 01 01 01 01 01 2f 00";
const char* const variableLengthPackKey = "06 0e 2b 34 02 24 01 01 0d 01 01 01 01 01 30 00";
const char* const fixedLengthPackKey = "06 0e 2b 34 02 05 01 01 0d 01 02 01 01 02 04 00";
const char* const wrapperKey = "06 0e 2b 34 03 01 01 01 0d 01 02 01 01 01 01 00";
const char* const labelKey = "06 0e 2b 34 04 01 01 01 0d 01 02 01 01 01 01 00";

std::string dotted(const char* spelled) { return toString(keyOf(spelled)); }

// Writes its actions into the log of the handler that it forwards to.
class LoggingActionFilter : public ActionKLVFilter {
public:
  explicit LoggingActionFilter(RecordingKLVHandler& next) : ActionKLVFilter(&next), log_(next.events) {}
  void beforeEvent() override { log_.push_back("before"); }
  void afterEvent() override { log_.push_back("after"); }

private:
  std::vector<std::string>& log_;
};

// Sends every event through all 23 operations once.
void sendEveryEvent(KLVHandler& handler) {
  NullLocator locator;
  std::uint8_t* buffer = nullptr;
  const std::uint8_t octet = 0x5a;
  handler.setLocator(&locator);
  handler.startStream(true);
  handler.setLengthForm(0x83);
  handler.startIndividualItem(keyOf(itemKey), 1, buffer);
  handler.value(&octet, 1);
  handler.endIndividualItem(keyOf(itemKey));
  handler.startLabel(keyOf(labelKey));
  handler.endLabel(keyOf(labelKey));
  handler.startUniversalSet(keyOf(universalSetKey), 0);
  handler.endUniversalSet(keyOf(universalSetKey));
  handler.startLocalSet(keyOf(localSetKey), 4, KLVTagType2, KLVLengthType2);
  handler.startLocalItem(7, 0, buffer);
  handler.endLocalItem(7);
  handler.endLocalSet(keyOf(localSetKey));
  handler.startFixedLengthPack(keyOf(fixedLengthPackKey), 0, buffer);
  handler.endFixedLengthPack(keyOf(fixedLengthPackKey));
  handler.startVariableLengthPack(keyOf(variableLengthPackKey), 1, KLVLengthType1);
  handler.startVariableLengthItem(0, buffer);
  handler.endVariableLengthItem();
  handler.endVariableLengthPack(keyOf(variableLengthPackKey));
  handler.startWrapper(keyOf(wrapperKey), 0, true, buffer);
  handler.endWrapper(keyOf(wrapperKey));
  handler.endStream(false);
}

const std::vector<std::string>& everyEvent() {
  static const std::vector<std::string> events{
      "setLocator",
      "startStream 1",
      "setLengthForm 131",
      "startIndividualItem " + dotted(itemKey) + " 1",
      "value 1",
      "endIndividualItem " + dotted(itemKey),
      "startLabel " + dotted(labelKey),
      "endLabel " + dotted(labelKey),
      "startUniversalSet " + dotted(universalSetKey) + " 0",
      "endUniversalSet " + dotted(universalSetKey),
      "startLocalSet " + dotted(localSetKey) + " 4 1 2",
      "startLocalItem 7 0",
      "endLocalItem 7",
      "endLocalSet " + dotted(localSetKey),
      "startFixedLengthPack " + dotted(fixedLengthPackKey) + " 0",
      "endFixedLengthPack " + dotted(fixedLengthPackKey),
      "startVariableLengthPack " + dotted(variableLengthPackKey) + " 1 1",
      "startVariableLengthItem 0",
      "endVariableLengthItem",
      "endVariableLengthPack " + dotted(variableLengthPackKey),
      "startWrapper " + dotted(wrapperKey) + " 0 1",
      "endWrapper " + dotted(wrapperKey),
      "endStream 0",
  };
  return events;
}

// Forwards to the first handler until told to switch.
class SwitchingForwarder : public KLVForwarder {
public:
  SwitchingForwarder(KLVHandler& first, KLVHandler& second) : first_(first), second_(second) {}
  KLVHandler* getHandler() override { return switched ? &second_ : &first_; }
  bool switched = false;

private:
  KLVHandler& first_;
  KLVHandler& second_;
};

}  // namespace

TEST(ActionKLVFilter, CallsBeforeAndAfterAroundEveryEvent) {
  RecordingKLVHandler next;
  LoggingActionFilter filter(next);
  sendEveryEvent(filter);
  std::vector<std::string> expected;
  for (const std::string& event : everyEvent()) {
    expected.push_back("before");
    expected.push_back(event);
    expected.push_back("after");
  }
  EXPECT_EQ(next.events, expected);
}

TEST(ActionKLVFilter, ReturnsWhatTheNextHandlerReturned) {
  RecordingKLVHandler taking(RecordingKLVHandler::take);
  RecordingKLVHandler skipping(RecordingKLVHandler::skip);
  LoggingActionFilter takingFilter(taking);
  LoggingActionFilter skippingFilter(skipping);
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(takingFilter.startIndividualItem(keyOf(itemKey), 1, buffer));
  EXPECT_TRUE(takingFilter.startUniversalSet(keyOf(universalSetKey), 0));
  EXPECT_TRUE(takingFilter.startLocalSet(keyOf(localSetKey), 0, KLVTagType2, KLVLengthType2));
  EXPECT_TRUE(takingFilter.startLocalItem(1, 0, buffer));
  EXPECT_TRUE(takingFilter.startFixedLengthPack(keyOf(fixedLengthPackKey), 0, buffer));
  EXPECT_TRUE(takingFilter.startVariableLengthPack(keyOf(variableLengthPackKey), 0, KLVLengthType1));
  EXPECT_TRUE(takingFilter.startVariableLengthItem(0, buffer));
  EXPECT_TRUE(takingFilter.startWrapper(keyOf(wrapperKey), 0, true, buffer));
  EXPECT_FALSE(skippingFilter.startIndividualItem(keyOf(itemKey), 1, buffer));
  EXPECT_FALSE(skippingFilter.startUniversalSet(keyOf(universalSetKey), 0));
  EXPECT_FALSE(skippingFilter.startLocalSet(keyOf(localSetKey), 0, KLVTagType2, KLVLengthType2));
  EXPECT_FALSE(skippingFilter.startLocalItem(1, 0, buffer));
  EXPECT_FALSE(skippingFilter.startFixedLengthPack(keyOf(fixedLengthPackKey), 0, buffer));
  EXPECT_FALSE(skippingFilter.startVariableLengthPack(keyOf(variableLengthPackKey), 0, KLVLengthType1));
  EXPECT_FALSE(skippingFilter.startVariableLengthItem(0, buffer));
  EXPECT_FALSE(skippingFilter.startWrapper(keyOf(wrapperKey), 0, true, buffer));
}

TEST(ActionKLVFilter, PassesTheNextHandlersBufferBack) {
  RecordingKLVHandler next(RecordingKLVHandler::takeIntoBuffer);
  LoggingActionFilter filter(next);
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(filter.startIndividualItem(keyOf(itemKey), 4, buffer));
  EXPECT_NE(buffer, nullptr);
}

TEST(ActionKLVFilter, WithoutNextHandlerFailsHandlerIsPresentAfterBeforeEvent) {
  struct Counting : ActionKLVFilter {
    void beforeEvent() override { ++before; }
    void afterEvent() override { ++after; }
    int before = 0;
    int after = 0;
  } filter;
  EXPECT_EQ(assertionOf([&] { filter.startStream(true); }), "assertion failure: handler is present");
  EXPECT_EQ(filter.before, 1);
  EXPECT_EQ(filter.after, 0);
}

TEST(KLVForwarder, ForwardsEveryEventUnchanged) {
  RecordingKLVHandler first;
  RecordingKLVHandler second;
  SwitchingForwarder forwarder(first, second);
  sendEveryEvent(forwarder);
  EXPECT_EQ(first.events, everyEvent());
  EXPECT_TRUE(second.events.empty());
}

TEST(KLVForwarder, AsksForItsTargetAtEveryEvent) {
  RecordingKLVHandler first(RecordingKLVHandler::take);
  RecordingKLVHandler second(RecordingKLVHandler::skip);
  SwitchingForwarder forwarder(first, second);
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(forwarder.startIndividualItem(keyOf(itemKey), 0, buffer));
  forwarder.switched = true;
  forwarder.endIndividualItem(keyOf(itemKey));
  EXPECT_FALSE(forwarder.startIndividualItem(keyOf(itemKey), 0, buffer));
  EXPECT_EQ(first.events, std::vector<std::string>{"startIndividualItem " + dotted(itemKey) + " 0"});
  EXPECT_EQ(second.events, (std::vector<std::string>{"endIndividualItem " + dotted(itemKey),
                                                     "startIndividualItem " + dotted(itemKey) + " 0"}));
}

TEST(KLVForwarder, PassesTheTargetsBufferBack) {
  RecordingKLVHandler first(RecordingKLVHandler::takeIntoBuffer);
  SwitchingForwarder forwarder(first, first);
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(forwarder.startWrapper(keyOf(wrapperKey), 3, true, buffer));
  EXPECT_NE(buffer, nullptr);
}

TEST(WriteIndividualItem, SendsStartValueAndEnd) {
  RecordingKLVHandler handler;
  const ByteVector data = bytesOf("01 02 03");
  writeIndividualItem(handler, keyOf(itemKey), data.data(), data.size());
  EXPECT_EQ(handler.events, (std::vector<std::string>{"startIndividualItem " + dotted(itemKey) + " 3", "value 3",
                                                      "endIndividualItem " + dotted(itemKey)}));
  EXPECT_EQ(handler.values, data);
}

TEST(WriteIndividualItem, SendsAValueAlsoForLengthZero) {
  RecordingKLVHandler handler;
  writeIndividualItem(handler, keyOf(itemKey), nullptr, 0);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"startIndividualItem " + dotted(itemKey) + " 0", "value 0",
                                                      "endIndividualItem " + dotted(itemKey)}));
}

TEST(WriteIndividualItem, SendsNoValueToAHandlerThatDeclines) {
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  const ByteVector data = bytesOf("01 02 03");
  writeIndividualItem(handler, keyOf(itemKey), data.data(), data.size());
  EXPECT_EQ(handler.events, (std::vector<std::string>{"startIndividualItem " + dotted(itemKey) + " 3",
                                                      "endIndividualItem " + dotted(itemKey)}));
}

TEST(WriteIndividualItem, FillsTheBufferThatTheHandlerNamed) {
  // Takes into its own buffer and keeps what arrived there.
  struct BufferingHandler : DullKLVHandler {
    bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
      own.assign(length, 0);
      buffer = own.data();
      return true;
    }
    void value(const std::uint8_t* data, std::streamsize size) override {
      fromOwnBuffer = data == own.data() && size == static_cast<std::streamsize>(own.size());
    }
    ByteVector own;
    bool fromOwnBuffer = false;
  } handler;
  const ByteVector data = bytesOf("0a 0b");
  writeIndividualItem(handler, keyOf(itemKey), data.data(), data.size());
  EXPECT_TRUE(handler.fromOwnBuffer);
  EXPECT_EQ(handler.own, data);
}

TEST(WriteIndividualItem, IntoAWriterGivesTheOctets) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  writer.startStream(true);
  writer.setLengthForm(0x83);
  const ByteVector data = bytesOf("01 02 03");
  writeIndividualItem(writer, keyOf(itemKey), data.data(), data.size());
  EXPECT_EQ(outputOf(out), join({bytesOf(itemKey), bytesOf("83 00 00 03 01 02 03")}));
}

TEST(WriteFixedLengthPack, SendsTheBytesAsOneValue) {
  RecordingKLVHandler handler;
  writeFixedLengthPack(handler, keyOf(fixedLengthPackKey), bytesOf("01 02"));
  EXPECT_EQ(handler.events, (std::vector<std::string>{"startFixedLengthPack " + dotted(fixedLengthPackKey) + " 2",
                                                      "value 2", "endFixedLengthPack " + dotted(fixedLengthPackKey)}));
}

TEST(WriteFixedLengthPack, SendsNoValueForNoBytes) {
  RecordingKLVHandler handler;
  writeFixedLengthPack(handler, keyOf(fixedLengthPackKey), ByteVector());
  EXPECT_EQ(handler.events, (std::vector<std::string>{"startFixedLengthPack " + dotted(fixedLengthPackKey) + " 0",
                                                      "endFixedLengthPack " + dotted(fixedLengthPackKey)}));
}

TEST(WriteLocalSet, LengthCountsTagsFixedLengthsAndValues) {
  RecordingKLVHandler handler;
  writeLocalSet(handler, keyOf(localSetKey), {{0x3c0a, bytesOf("01 02")}, {0x0102, ByteVector()}}, 0x83);
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{"startLocalSet " + dotted(localSetKey) + " 10 1 2", "startLocalItem 15370 2",
                                      "value 2", "endLocalItem 15370", "startLocalItem 258 0", "endLocalItem 258",
                                      "endLocalSet " + dotted(localSetKey)}));
}

TEST(WriteLocalSet, BERItemLengthsTakeTheOctetsOfTheForm) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  writer.startStream(true);
  writer.setLengthForm(0x83);
  writeLocalSet(writer, keyOf(berLocalSetKey), {{0x3c0a, bytesOf("ee")}}, 0x83);
  EXPECT_EQ(outputOf(out), join({bytesOf(berLocalSetKey), bytesOf("83 00 00 07 3c 0a 83 00 00 01 ee")}));
}

TEST(WriteLocalSet, EndsASetThatTheHandlerDeclined) {
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  writeLocalSet(handler, keyOf(localSetKey), {{1, bytesOf("01")}}, 0x83);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"startLocalSet " + dotted(localSetKey) + " 5 1 2",
                                                      "endLocalSet " + dotted(localSetKey)}));
}

TEST(WriteLocalSet, SendsNoValueForAnItemThatTheHandlerDeclined) {
  // Takes the set but no item.
  struct SetOnly : RecordingKLVHandler {
    bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override {
      RecordingKLVHandler::startLocalItem(tag, length, buffer);
      return false;
    }
  } handler;
  writeLocalSet(handler, keyOf(localSetKey), {{1, bytesOf("01")}}, 0x83);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"startLocalSet " + dotted(localSetKey) + " 5 1 2",
                                                      "startLocalItem 1 1", "endLocalItem 1",
                                                      "endLocalSet " + dotted(localSetKey)}));
}

TEST(WriteLocalSet, RefusesAKeyWithoutLocalSetCoding) {
  RecordingKLVHandler handler;
  EXPECT_EQ(assertionOf([&] { writeLocalSet(handler, keyOf(berTaggedSetKey), {}, 0x83); }),
            "assertion failure: valid local set key");
  EXPECT_EQ(assertionOf([&] { writeLocalSet(handler, keyOf(itemKey), {}, 0x83); }),
            "assertion failure: valid local set key");
  EXPECT_TRUE(handler.events.empty());
}
