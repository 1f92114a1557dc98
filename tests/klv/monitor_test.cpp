#include <gtest/gtest.h>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::keyOf;
using zelta_test::RecordingKLVHandler;
using zelta_test::klv::assertionOf;
using zelta_test::klv::CountingStream;
using zelta_test::klv::join;
using zelta_test::klv::LocatedKLVHandler;
using zelta_test::klv::Seeking;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";
const char* const localSetKey = "06 0e 2b 34 02 53 01 01 0d 01 01 01 01 01 2f 00";
const char* const berLocalSetKey = "06 0e 2b 34 02 13 01 01 0d 01 01 01 01 01 2f 00";

std::streamoff positionOf(KLVMonitor& monitor) { return monitor.getLocator()->getPosition(); }

}  // namespace

TEST(KLVMonitor, DeclinedLocalSetEndsAfterKeyLengthAndValue) {
  DullKLVHandler declining;
  KLVMonitor monitor(&declining);
  monitor.startStream(true);
  monitor.setLengthForm(0x83);
  EXPECT_FALSE(monitor.startLocalSet(keyOf(localSetKey), 100, 1, 2));
  EXPECT_EQ(positionOf(monitor), 20);
  monitor.endLocalSet(keyOf(localSetKey));
  EXPECT_EQ(positionOf(monitor), 16 + 4 + 100);
}

TEST(KLVMonitor, DeclinedLocalSetOfAPipeLeavesTheNextElementWhereItIs) {
  const ByteVector bytes =
      join({bytesOf(localSetKey), bytesOf("83 00 00 06 3c 0a 00 02 aa bb"), bytesOf(itemKey), bytesOf("01 cc")});
  CountingStream stream(bytes, Seeking::notSeekable);
  LocatedKLVHandler handler(RecordingKLVHandler::skip);
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  ASSERT_EQ(handler.events.size(), 9u);
  EXPECT_EQ(handler.events[4], "endLocalSet " + zelta_test::toString(keyOf(localSetKey)));
  EXPECT_EQ(handler.positions[4], 16 + 4 + 6);
  EXPECT_EQ(handler.events[6], "startIndividualItem " + zelta_test::toString(keyOf(itemKey)) + " 1");
  EXPECT_EQ(handler.positions[6], 26 + 16 + 1);
  EXPECT_EQ(handler.positions[8], static_cast<std::streamoff>(bytes.size()));
}

TEST(KLVMonitor, FormChangeInsideABERLocalSetMovesItemLengthOctets) {
  // Items of short form, then of form 0x82.
  const ByteVector bytes =
      join({bytesOf(berLocalSetKey), bytesOf("83 00 00 0d 01 01 02 aa bb 01 02 82 00 03 cc dd ee")});
  CountingStream stream(bytes, Seeking::notSeekable);
  LocatedKLVHandler handler;
  GenericKLVReader reader;
  reader.setHandler(&handler);
  reader.read(stream);
  const std::vector<std::string> expectedEvents = {
      "setLocator",
      "startStream 1",
      "setLengthForm 131",
      "startLocalSet " + zelta_test::toString(keyOf(berLocalSetKey)) + " 13 1 0",
      "setLengthForm 1",
      "startLocalItem 257 2",
      "value 2",
      "endLocalItem 257",
      "setLengthForm 130",
      "startLocalItem 258 3",
      "value 3",
      "endLocalItem 258",
      "endLocalSet " + zelta_test::toString(keyOf(berLocalSetKey)),
      "endStream 0"};
  EXPECT_EQ(handler.events, expectedEvents);
  const std::vector<std::streamoff> expectedPositions = {0, 0, 0, 20, 20, 23, 25, 25, 25, 30, 33, 33, 33, 33};
  EXPECT_EQ(handler.positions, expectedPositions);
}

