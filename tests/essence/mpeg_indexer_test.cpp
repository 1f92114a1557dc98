// The index entry calculation, the MPEG-2 picture scan and MXFMPEGIndexer
// between a producer of edit units and a muxer, on hand-built frames.
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "essence/gc_mux_fixture.h"
#include "essence/mpeg_indexer.h"
#include "support/essence_recording.h"
#include "support/klv_output.h"
#include "support/mpeg2_frames.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;
using zelta_test::klv::SettableLocator;

namespace {

typedef MPEGIndexer::Picture Picture;

// ---------------------------------------------------------------------------
// Frames

Picture scan(const ByteVector& bytes) { return zelta::scanMPEG2Picture(bytes.data(), bytes.size()); }

std::string scanFailure(const ByteVector& bytes) {
  return assertionTextOf([&] { scan(bytes); });
}

Picture picture(std::uint8_t type, std::uint16_t displayIndex, bool closed = false, bool sequenceHeader = false) {
  Picture p;
  p.pictureType = type;
  p.displayIndex = displayIndex;
  p.closed = closed;
  p.sequenceHeader = sequenceHeader;
  return p;
}

// "temporal/key/flags" of an entry, as text for readable comparisons.
std::string entryText(const MXFIndexEntry& entry) {
  char text[32];
  std::snprintf(text, sizeof text, "%d/%d/%02X", entry.temporalOffset, entry.keyFrameOffset, entry.flags);
  return text;
}

// The entries of pictures given in stored order.
std::vector<std::string> entriesOf(const std::vector<Picture>& pictures) {
  MPEGIndexer indexer;
  std::vector<std::string> entries;
  for (const Picture& p : pictures) {
    indexer.addPicture(p);
    entries.push_back(entryText(indexer.indexEntry(0, {})));
  }
  return entries;
}

}  // namespace

// ---------------------------------------------------------------------------
// The calculation

TEST(MPEGIndexer, OpenGOPFirstIntraHasKeyPositionMinusOneAndItsBPicturesAreFlagged) {
  MPEGIndexer indexer;
  indexer.addPicture(picture(1, 2, false, true));
  EXPECT_EQ(indexer.getKeyPosition(), -1);
  EXPECT_EQ(indexer.getFlags(), 0x40);
  indexer.addPicture(picture(3, 0));
  EXPECT_EQ(indexer.getFlags(), 0x33 | 0x08);
  EXPECT_EQ(indexer.indexEntry(0, {}).keyFrameOffset, -2);
  indexer.addPicture(picture(3, 1));
  EXPECT_EQ(indexer.getFlags(), 0x33 | 0x08);
  // The next P picture depends on the I picture, which is in the stream.
  indexer.addPicture(picture(2, 5));
  EXPECT_EQ(indexer.getFlags(), 0x22);
  indexer.addPicture(picture(3, 3));
  EXPECT_EQ(indexer.getFlags(), 0x33);
}

TEST(MPEGIndexer, OpenGOPEntriesMoveBPicturesBeforeTheirIntra) {
  EXPECT_EQ(entriesOf({picture(1, 2, false, true), picture(3, 0), picture(3, 1), picture(2, 5), picture(3, 3),
                       picture(3, 4)}),
            (std::vector<std::string>{"1/0/40", "1/-2/3B", "-2/-3/3B", "1/-3/22", "1/-4/33", "-2/-5/33"}));
}

TEST(MPEGIndexer, ClosedGOPWithSequenceHeaderGivesC0AndKeyFrameOffsetZero) {
  MPEGIndexer indexer;
  indexer.addPicture(picture(1, 0, true, true));
  const MXFIndexEntry entry = indexer.indexEntry(0x1234, {7});
  EXPECT_EQ(entry.flags, 0xC0);
  EXPECT_EQ(entry.keyFrameOffset, 0);
  EXPECT_EQ(entry.temporalOffset, 0);
  EXPECT_EQ(entry.streamOffset, 0x1234u);
  EXPECT_EQ(entry.sliceOffsets, (std::vector<std::uint32_t>{7}));
  EXPECT_TRUE(entry.posTable.empty());
  EXPECT_EQ(indexer.getKeyPosition(), 0);
}

TEST(MPEGIndexer, ClosedGOPWithoutSequenceHeaderIsNoRandomAccessPoint) {
  MPEGIndexer indexer;
  indexer.addPicture(picture(1, 0, true, false));
  EXPECT_EQ(indexer.getFlags(), 0x00);
  EXPECT_EQ(indexer.getKeyPosition(), 0);
}

