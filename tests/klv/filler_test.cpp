#include <gtest/gtest.h>

#include <algorithm>
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
using zelta_test::klv::SettableLocator;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";
const char* const fillKey = "06 0e 2b 34 01 01 01 01 03 01 02 10 01 00 00 00";

const std::string fillStart = "startIndividualItem " + toString(keyOf(fillKey)) + " ";
const std::string fillEnd = "endIndividualItem " + toString(keyOf(fillKey));

// A filler on a hand-set locator in front of a recording handler.
struct FillerBench {
  explicit FillerBench(std::uint8_t form, RecordingKLVHandler::Policy policy = RecordingKLVHandler::take)
      : next(policy), filler(&next) {
    filler.setLocator(&locator);
    filler.setLengthForm(form);
    next.events.clear();
  }

  // The events that closing a filled item of `written` octets sends on.
  std::vector<std::string> fill(std::uint64_t written) {
    locator.setPosition(1000);
    filler.startFilledItem();
    locator.setPosition(1000 + static_cast<std::streamoff>(written));
    filler.endFilledItem();
    return next.events;
  }

  SettableLocator locator;
  RecordingKLVHandler next;
  KLVFiller filler;
};

std::vector<std::string> fillEvents(std::uint8_t form, std::uint64_t length, std::vector<std::string> values = {}) {
  std::vector<std::string> events{"setLengthForm " + std::to_string(form), fillStart + std::to_string(length)};
  events.insert(events.end(), values.begin(), values.end());
  events.push_back(fillEnd);
  return events;
}

}  // namespace

TEST(KLVFiller, ExactLengthWithRoomForOnlyTheOverheadWritesAnEmptyFillItem) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::exactLengthMode, 0, 120);
  EXPECT_EQ(bench.fill(100), fillEvents(0x83, 0));
}

TEST(KLVFiller, ExactLengthOneOctetShortOfTheOverheadFailsAchievablePaddedLength) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::exactLengthMode, 0, 119);
  EXPECT_EQ(assertionOf([&] { bench.fill(100); }), "assertion failure: achievable padded length");
  EXPECT_TRUE(bench.next.events.empty());
}

TEST(KLVFiller, ExactLengthBeyondThePaddedLengthFailsAchievablePaddedLength) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::exactLengthMode, 0, 120);
  EXPECT_EQ(assertionOf([&] { bench.fill(121); }), "assertion failure: achievable padded length");
}

TEST(KLVFiller, ExactLengthAlreadyReachedWritesNoFillItem) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::exactLengthMode, 0, 120);
  EXPECT_TRUE(bench.fill(120).empty());
}

TEST(KLVFiller, ExactLengthFillsWithZerosInPiecesOf4096) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::exactLengthMode, 0, 10000);
  EXPECT_EQ(bench.fill(100), fillEvents(0x83, 9880, {"value 4096", "value 4096", "value 1688"}));
  EXPECT_EQ(bench.next.values, ByteVector(9880, 0));
}

TEST(KLVFiller, AlignmentOf512AfterWritten510UnderShortFormReachesTheBoundaryButOne) {
  FillerBench bench(1);
  bench.filler.setFillMode(KLVFiller::alignmentMode, 512, 0);
  EXPECT_EQ(bench.fill(510), fillEvents(1, 497, {"value 497"}));
}

TEST(KLVFiller, AlignmentFillsToTheNextBoundary) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::alignmentMode, 256, 0);
  EXPECT_EQ(bench.fill(100), fillEvents(0x83, 136, {"value 136"}));
}

TEST(KLVFiller, AlignmentWithARemainderOfExactlyTheOverheadWritesAnEmptyFillItem) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::alignmentMode, 512, 0);
  EXPECT_EQ(bench.fill(492), fillEvents(0x83, 0));
}

TEST(KLVFiller, AlignmentAtABoundaryWritesNoFillItem) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::alignmentMode, 512, 0);
  EXPECT_TRUE(bench.fill(1024).empty());
}

TEST(KLVFiller, AlignmentZeroWritesNoFillItem) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::alignmentMode, 0, 0);
  EXPECT_TRUE(bench.fill(3).empty());
}

