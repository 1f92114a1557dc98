#include <gtest/gtest.h>

#include "klv.h"
#include "support/klv_streams.h"
#include "support/recording.h"

using zelta_test::keyOf;
using zelta_test::RecordingKLVHandler;
using zelta_test::klv::assertionOf;

namespace {

const char* const itemKey = "06 0e 2b 34 01 02 01 01 0d 01 03 01 15 01 05 00";

}  // namespace

TEST(DullKLVFilter, WithoutNextHandlerFailsHandlerIsPresentOnItsFirstEvent) {
  DullKLVFilter filter;
  EXPECT_EQ(assertionOf([&] { filter.startStream(true); }), "assertion failure: handler is present");
  EXPECT_EQ(assertionOf([&] { filter.getHandler(); }), "assertion failure: handler is present");
}

TEST(DullKLVFilter, PassesEventsResultsAndBuffersThrough) {
  RecordingKLVHandler next(RecordingKLVHandler::takeIntoBuffer);
  DullKLVFilter filter(&next);
  EXPECT_EQ(filter.getHandler(), &next);
  filter.startStream(true);
  filter.setLengthForm(0x83);
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(filter.startLocalItem(7, 3, buffer));
  EXPECT_NE(buffer, nullptr);
  filter.value(buffer, 3);
  filter.endLocalItem(7);
  filter.endStream(false);
  EXPECT_EQ(next.events, (std::vector<std::string>{"startStream 1", "setLengthForm 131", "startLocalItem 7 3",
                                                   "value 3", "endLocalItem 7", "endStream 0"}));
}

TEST(DullKLVFilter, NextHandlerCanBeSetLater) {
  DullKLVFilter filter;
  RecordingKLVHandler next(RecordingKLVHandler::skip);
  filter.setHandler(&next);
  EXPECT_FALSE(filter.startLabel(keyOf(itemKey)));
  EXPECT_EQ(next.events.size(), 1u);
}

TEST(DullKLVHandler, DeclinesEveryValueAndLeavesTheBufferAlone) {
  DullKLVHandler handler;
  const KLVKey key = keyOf(itemKey);
  std::uint8_t* buffer = nullptr;
  EXPECT_FALSE(handler.startIndividualItem(key, 1, buffer));
  EXPECT_FALSE(handler.startLabel(key));
  EXPECT_FALSE(handler.startUniversalSet(key, 1));
  EXPECT_FALSE(handler.startLocalSet(key, 1, 1, 2));
  EXPECT_FALSE(handler.startLocalItem(1, 1, buffer));
  EXPECT_FALSE(handler.startFixedLengthPack(key, 1, buffer));
  EXPECT_FALSE(handler.startVariableLengthPack(key, 1, 0));
  EXPECT_FALSE(handler.startVariableLengthItem(1, buffer));
  EXPECT_FALSE(handler.startWrapper(key, 1, true, buffer));
  EXPECT_EQ(buffer, nullptr);
}