// I P B B P B B as MPEG-2 long-GOP writers code a closed GOP: the anchor
// entries jump back by two, the B entries move by one.
TEST(MPEGIndexer, ClosedGOPEntriesOfIPBBPBB) {
  EXPECT_EQ(entriesOf({picture(1, 0, true, true), picture(2, 3), picture(3, 1), picture(3, 2), picture(2, 6),
                       picture(3, 4), picture(3, 5), picture(1, 0, true, true), picture(2, 3)}),
            (std::vector<std::string>{"0/0/C0", "1/-1/22", "1/-2/33", "-2/-3/33", "1/-4/22", "1/-5/33", "-2/-6/33",
                                      "0/0/C0", "1/-1/22"}));
}

TEST(MPEGIndexer, BPictureWhoseAnchorIsTheKeyPredictsBackwardOnly) {
  MPEGIndexer indexer;
  indexer.addPicture(picture(1, 1, true, true));
  indexer.addPicture(picture(3, 0));
  EXPECT_EQ(indexer.getAnchorPosition(), indexer.getKeyPosition());
  EXPECT_EQ(indexer.getFlags(), 0x13);
}

TEST(MPEGIndexer, SecondOpenGOPTakesThePreviousIntraAsKey) {
  MPEGIndexer indexer;
  indexer.addPicture(picture(1, 0, true, true));
  indexer.addPicture(picture(2, 1));
  indexer.addPicture(picture(1, 2, false, true));
  EXPECT_EQ(indexer.getKeyPosition(), 0);
  EXPECT_EQ(indexer.getIntraPosition(), 2);
  EXPECT_EQ(indexer.getAnchorDisplayPosition(), 4);
  indexer.addPicture(picture(3, 0));
  EXPECT_EQ(indexer.getFlags(), 0x33);
  EXPECT_EQ(indexer.indexEntry(0, {}).keyFrameOffset, -3);
}

TEST(MPEGIndexer, ReferenceSetsFlag04) {
  MPEGIndexer indexer;
  Picture p = picture(1, 0, true, true);
  p.reference = true;
  indexer.addPicture(p);
  EXPECT_EQ(indexer.getFlags(), 0xC4);
  p = picture(3, 0);
  p.reference = true;
  indexer.addPicture(p);
  EXPECT_EQ(indexer.getFlags(), 0x17);
}

TEST(MPEGIndexer, OtherPictureTypesAreRefusedAndLeaveTheStateAlone) {
  MPEGIndexer indexer;
  indexer.addPicture(picture(1, 0, true, true));
  for (std::uint8_t type : {0, 4, 7})
    EXPECT_EQ(assertionTextOf([&] { indexer.addPicture(picture(type, 1)); }),
              "assertion failure: expected MPEG-2 picture_coding_type");
  EXPECT_EQ(indexer.getPosition(), 0);
  EXPECT_EQ(indexer.getFlags(), 0xC0);
}

TEST(MPEGIndexer, StateStartsAtMinusOne) {
  MPEGIndexer indexer;
  EXPECT_EQ(indexer.getPosition(), -1);
  EXPECT_EQ(indexer.getKeyPosition(), -1);
  EXPECT_EQ(indexer.getIntraPosition(), -1);
  EXPECT_EQ(indexer.getAnchorPosition(), -1);
  EXPECT_EQ(indexer.getAnchorDisplayPosition(), -1);
}

TEST(MPEGIndexer, OffsetsAreCutTo8Bits) {
  MPEGIndexer keyed;
  keyed.addPicture(picture(1, 0, true, true));
  for (int i = 1; i <= 200; ++i) keyed.addPicture(picture(2, static_cast<std::uint16_t>(i)));
  // -200 as a signed octet.
  EXPECT_EQ(keyed.indexEntry(0, {}).keyFrameOffset, static_cast<std::int8_t>(56));
  // An anchor displayed 199 pictures after its B pictures: -199.
  MPEGIndexer anchored;
  anchored.addPicture(picture(1, 0, true, true));
  anchored.addPicture(picture(2, 200));
  for (int i = 1; i < 200; ++i) anchored.addPicture(picture(3, static_cast<std::uint16_t>(i)));
  EXPECT_EQ(anchored.indexEntry(0, {}).temporalOffset, static_cast<std::int8_t>(57));
}

// ---------------------------------------------------------------------------
// The picture scan

TEST(MPEGIndexerPictureScan, ClosedGOPFrameWithSequenceHeader) {
  const Picture p = scan(frame(true, closedGop, 0, 1));
  EXPECT_TRUE(p.sequenceHeader);
  EXPECT_TRUE(p.closed);
  EXPECT_FALSE(p.brokenLink);
  EXPECT_EQ(p.pictureType, 1);
  EXPECT_EQ(p.displayIndex, 0);
}