TEST(KLVFiller, FillWithoutAReportedFormFailsValidBERLengthForm) {
  RecordingKLVHandler next;
  KLVFiller filler(&next);
  SettableLocator locator;
  filler.setLocator(&locator);
  filler.setFillMode(KLVFiller::exactLengthMode, 0, 100);
  filler.startFilledItem();
  locator.setPosition(10);
  EXPECT_EQ(assertionOf([&] { filler.endFilledItem(); }), "assertion failure: valid BER length form");
}

TEST(KLVFiller, ExactPaddedLengthMustBeAMultipleOfTheAlignment) {
  KLVFiller filler;
  EXPECT_EQ(assertionOf([&] { filler.setFillMode(KLVFiller::exactLengthMode, 512, 1000); }),
            "assertion failure: padded length is multiple of alignment");
  filler.setFillMode(KLVFiller::exactLengthMode, 512, 1024);
  filler.setFillMode(KLVFiller::exactLengthMode, 0, 1000);
  filler.setFillMode(KLVFiller::alignmentMode, 512, 1000);
  EXPECT_EQ(filler.getFillMode(), KLVFiller::alignmentMode);
  EXPECT_EQ(filler.getAlignment(), 512u);
  EXPECT_EQ(filler.getPaddedLength(), 1000u);
}

TEST(KLVFiller, FilledItemsDoNotNest) {
  FillerBench bench(0x83);
  bench.filler.startFilledItem();
  EXPECT_EQ(assertionOf([&] { bench.filler.startFilledItem(); }), "assertion failure: not in filled item");
  bench.filler.endFilledItem();
  EXPECT_EQ(assertionOf([&] { bench.filler.endFilledItem(); }), "assertion failure: in filled item");
}

TEST(KLVFiller, FailedFillLeavesTheFilledItem) {
  FillerBench bench(0x83);
  bench.filler.setFillMode(KLVFiller::exactLengthMode, 0, 10);
  EXPECT_EQ(assertionOf([&] { bench.fill(5); }), "assertion failure: achievable padded length");
  bench.filler.startFilledItem();
}

TEST(KLVFiller, TakesItsLocatorFromSetLocatorAndForgetsItAtEndStream) {
  RecordingKLVHandler next;
  KLVFiller filler(&next);
  EXPECT_EQ(assertionOf([&] { filler.getLocator(); }), "assertion failure: locator is present");
  EXPECT_EQ(assertionOf([&] { filler.startFilledItem(); }), "assertion failure: locator is present");
  SettableLocator locator;
  filler.setLocator(&locator);
  EXPECT_EQ(filler.getLocator(), &locator);
  EXPECT_EQ(next.locator, &locator);
  filler.startStream(true);
  filler.endStream(false);
  EXPECT_EQ(assertionOf([&] { filler.getLocator(); }), "assertion failure: locator is present");
  EXPECT_EQ(next.events, (std::vector<std::string>{"setLocator", "startStream 1", "endStream 0"}));
}

TEST(KLVFiller, FillsAWriterToTheExactLength) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  KLVFiller filler(&writer);
  KLVMonitor monitor(&filler);
  monitor.startStream(true);
  monitor.setLengthForm(0x83);
  filler.setFillMode(KLVFiller::exactLengthMode, 0, 64);
  filler.startFilledItem();
  const ByteVector data = bytesOf("01 02 03");
  writeIndividualItem(monitor, keyOf(itemKey), data.data(), data.size());
  filler.endFilledItem();
  monitor.endStream(false);
  EXPECT_EQ(outputOf(out), join({bytesOf(itemKey), bytesOf("83 00 00 03 01 02 03"), bytesOf(fillKey),
                                 bytesOf("83 00 00 15"), ByteVector(21, 0)}));
}

TEST(KLVStreamPadder, AlignmentZeroWritesNoFill) {
  RecordingKLVHandler next;
  KLVStreamPadder padder(&next);
  KLVMonitor monitor(&padder);
  padder.setFillMode(KLVFiller::alignmentMode, 0, 0);
  monitor.startStream(true);
  monitor.setLengthForm(1);
  writeIndividualItem(monitor, keyOf(itemKey), bytesOf("01").data(), 1);
  monitor.endStream(false);
  EXPECT_EQ(next.events, (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 1",
                                                   "startIndividualItem " + toString(keyOf(itemKey)) + " 1",
                                                   "value 1", "endIndividualItem " + toString(keyOf(itemKey)),
                                                   "endStream 0"}));
}

