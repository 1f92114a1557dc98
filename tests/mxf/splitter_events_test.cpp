// The splitter driven by hand, event by event, with a locator of the test.
#include <gtest/gtest.h>

#include "mxf.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

class HandLocator : public Locator {
public:
  const std::streampos& getPosition() override { return position; }
  std::streampos position = 0;
};

class SplitterEvents : public ::testing::Test {
protected:
  SplitterEvents() : splitter(&structure, &metadata, &index, &essence, false) { splitter.setLocator(&locator); }

  void startAt(std::streamoff position) {
    locator.position = position;
    splitter.startStream(true);
  }

  // A header partition pack of 108 octets at the position, with the given
  // byte counts, without fill.
  void packAt(std::streamoff position, std::uint64_t headerByteCount, std::uint64_t indexByteCount) {
    ByteVector value = packValue(packWithCounts(headerByteCount, indexByteCount));
    std::uint8_t* buffer = nullptr;
    splitter.setLengthForm(0x83);
    locator.position = position + 20;
    splitter.startFixedLengthPack(partitionKey(2, 4), value.size(), buffer);
    locator.position = position + 108;
    splitter.value(value.data(), static_cast<std::streamsize>(value.size()));
    splitter.endFixedLengthPack(partitionKey(2, 4));
  }

  // An essence item of 10 octets at the position.
  void itemAt(std::streamoff position) {
    std::uint8_t* buffer = nullptr;
    std::uint8_t octets[10] = {};
    locator.position = position + 20;
    splitter.startIndividualItem(essenceElementKey(), 10, buffer);
    locator.position = position + 30;
    splitter.value(octets, 10);
    splitter.endIndividualItem(essenceElementKey());
  }

  HandLocator locator;
  RecordingStructureHandler structure;
  RecordingKLVHandler metadata;
  RecordingKLVHandler index;
  RecordingKLVHandler essence;
  MXFSplitter splitter;
};

}  // namespace

TEST_F(SplitterEvents, StartStreamRequiresALocator) {
  MXFSplitter fresh(&structure, &metadata, &index, &essence, false);
  EXPECT_EQ("assertion failure: has locator", assertionTextOf([&] { fresh.startStream(true); }));
}

TEST_F(SplitterEvents, StartStreamRequiresAccurateLengths) {
  EXPECT_EQ("assertion failure: has accurate lengths", assertionTextOf([&] { splitter.startStream(false); }));
}

TEST_F(SplitterEvents, SecondStartStreamFailsBeforeStart) {
  startAt(0);
  EXPECT_EQ("assertion failure: before start", assertionTextOf([&] { splitter.startStream(true); }));
}

TEST_F(SplitterEvents, RunInGoesToTheStructureHandlerBeforeStartOnly) {
  splitter.setRunIn(12);
  EXPECT_EQ(std::vector<std::string>{"setRunIn 12"}, structure.events);
  startAt(12);
  EXPECT_EQ("assertion failure: before start", assertionTextOf([&] { splitter.setRunIn(12); }));
}

TEST_F(SplitterEvents, EventsOutsideADelegatingStateFailTheirChecks) {
  startAt(0);
  std::uint8_t* buffer = nullptr;
  std::uint8_t octet = 0;
  KLVKey key = essenceElementKey();
  EXPECT_EQ("assertion failure: expected value", assertionTextOf([&] { splitter.value(&octet, 1); }));
  EXPECT_EQ("assertion failure: expected individual item", assertionTextOf([&] { splitter.endIndividualItem(key); }));
  EXPECT_EQ("assertion failure: expected label", assertionTextOf([&] { splitter.endLabel(key); }));
  EXPECT_EQ("assertion failure: expected universal set", assertionTextOf([&] { splitter.endUniversalSet(key); }));
  EXPECT_EQ("assertion failure: expected local set", assertionTextOf([&] { splitter.endLocalSet(key); }));
  EXPECT_EQ("assertion failure: expected local item",
            assertionTextOf([&] { splitter.startLocalItem(1, 1, buffer); }));
  EXPECT_EQ("assertion failure: expected local item", assertionTextOf([&] { splitter.endLocalItem(1); }));
  EXPECT_EQ("assertion failure: expected fixed length pack",
            assertionTextOf([&] { splitter.endFixedLengthPack(key); }));
  EXPECT_EQ("assertion failure: expected variable length pack",
            assertionTextOf([&] { splitter.endVariableLengthPack(key); }));
  EXPECT_EQ("assertion failure: expected variable length item",
            assertionTextOf([&] { splitter.startVariableLengthItem(1, buffer); }));
  EXPECT_EQ("assertion failure: expected variable length item",
            assertionTextOf([&] { splitter.endVariableLengthItem(); }));
  EXPECT_EQ("assertion failure: expected wrapper", assertionTextOf([&] { splitter.endWrapper(key); }));
}