TEST(MPEGIndexerPictureScan, IPictureWithoutGOPHeaderKeepsClosedClear) {
  const Picture p = scan(frame(true, noGop, 0, 1));
  EXPECT_TRUE(p.sequenceHeader);
  EXPECT_FALSE(p.closed);
  EXPECT_EQ(p.pictureType, 1);
}

TEST(MPEGIndexerPictureScan, OpenGOPHeaderAndBrokenLink) {
  ByteVector bytes = gopHeader(false, true);
  append(bytes, pictureHeader(2, 1));
  const Picture p = scan(bytes);
  EXPECT_FALSE(p.sequenceHeader);
  EXPECT_FALSE(p.closed);
  EXPECT_TRUE(p.brokenLink);
  EXPECT_EQ(p.displayIndex, 2);
}

TEST(MPEGIndexerPictureScan, TemporalReferenceTakesTenBitsAndTypeThree) {
  const Picture p = scan(frame(false, noGop, 0x2AB, 3));
  EXPECT_EQ(p.displayIndex, 0x2AB);
  EXPECT_EQ(p.pictureType, 3);
  EXPECT_EQ(scan(frame(false, noGop, 0x3FF, 2)).displayIndex, 0x3FF);
}

TEST(MPEGIndexerPictureScan, CodesBehindThePictureHeaderAreNotRead) {
  const Picture p = scan(frame(false, noGop, 1, 2));
  EXPECT_FALSE(p.closed);
  EXPECT_FALSE(p.sequenceHeader);
}

TEST(MPEGIndexerPictureScan, StartCodeAfterARunOfZerosAndExtensions) {
  ByteVector bytes = bytesOf("00 00 00 00 00");
  append(bytes, sequenceHeader());
  append(bytes, bytesOf("00 00 01 B5 14 8A 00 01 00 00"));  // sequence extension
  append(bytes, gopHeader(true, false));
  append(bytes, bytesOf("00 00 01 B2 47 41 39 34"));  // user data
  append(bytes, pictureHeader(0, 1));
  const Picture p = scan(bytes);
  EXPECT_TRUE(p.sequenceHeader);
  EXPECT_TRUE(p.closed);
  EXPECT_EQ(p.pictureType, 1);
}

TEST(MPEGIndexerPictureScan, PictureStartCodeEndsTheScanWhereverItStands) {
  // The picture header's own octets 00 01 begin another prefix, unread.
  const Picture p = scan(bytesOf("00 00 01 00 00 01 B8 50 08 00 40"));
  EXPECT_FALSE(p.closed);
  EXPECT_EQ(p.pictureType, 0);
  EXPECT_EQ(p.displayIndex, 0);
}

TEST(MPEGIndexerPictureScan, FrameWithoutPictureHeaderFails) {
  ByteVector bytes = sequenceHeader();
  append(bytes, gopHeader(true, false));
  EXPECT_EQ(scanFailure(bytes), "assertion failure: valid MPEG-2 frame buffer");
  EXPECT_EQ(scanFailure(ByteVector()), "assertion failure: valid MPEG-2 frame buffer");
  EXPECT_EQ(scanFailure(bytesOf("00 00 01")), "assertion failure: valid MPEG-2 frame buffer");
  // Only octets of the buffer make a start code.
  EXPECT_EQ(scanFailure(bytesOf("01 00 12 34")), "assertion failure: valid MPEG-2 frame buffer");
  EXPECT_EQ(scanFailure(bytesOf("00 01 00 12 34")), "assertion failure: valid MPEG-2 frame buffer");
}

TEST(MPEGIndexerPictureScan, TruncatedGOPHeaderFails) {
  EXPECT_EQ(scanFailure(bytesOf("00 00 01 B8 50 08 00")), "assertion failure: valid MPEG-2 group_of_pictures_header");
  EXPECT_TRUE(scan(concat({bytesOf("00 00 01 B8 50 08 00 40"), pictureHeader(0, 1)})).closed);
}

TEST(MPEGIndexerPictureScan, TruncatedPictureHeaderFails) {
  EXPECT_EQ(scanFailure(bytesOf("00 00 01 00 12")), "assertion failure: valid MPEG-2 picture_header");
  EXPECT_EQ(scanFailure(bytesOf("00 00 01 00")), "assertion failure: valid MPEG-2 picture_header");
  EXPECT_EQ(scan(bytesOf("00 00 01 00 00 58")).pictureType, 3);
}

// ---------------------------------------------------------------------------
// MXFMPEGIndexer