TEST(KLVStreamPadder, PadsTheWholeStreamWithTheFillLast) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  KLVStreamPadder padder(&writer);
  KLVMonitor monitor(&padder);
  padder.setFillMode(KLVFiller::alignmentMode, 256, 0);
  monitor.startStream(true);
  monitor.setLengthForm(0x83);
  const ByteVector data(80, 0xab);
  writeIndividualItem(monitor, keyOf(itemKey), data.data(), data.size());
  writeIndividualItem(monitor, keyOf(itemKey), data.data(), data.size());
  monitor.endStream(false);
  const ByteVector item = join({bytesOf(itemKey), bytesOf("83 00 00 50"), data});
  EXPECT_EQ(outputOf(out), join({item, item, bytesOf(fillKey), bytesOf("83 00 00 24"), ByteVector(36, 0)}));
}

TEST(KLVStreamPadder, CanPadOneStreamAfterAnother) {
  RecordingKLVHandler next;
  KLVStreamPadder padder(&next);
  KLVMonitor monitor(&padder);
  padder.setFillMode(KLVFiller::exactLengthMode, 0, 40);
  for (int stream = 0; stream < 2; ++stream) {
    monitor.getMonitoredLocator().reset();
    monitor.startStream(true);
    monitor.setLengthForm(1);
    writeIndividualItem(monitor, keyOf(itemKey), bytesOf("01").data(), 1);
    monitor.endStream(false);
  }
  EXPECT_EQ(std::count(next.events.begin(), next.events.end(), fillStart + "5"), 2);
}

TEST(KLVStreamFilter, LetsProducersWriteInTurnIntoOneStream) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  KLVStreamFilter filter(&writer);
  NullLocator locator;
  writer.startStream(true);
  writer.setLengthForm(1);
  for (std::uint8_t producer = 1; producer <= 2; ++producer) {
    filter.setLocator(&locator);
    filter.startStream(true);
    writeIndividualItem(filter, keyOf(itemKey), &producer, 1);
    filter.endStream(false);
  }
  writer.endStream(false);
  EXPECT_EQ(outputOf(out), join({bytesOf(itemKey), bytesOf("01 01"), bytesOf(itemKey), bytesOf("01 02")}));
}

TEST(KLVStreamFilter, PassesElementEvents) {
  RecordingKLVHandler next;
  KLVStreamFilter filter(&next);
  NullLocator locator;
  filter.setLocator(&locator);
  filter.startStream(true);
  filter.setLengthForm(1);
  writeIndividualItem(filter, keyOf(itemKey), bytesOf("01").data(), 1);
  filter.endStream(true);
  EXPECT_EQ(next.events, (std::vector<std::string>{"setLengthForm 1",
                                                   "startIndividualItem " + toString(keyOf(itemKey)) + " 1",
                                                   "value 1", "endIndividualItem " + toString(keyOf(itemKey))}));
}

TEST(WriteFillItem, SendsTheFormAndZerosInPiecesOf4096) {
  RecordingKLVHandler handler;
  writeFillItem(handler, 8193, 0x83);
  EXPECT_EQ(handler.events, fillEvents(0x83, 8193, {"value 4096", "value 4096", "value 1"}));
  EXPECT_EQ(handler.values, ByteVector(8193, 0));
}

TEST(WriteFillItem, SendsNoValueToAHandlerThatDeclines) {
  RecordingKLVHandler handler(RecordingKLVHandler::skip);
  writeFillItem(handler, 100, 0x83);
  EXPECT_EQ(handler.events, fillEvents(0x83, 100));
}

TEST(WriteFillItem, ZeroesTheBufferThatTheHandlerNamed) {
  RecordingKLVHandler handler(RecordingKLVHandler::takeIntoBuffer);
  writeFillItem(handler, 5000, 0x83);
  EXPECT_EQ(handler.events, fillEvents(0x83, 5000, {"value 5000"}));
  EXPECT_EQ(handler.values, ByteVector(5000, 0));
}