TEST(KLVMonitor, FormChangeInsideABERLocalSetByHand) {
  DullKLVHandler declining;
  KLVMonitor monitor(&declining);
  monitor.startStream(true);
  monitor.setLengthForm(0x83);
  monitor.startLocalSet(keyOf(berLocalSetKey), 13, 1, 0);
  EXPECT_EQ(positionOf(monitor), 20);
  std::uint8_t* buffer = nullptr;
  monitor.startLocalItem(0x0101, 2, buffer);
  EXPECT_EQ(positionOf(monitor), 20 + 2 + 4);
  monitor.setLengthForm(0x01);
  monitor.endLocalItem(0x0101);
  EXPECT_EQ(positionOf(monitor), 28);
  monitor.startLocalItem(0x0102, 3, buffer);
  EXPECT_EQ(positionOf(monitor), 28 + 2 + 1);
}

TEST(KLVMonitor, FixedItemLengthsIgnoreTheForm) {
  DullKLVHandler declining;
  KLVMonitor monitor(&declining);
  monitor.startStream(true);
  monitor.setLengthForm(0x83);
  monitor.startLocalSet(keyOf(localSetKey), 100, 1, 3);
  monitor.setLengthForm(0x01);
  std::uint8_t* buffer = nullptr;
  monitor.startLocalItem(1, 0, buffer);
  EXPECT_EQ(positionOf(monitor), 20 + 2 + 4);
}

TEST(KLVMonitor, ElementLengthOctetsFollowTheLatestForm) {
  DullKLVHandler declining;
  KLVMonitor monitor(&declining);
  monitor.startStream(true);
  monitor.setLengthForm(0x01);
  monitor.startVariableLengthPack(keyOf(localSetKey), 0, 0);
  monitor.endVariableLengthPack(keyOf(localSetKey));
  EXPECT_EQ(positionOf(monitor), 17);
  monitor.setLengthForm(0x84);
  std::uint8_t* buffer = nullptr;
  monitor.startIndividualItem(keyOf(itemKey), 0, buffer);
  EXPECT_EQ(positionOf(monitor), 17 + 16 + 5);
}

TEST(KLVMonitor, LabelAddsTheKeyAlone) {
  DullKLVHandler declining;
  KLVMonitor monitor(&declining);
  monitor.startStream(true);
  monitor.startLabel(keyOf(itemKey));
  monitor.endLabel(keyOf(itemKey));
  EXPECT_EQ(positionOf(monitor), 16);
}

TEST(KLVMonitor, SkippedValueIsAddedAtEndStreamAndResetClearsThePosition) {
  DullKLVHandler declining;
  KLVMonitor monitor(&declining);
  monitor.startStream(true);
  monitor.setLengthForm(0x01);
  std::uint8_t* buffer = nullptr;
  monitor.startIndividualItem(keyOf(itemKey), 10, buffer);
  monitor.endStream(true);
  EXPECT_EQ(positionOf(monitor), 27);
  monitor.getMonitoredLocator().reset();
  EXPECT_EQ(positionOf(monitor), 0);
}

TEST(KLVMonitor, StartStreamWithoutAccurateLengthsFailsAccurateMonitoringIsPossible) {
  DullKLVHandler next;
  KLVMonitor monitor(&next);
  EXPECT_EQ(assertionOf([&] { monitor.startStream(false); }), "assertion failure: accurate monitoring is possible");
}

TEST(KLVMonitor, LengthOctetsBeforeAnyFormFailBERLengthFormHasBeenReported) {
  DullKLVHandler next;
  KLVMonitor monitor(&next);
  EXPECT_EQ(assertionOf([&] { monitor.getLengthOctets(); }), "assertion failure: BER length form has been reported");
  monitor.setLengthForm(0x82);
  EXPECT_EQ(monitor.getLengthOctets(), 3u);
}

TEST(KLVMonitor, HandsItsOwnLocatorOnAndIgnoresOthers) {
  RecordingKLVHandler next;
  KLVMonitor monitor(&next);
  NullLocator other;
  monitor.setLocator(&other);
  EXPECT_EQ(next.locator, nullptr);
  monitor.startStream(true);
  EXPECT_EQ(next.locator, monitor.getLocator());
  EXPECT_EQ(next.events, (std::vector<std::string>{"setLocator", "startStream 1"}));
}