namespace {

const KLVKey pictureKey = MXFMPEGPictureElementKey;
const KLVKey soundKey = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.16.01.01.00");

// An indexer between a recording handler and nothing else.
struct RecordedIndexer {
  RecordingGCHandler next;
  SettableLocator locator;
  MXFIndexTableSegment segment;
  MXFMPEGIndexer indexer{&next, &next, &locator, &segment};

  void editUnit(std::streamoff position, const ByteVector& picture) {
    locator.setPosition(position);
    indexer.startEditUnit();
    indexer.startSlice();
    indexer.pictureElement(pictureKey, picture.data(), picture.size());
    indexer.endSlice();
    indexer.endEditUnit();
  }
};

// An indexer in front of a muxer, written to as a writer does: the picture
// in a slice of its own, then a slice of sound.
struct MuxedIndexer {
  gcmux::MuxedContainer container;
  MXFIndexTableSegment segment;
  MXFMPEGIndexer indexer{container.muxer.getStructureHandler(), container.muxer.getEssenceHandler(),
                         container.muxer.getLocator(), &segment};

  void editUnit(const ByteVector& picture, const ByteVector& sound) {
    indexer.startEditUnit();
    indexer.startSlice();
    element(pictureKey, picture);
    indexer.endSlice();
    indexer.startSlice();
    std::uint8_t* buffer = nullptr;
    ASSERT_TRUE(indexer.startEssenceElement(soundKey, sound.size(), buffer));
    indexer.soundElement(soundKey, sound.data(), sound.size());
    indexer.endSlice();
    indexer.endEditUnit();
  }
  void element(const KLVKey& key, const ByteVector& value) {
    std::uint8_t* buffer = nullptr;
    ASSERT_TRUE(indexer.startEssenceElement(key, value.size(), buffer));
    indexer.pictureElement(key, value.data(), value.size());
  }
};

}  // namespace

TEST(MXFMPEGIndexer, OneEntryPerEditUnitWithItsOffsets) {
  MuxedIndexer m;
  m.indexer.start(0);
  const ByteVector sound(100, 0x55);
  const std::vector<ByteVector> pictures = {frame(true, closedGop, 0, 1), frame(false, noGop, 2, 2),
                                            frame(false, noGop, 1, 3)};
  for (const ByteVector& picture : pictures) m.editUnit(picture, sound);
  m.indexer.end();
  ASSERT_EQ(m.segment.indexEntryArray.size(), 3u);
  EXPECT_EQ(m.segment.indexDuration, 3);
  std::uint64_t offset = 0;
  for (std::size_t i = 0; i < 3; ++i) {
    const MXFIndexEntry& entry = m.segment.indexEntryArray[i];
    EXPECT_EQ(entry.streamOffset, offset) << i;
    // Key and four-octet length in front of each value.
    EXPECT_EQ(entry.sliceOffsets, (std::vector<std::uint32_t>{static_cast<std::uint32_t>(20 + pictures[i].size())}))
        << i;
    offset += 20 + pictures[i].size() + 20 + sound.size();
  }
  EXPECT_EQ(m.container.bytes().size(), offset);
  EXPECT_EQ(entryText(m.segment.indexEntryArray[0]), "0/0/C0");
  EXPECT_EQ(entryText(m.segment.indexEntryArray[1]), "1/-1/22");
  EXPECT_EQ(entryText(m.segment.indexEntryArray[2]), "-1/-2/33");
}

TEST(MXFMPEGIndexer, SegmentKeepsWhatItHadAndGrows) {
  RecordedIndexer r;
  r.segment.indexStartPosition = 10;
  r.segment.indexDuration = 10;
  r.segment.indexEntryArray.resize(10);
  r.editUnit(0x400, frame(true, closedGop, 0, 1));
  EXPECT_EQ(r.segment.indexDuration, 11);
  ASSERT_EQ(r.segment.indexEntryArray.size(), 11u);
  EXPECT_EQ(r.segment.indexEntryArray[10].streamOffset, 0x400u);
  EXPECT_EQ(r.segment.indexStartPosition, 10);
}