TEST_F(SplitterEvents, PackValueEndingUnderAnotherKeyFailsExpectedFixedLengthPack) {
  startAt(0);
  std::uint8_t* buffer = nullptr;
  locator.position = 20;
  splitter.startFixedLengthPack(partitionKey(2, 4), 88, buffer);
  EXPECT_EQ("assertion failure: expected fixed length pack",
            assertionTextOf([&] { splitter.endFixedLengthPack(randomIndexKey()); }));
}

TEST_F(SplitterEvents, PackValueIsTakenByValueEventsWithoutABuffer) {
  startAt(0);
  std::uint8_t* buffer = nullptr;
  locator.position = 20;
  EXPECT_TRUE(splitter.startFixedLengthPack(partitionKey(2, 4), 88, buffer));
  EXPECT_EQ(nullptr, buffer);
}

TEST_F(SplitterEvents, FillBehindThePackIsDeclined) {
  startAt(0);
  packAt(0, 0, 0);
  std::uint8_t* buffer = nullptr;
  locator.position = 128;
  EXPECT_FALSE(splitter.startIndividualItem(fillKey(2), 100, buffer));
  EXPECT_EQ(1u, structure.events.size());
  locator.position = 228;
  splitter.endIndividualItem(fillKey(2));
  EXPECT_EQ("startPartition " + toString(partitionKey(2, 4)) + " 228", structure.events.at(1));
}

TEST_F(SplitterEvents, PartitionStartIsWhereThePacksKeyBegins) {
  startAt(1000);
  packAt(1000, 0, 0);
  itemAt(1108);
  EXPECT_EQ("startPartition " + toString(partitionKey(2, 4)) + " 108", structure.events.at(1));
  EXPECT_TRUE(metadata.events.empty());
  EXPECT_EQ("startIndividualItem " + toString(essenceElementKey()) + " 10", essence.events.at(3));
}

TEST_F(SplitterEvents, DelegatesSeeTheStoredPositionNotTheLiveOne) {
  startAt(0);
  packAt(0, 0, 0);
  itemAt(108);
  ASSERT_NE(nullptr, essence.locator);
  EXPECT_EQ(138, essence.locator->getPosition());
  locator.position = 5000;
  EXPECT_EQ(138, essence.locator->getPosition());
  splitter.endStream(false);
  EXPECT_EQ(5000, essence.locator->getPosition());
}

TEST_F(SplitterEvents, AbortedEndStreamSkipsTheByteCountsAndEndsEveryStartedStream) {
  startAt(0);
  packAt(0, 1000, 0);
  std::uint8_t* buffer = nullptr;
  locator.position = 128;
  splitter.startIndividualItem(essenceElementKey(), 10, buffer);
  splitter.endStream(true);
  EXPECT_EQ("endStream 1", metadata.events.back());
  EXPECT_EQ((std::vector<std::string>{"startStream", "startPartition " + toString(partitionKey(2, 4)) + " 108",
                                      "endPartition " + toString(partitionKey(2, 4)), "endStream 1"}),
            structure.events);
}

TEST_F(SplitterEvents, EndStreamForgetsTheUpstreamLocator) {
  startAt(0);
  splitter.endStream(false);
  EXPECT_EQ("assertion failure: has locator", assertionTextOf([&] { splitter.endStream(true); }));
  EXPECT_EQ((std::vector<std::string>{"startStream", "endStream 0"}), structure.events);
}

TEST_F(SplitterEvents, ByteCountReportGoesToTheErrorHandlerBeforeTheThrow) {
  RecordingErrorHandler errors;
  splitter.setErrorHandler(&errors);
  startAt(0);
  packAt(0, 5, 0);
  EXPECT_EQ("incorrect headerByteCount", runtimeErrorTextOf([&] { itemAt(108); }));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("fatal", errors.reports[0].severity);
  EXPECT_EQ(partitionByteCountId, errors.reports[0].identifier);
  EXPECT_EQ("incorrect headerByteCount", errors.reports[0].message);
}
