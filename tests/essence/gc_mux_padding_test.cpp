// Groups of elements brought to exact lengths and alignments by the muxer's
// structure handler.
#include <gtest/gtest.h>

#include "essence/gc_mux_fixture.h"
#include "support/klv_streams.h"

using namespace zelta_test;
using namespace zelta_test::gcmux;
using zelta_test::klv::assertionOf;
using zelta_test::klv::join;

namespace {

// A picture element of value length `length`: 20 octets more on file.
void writePicture(MuxedContainer& container, std::size_t length) {
  const ByteVector value(length, 0x5A);
  container.essence().pictureElement(pictureKey, value.data(), value.size());
}

ByteVector pictureItem(std::size_t length) {
  ByteVector item = bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 83 00");
  item.push_back(static_cast<std::uint8_t>(length >> 8));
  item.push_back(static_cast<std::uint8_t>(length));
  item.insert(item.end(), length, 0x5A);
  return item;
}

}  // namespace

TEST(MXFGCStructurePadder, StartAndEndOpenAndCloseTheKLVStreamWithFourOctetFill) {
  RecordingKLVHandler recorder;
  MXFGCMuxer muxer(&recorder);
  muxer.getStructureHandler()->start(512);
  muxer.getStructureHandler()->end();
  EXPECT_EQ(recorder.events,
            (std::vector<std::string>{"setLocator", "startStream 1", "setLengthForm 131", "endStream 0"}));
  EXPECT_EQ(recorder.locator, muxer.getLocator());
}

TEST(MXFGCStructurePadder, EditUnitAndSliceEventsWriteNothing) {
  RecordingKLVHandler recorder;
  MXFGCMuxer muxer(&recorder);
  MXFGCStructureHandler& structure = *muxer.getStructureHandler();
  structure.start(512);
  structure.startEditUnit();
  structure.startSlice();
  structure.endSlice();
  structure.endEditUnit();
  EXPECT_EQ(recorder.events.size(), 3u);
  EXPECT_EQ(muxer.getLocator()->getPosition(), 0);
}

TEST(MXFGCStructurePadder, PaddedLengthEqualToTheGroupsExactSizeWritesNoFill) {
  MuxedContainer container;
  container.structure().start(0);
  container.structure().startPaddedElement(20 + 80);
  writePicture(container, 80);
  container.structure().endPaddedElement();
  container.structure().end();
  EXPECT_EQ(container.bytes(), pictureItem(80));
}

TEST(MXFGCStructurePadder, PaddedGroupIsFilledToItsExactLengthAtItsEnd) {
  MuxedContainer container;
  container.structure().start(0);
  container.structure().startPaddedElement(100);
  writePicture(container, 30);
  EXPECT_EQ(container.position(), 50);
  container.structure().endPaddedElement();
  container.structure().end();
  EXPECT_EQ(container.bytes(), join({pictureItem(30), fillHeader(30), ByteVector(30, 0)}));
}

TEST(MXFGCStructurePadder, PaddedGroupLeavingExactlyAFillItemsOverheadGetsAnEmptyFillItem) {
  MuxedContainer container;
  container.structure().start(0);
  container.structure().startPaddedElement(70);
  writePicture(container, 30);
  container.structure().endPaddedElement();
  EXPECT_EQ(container.bytes(), join({pictureItem(30), fillHeader(0)}));
}

TEST(MXFGCStructurePadder, PaddedLengthIsAMultipleOfTheKAG) {
  MuxedContainer container;
  container.structure().start(256);
  container.structure().startPaddedElement(512);
  writePicture(container, 100);
  container.structure().endPaddedElement();
  const ByteVector bytes = container.bytes();
  ASSERT_EQ(bytes.size(), 512u);
  EXPECT_EQ(slice(bytes, 120, 140), fillHeader(512 - 120 - 20));
}

TEST(MXFGCStructurePadder, PaddedLengthThatIsNoMultipleOfTheKAGFails) {
  MuxedContainer container;
  container.structure().start(512);
  EXPECT_EQ(assertionOf([&] { container.structure().startPaddedElement(1000); }),
            "assertion failure: padded length is multiple of alignment");
}

TEST(MXFGCStructurePadder, GroupLeavingNoRoomForTheFillItemsKeyAndLengthFails) {
  MuxedContainer container;
  container.structure().start(0);
  // 50 octets written, 19 left: a fill item needs 20 for its key and length.
  container.structure().startPaddedElement(50 + 19);
  writePicture(container, 30);
  EXPECT_EQ(assertionOf([&] { container.structure().endPaddedElement(); }),
            "assertion failure: achievable padded length");
}

TEST(MXFGCStructurePadder, GroupOverflowingItsPaddedLengthFails) {
  MuxedContainer container;
  container.structure().start(0);
  container.structure().startPaddedElement(40);
  writePicture(container, 30);
  EXPECT_EQ(assertionOf([&] { container.structure().endPaddedElement(); }),
            "assertion failure: achievable padded length");
}

TEST(MXFGCStructurePadder, AlignedElementZeroAlignsOnTheKAG) {
  MuxedContainer container;
  container.structure().start(256);
  container.structure().startAlignedElement(0);
  writePicture(container, 50);
  container.structure().endAlignedElement();
  EXPECT_EQ(container.bytes(), join({pictureItem(50), fillHeader(256 - 70 - 20), ByteVector(256 - 90, 0)}));
}

TEST(MXFGCStructurePadder, AlignedElementZeroWithKAGZeroWritesNothingAtTheEnd) {
  MuxedContainer container;
  container.structure().start(0);
  container.structure().startAlignedElement(0);
  writePicture(container, 50);
  container.structure().endAlignedElement();
  EXPECT_EQ(container.bytes(), pictureItem(50));
}

TEST(MXFGCStructurePadder, AlignedGroupWithTooLittleRoomForTheFillRunsIntoTheNextUnit) {
  MuxedContainer container;
  container.structure().start(256);
  container.structure().startAlignedElement(512);
  // 500 octets: the 12 left cannot hold a fill item's key and length.
  writePicture(container, 480);
  container.structure().endAlignedElement();
  const ByteVector bytes = container.bytes();
  ASSERT_EQ(bytes.size(), 1024u);
  EXPECT_EQ(slice(bytes, 500, 520), fillHeader(1024 - 520));
}

TEST(MXFGCStructurePadder, AlignedGroupEndingOnTheAlignmentWritesNoFill) {
  MuxedContainer container;
  container.structure().start(256);
  container.structure().startAlignedElement(256);
  writePicture(container, 236);
  container.structure().endAlignedElement();
  EXPECT_EQ(container.bytes(), pictureItem(236));
}

TEST(MXFGCStructurePadder, AlignmentIsAMultipleOfTheKAGSize) {
  MuxedContainer container;
  container.structure().start(512);
  EXPECT_EQ(assertionOf([&] { container.structure().startAlignedElement(100); }),
            "assertion failure: alignment is multiple of KAG size");
}

TEST(MXFGCStructurePadder, AnyAlignmentIsAcceptedWithKAGZero) {
  MuxedContainer container;
  container.structure().start(0);
  container.structure().startAlignedElement(100);
  writePicture(container, 50);
  container.structure().endAlignedElement();
  const ByteVector bytes = container.bytes();
  ASSERT_EQ(bytes.size(), 100u);
  EXPECT_EQ(slice(bytes, 70, 90), fillHeader(10));
}