TEST(MXFMPEGIndexer, EveryEventIsForwardedUnchanged) {
  RecordingGCHandler next(RecordingGCHandler::takeIntoBuffer);
  SettableLocator locator;
  MXFIndexTableSegment segment;
  MXFMPEGIndexer indexer(&next, &next, &locator, &segment);
  const ByteVector picture = frame(true, closedGop, 0, 1);
  const ByteVector other{1, 2, 3};
  const KLVKey dataKey = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.17.01.02.00");
  const KLVKey compoundKey = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.18.01.02.00");
  indexer.start(512);
  indexer.startEditUnit();
  indexer.startSlice();
  indexer.startAlignedElement(2048);
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(indexer.startEssenceElement(pictureKey, picture.size(), buffer));
  EXPECT_EQ(buffer, next.buffers.back().data());
  indexer.essenceLengthForm(0x83);
  indexer.pictureElement(pictureKey, picture.data(), picture.size());
  indexer.endAlignedElement();
  indexer.endSlice();
  indexer.startSlice();
  indexer.startPaddedElement(1024);
  indexer.soundElement(soundKey, other.data(), other.size());
  indexer.dataElement(dataKey, other.data(), other.size());
  indexer.compoundElement(compoundKey, other.data(), other.size());
  indexer.endPaddedElement();
  indexer.endSlice();
  indexer.endEditUnit();
  indexer.end();
  const std::string size = std::to_string(picture.size());
  EXPECT_EQ(next.events,
            (std::vector<std::string>{"start 512", "startEditUnit", "startSlice", "startAlignedElement 2048",
                                      "startEssenceElement " + toString(pictureKey) + " " + size,
                                      "essenceLengthForm 0x83", "pictureElement " + toString(pictureKey) + " " + size,
                                      "endAlignedElement", "endSlice", "startSlice", "startPaddedElement 1024",
                                      "soundElement " + toString(soundKey) + " 3",
                                      "dataElement " + toString(dataKey) + " 3",
                                      "compoundElement " + toString(compoundKey) + " 3", "endPaddedElement",
                                      "endSlice", "endEditUnit", "end"}));
  EXPECT_EQ(next.elements[0].data, picture.data());
  EXPECT_EQ(segment.indexDuration, 1);
}

TEST(MXFMPEGIndexer, StartEssenceElementAnswersAsTheNextHandler) {
  RecordingGCHandler next(RecordingGCHandler::decline);
  SettableLocator locator;
  MXFIndexTableSegment segment;
  MXFMPEGIndexer indexer(&next, &next, &locator, &segment);
  std::uint8_t* buffer = nullptr;
  EXPECT_FALSE(indexer.startEssenceElement(pictureKey, 10, buffer));
}

TEST(MXFMPEGIndexer, OtherPictureKeysAreForwardedWithoutALook) {
  RecordedIndexer r;
  const KLVKey d10Key = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.05.01.01.00");
  const KLVKey otherPicture = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.06.00");
  const ByteVector junk{9, 9, 9};
  r.indexer.pictureElement(d10Key, junk.data(), junk.size());
  r.indexer.pictureElement(otherPicture, junk.data(), junk.size());
  EXPECT_EQ(r.next.elements.size(), 2u);
  // The version octet takes no part.
  KLVKey versioned = pictureKey;
  versioned[7] = 0x05;
  EXPECT_EQ(assertionTextOf([&] { r.indexer.pictureElement(versioned, junk.data(), junk.size()); }),
            "assertion failure: valid MPEG-2 frame buffer");
}

TEST(MXFMPEGIndexer, FrameThatCannotBeIndexedIsNotForwarded) {
  RecordedIndexer r;
  const ByteVector junk = sequenceHeader();
  EXPECT_EQ(assertionTextOf([&] { r.indexer.pictureElement(pictureKey, junk.data(), junk.size()); }),
            "assertion failure: valid MPEG-2 frame buffer");
  EXPECT_TRUE(r.next.elements.empty());
  const ByteVector bFrame = frame(false, noGop, 0, 5);
  EXPECT_EQ(assertionTextOf([&] { r.indexer.pictureElement(pictureKey, bFrame.data(), bFrame.size()); }),
            "assertion failure: expected MPEG-2 picture_coding_type");
  EXPECT_TRUE(r.next.elements.empty());
}

TEST(MXFMPEGIndexer, NeedsAnEssenceHandlerAndASegment) {
  RecordingGCHandler next;
  SettableLocator locator;
  MXFIndexTableSegment segment;
  MXFMPEGIndexer withoutEssence(&next, nullptr, &locator, &segment);
  const ByteVector picture = frame(true, closedGop, 0, 1);
  EXPECT_EQ(assertionTextOf([&] { withoutEssence.soundElement(soundKey, picture.data(), 1); }),
            "assertion failure: handler is present");
  MXFMPEGIndexer withoutSegment(&next, &next, &locator, nullptr);
  withoutSegment.startEditUnit();
  withoutSegment.pictureElement(pictureKey, picture.data(), picture.size());
  EXPECT_EQ(assertionTextOf([&] { withoutSegment.endEditUnit(); }), "assertion failure: segment is present");
}
