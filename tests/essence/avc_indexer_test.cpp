// The AVC bit reader, parameter sets, access units, picture order counts
// and MXFAVCIndexer, on hand-built bitstreams.
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "essence/avc_bit_reader.h"
#include "essence/avc_bitstream.h"
#include "essence/avc_indexer.h"
#include "support/essence_recording.h"
#include "support/klv_output.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;
using namespace zelta_test::avc;
using zelta_test::klv::SettableLocator;

namespace {

// A stream of one SPS and PPS, as most writers code them.
struct Stream {
  SPS sps;
  PPS pps;
  zelta::AVCAccessUnitParser parser;

  ByteVector idr(const Slice& slice = Slice(), unsigned refIdc = 3) const {
    return joined({delimiter(0), sps.bytes(), pps.bytes(), slice.bytes(sps, pps, true, refIdc)});
  }
  ByteVector unit(const Slice& slice, unsigned refIdc) const {
    return joined({delimiter(7), slice.bytes(sps, pps, false, refIdc)});
  }
  zelta::AVCPicture parse(const ByteVector& bytes) { return parser.parse(bytes.data(), bytes.size()); }
  std::string failure(const ByteVector& bytes) {
    return assertionTextOf([&] { parse(bytes); });
  }
  std::int64_t count(const Slice& slice, unsigned refIdc) { return parse(unit(slice, refIdc)).pictureOrderCount; }
};

Slice slice(unsigned type, unsigned frameNum, unsigned pocLsb) {
  Slice s;
  s.type = type;
  s.frameNum = frameNum;
  s.pocLsb = pocLsb;
  return s;
}

Slice pocSlice(unsigned type, unsigned frameNum, int delta0) {
  Slice s = slice(type, frameNum, 0);
  s.delta0 = delta0;
  return s;
}

}  // namespace

// ---------------------------------------------------------------------------
// Bit reader

TEST(AVCIndexerBitReader, ExpGolombCodes) {
  BitWriter w;
  const std::vector<std::uint64_t> values{0, 1, 2, 3, 7, 254, 255, 65535, 0xFFFFFFFE};
  for (std::uint64_t v : values) w.ue(v);
  for (std::int64_t v : {1, -1, 2, -2, 2147483647, -2147483647}) w.se(v);
  const ByteVector bytes = w.rbsp();
  zelta::AVCBitReader reader(bytes.data(), bytes.size());
  for (std::uint64_t v : values) EXPECT_EQ(reader.unsignedCode(), v);
  for (std::int64_t v : {1, -1, 2, -2, 2147483647, -2147483647}) EXPECT_EQ(reader.signedCode(), v);
  // 1, 010, 011, 00100 by hand.
  const ByteVector spelled = bytesOf("A6 40");
  zelta::AVCBitReader byHand(spelled.data(), spelled.size());
  EXPECT_EQ(byHand.unsignedCode(), 0u);
  EXPECT_EQ(byHand.unsignedCode(), 1u);
  EXPECT_EQ(byHand.unsignedCode(), 2u);
  EXPECT_EQ(byHand.unsignedCode(), 3u);
  EXPECT_EQ(assertionTextOf([&] { byHand.unsignedCode(); }), "assertion failure: successful read()");
}

TEST(AVCIndexerBitReader, ExpGolombCodeOfThirtyTwoLeadingZerosFails) {
  const ByteVector bytes = bytesOf("00 00 00 00 80 00 00 00 00");
  zelta::AVCBitReader reader(bytes.data(), bytes.size());
  EXPECT_EQ(assertionTextOf([&] { reader.unsignedCode(); }), "assertion failure: valid Exp-Golomb code");
}

TEST(AVCIndexerBitReader, EmulationPreventionIsDroppedInNALModeOnly) {
  const ByteVector bytes = bytesOf("00 00 01 00 00 03 00 00 03 03 01 00 00 03");
  zelta::AVCBitReader nalMode(bytes.data(), bytes.size());
  ASSERT_TRUE(nalMode.findStartCode());
  nalMode.enterNAL();
  ByteVector read;
  for (int i = 0; i < 8; ++i) read.push_back(static_cast<std::uint8_t>(nalMode.bits(8)));
  // The count of zeros starts again behind a dropped 03, so the second 03
  // of 03 03 stays; a 03 at the end is dropped and leaves nothing.
  EXPECT_EQ(read, bytesOf("00 00 00 00 03 01 00 00"));
  EXPECT_EQ(assertionTextOf([&] { nalMode.bits(1); }), "assertion failure: successful read()");

  zelta::AVCBitReader byteMode(bytes.data() + 3, bytes.size() - 3);
  ByteVector raw;
  for (int i = 0; i < 11; ++i) raw.push_back(static_cast<std::uint8_t>(byteMode.bits(8)));
  EXPECT_EQ(raw, bytesOf("00 00 03 00 00 03 03 01 00 00 03"));
}

TEST(AVCIndexerBitReader, ZerosOfTheStartCodeDoNotCount) {
  const ByteVector bytes = bytesOf("00 00 01 03 00 03");
  zelta::AVCBitReader reader(bytes.data(), bytes.size());
  ASSERT_TRUE(reader.findStartCode());
  reader.enterNAL();
  EXPECT_EQ(reader.bits(24), 0x030003u);
}

TEST(AVCIndexerBitReader, StartCodeSearch) {
  const ByteVector bytes = bytesOf("12 00 00 00 01 45 00 00 02 00 01 00 00 01");
  zelta::AVCBitReader reader(bytes.data(), bytes.size());
  ASSERT_TRUE(reader.findStartCode());
  EXPECT_EQ(reader.peek(), 0x45);
  ASSERT_TRUE(reader.findStartCode());
  EXPECT_EQ(reader.remaining(), 0u);
  EXPECT_EQ(assertionTextOf([&] { reader.peek(); }), "assertion failure: successful read()");
  EXPECT_FALSE(reader.findStartCode());
  const ByteVector none = bytesOf("00 01 00 00 02 01");
  zelta::AVCBitReader without(none.data(), none.size());
  EXPECT_FALSE(without.findStartCode());
}

TEST(AVCIndexerBitReader, MoreRBSPDataStopsAtTheStopBit) {
  // One bit of syntax, the stop bit, then cabac_zero_words.
  const ByteVector bytes = bytesOf("00 00 01 60 00 00 03 00 00 03 00 00 01 FF");
  zelta::AVCBitReader reader(bytes.data(), bytes.size());
  ASSERT_TRUE(reader.findStartCode());
  reader.enterNAL();
  EXPECT_TRUE(reader.moreRBSPData());
  reader.bits(1);
  EXPECT_TRUE(reader.moreRBSPData());
  reader.bits(1);
  EXPECT_FALSE(reader.moreRBSPData());
  const ByteVector whole = bytesOf("80 40");
  zelta::AVCBitReader next(whole.data(), whole.size());
  next.enterNAL();
  EXPECT_TRUE(next.moreRBSPData());
  next.bits(8);
  EXPECT_TRUE(next.moreRBSPData());
  next.bits(1);
  EXPECT_FALSE(next.moreRBSPData());
  EXPECT_FALSE(zelta::AVCBitReader(whole.data(), 0).moreRBSPData());
}

// ---------------------------------------------------------------------------
// Access units

TEST(AVCIndexerAccessUnit, IDRWithSequenceParameterSetIsClosedIntraReference) {
  Stream s;
  const zelta::AVCPicture p = s.parse(s.idr());
  EXPECT_TRUE(p.picture.sequenceHeader);
  EXPECT_TRUE(p.picture.closed);
  EXPECT_TRUE(p.picture.reference);
  EXPECT_FALSE(p.picture.brokenLink);
  EXPECT_EQ(p.picture.pictureType, 1);
  EXPECT_EQ(p.pictureOrderCount, 0);
  const zelta::AVCPicture b = s.parse(s.unit(slice(1, 1, 2), 0));
  EXPECT_FALSE(b.picture.sequenceHeader);
  EXPECT_FALSE(b.picture.closed);
  EXPECT_FALSE(b.picture.reference);
  EXPECT_EQ(b.picture.pictureType, 3);
  EXPECT_EQ(b.pictureOrderCount, 2);
}

TEST(AVCIndexerAccessUnit, SliceTypesGivePictureTypes) {
  Stream s;
  s.parse(s.idr());
  const std::uint8_t expected[10] = {2, 3, 1, 2, 1, 2, 3, 1, 2, 1};
  for (unsigned type = 0; type < 10; ++type)
    EXPECT_EQ(s.parse(s.unit(slice(type, 1, 2), 2)).picture.pictureType, expected[type]) << type;
}

TEST(AVCIndexerAccessUnit, AccessUnitWithNoSliceFails) {
  Stream s;
  const ByteVector noSlice = joined({delimiter(0), s.sps.bytes(), s.pps.bytes()});
  EXPECT_EQ(s.failure(noSlice), "assertion failure: valid AVC access unit");
  EXPECT_EQ(s.failure(ByteVector()), "assertion failure: valid AVC access unit");
  EXPECT_EQ(s.failure(bytesOf("00 00 02 65 88")), "assertion failure: valid AVC access unit");
}

TEST(AVCIndexerAccessUnit, SeveralSlicesAreDecidedByTheFirst) {
  Stream s;
  s.parse(s.idr());
  Slice second = slice(7, 1, 4);
  second.ppsId = 9;  // no such set: reading it would fail
  const ByteVector unit = joined({s.unit(slice(5, 1, 4), 2), second.bytes(s.sps, s.pps, false, 0)});
  const zelta::AVCPicture p = s.parse(unit);
  EXPECT_EQ(p.picture.pictureType, 2);
  EXPECT_TRUE(p.picture.reference);
  EXPECT_EQ(p.pictureOrderCount, 4);
}

TEST(AVCIndexerAccessUnit, DelimiterWithPrimaryPicTypeZeroSetsIntraBeforeTheSliceOverrides) {
  Stream s;
  s.parse(s.idr());
  EXPECT_EQ(s.parse(joined({delimiter(0), slice(5, 1, 2).bytes(s.sps, s.pps, false, 2)})).picture.pictureType, 2);
  // A slice_type from 10 on says nothing of the picture type.
  EXPECT_EQ(s.parse(joined({delimiter(0), slice(12, 1, 2).bytes(s.sps, s.pps, false, 2)})).picture.pictureType, 1);
  EXPECT_EQ(s.parse(joined({delimiter(2), slice(12, 1, 2).bytes(s.sps, s.pps, false, 2)})).picture.pictureType, 0);
}

TEST(AVCIndexerAccessUnit, BadNALUnitHeaderFails) {
  Stream s;
  EXPECT_EQ(s.failure(bytesOf("00 00 01 E5 88 84")), "assertion failure: valid AVC NAL");
  EXPECT_EQ(s.failure(joined({delimiter(0), bytesOf("00 00 01")})), "assertion failure: valid AVC NAL");
  EXPECT_EQ(s.failure(bytesOf("00 00 01 09")), "assertion failure: valid AVC Access unit delimiter");
}

TEST(AVCIndexerAccessUnit, TruncatedSliceHeaderFails) {
  Stream s;
  const ByteVector unit = joined({s.sps.bytes(), s.pps.bytes(), bytesOf("00 00 01 65 80")});
  EXPECT_EQ(s.failure(unit), "assertion failure: successful read()");
}

TEST(AVCIndexerAccessUnit, SliceNeedsItsParameterSets) {
  Stream s;
  EXPECT_EQ(s.failure(s.unit(slice(5, 1, 2), 2)), "assertion failure: found picture parameter set for slice");
  PPS orphan;
  orphan.spsId = 3;
  EXPECT_EQ(s.failure(joined({orphan.bytes(), slice(5, 1, 2).bytes(s.sps, orphan, false, 2)})),
            "assertion failure: found sequence parameter set for slice");
}

TEST(AVCIndexerAccessUnit, LaterParameterSetReplacesAnEarlierOneOfTheSameId) {
  Stream s;
  s.parse(s.idr());
  s.sps.log2MaxPocLsb = 8;
  s.parse(s.idr());
  EXPECT_EQ(s.count(slice(5, 1, 100), 2), 100);
}

TEST(AVCIndexerAccessUnit, HighProfileScalingListsAndVUIAreReadInFull) {
  Stream s;
  s.sps.profile = 100;
  s.sps.scalingLists = true;
  s.sps.vui = true;
  s.sps.log2MaxPocLsb = 6;
  s.pps.extension = true;
  s.parse(s.idr());
  EXPECT_EQ(s.count(slice(5, 1, 27), 2), 27);
  s.sps.chromaFormat = 3;
  s.pps.scalingLists = 12;
  s.parse(s.idr());
  EXPECT_EQ(s.count(slice(5, 1, 21), 2), 21);
}

TEST(AVCIndexerAccessUnit, EmulationPreventionInsideTheSliceHeader) {
  Stream s;
  s.sps.log2MaxFrameNum = 16;
  s.sps.log2MaxPocLsb = 16;
  s.parse(s.idr());
  // 30 zero bits of frame_num and pic_order_cnt_lsb.
  const ByteVector unit = s.unit(slice(5, 0, 3), 2);
  ASSERT_TRUE(containsEmulationPrevention(unit));
  EXPECT_EQ(s.parse(unit).pictureOrderCount, 3);
}

TEST(AVCIndexerAccessUnit, ReferenceListsWeightsAndMarkingAreRead) {
  Stream s;
  s.pps.weightedPred = true;
  s.pps.weightedBipred = 1;
  s.pps.redundantPicCnt = true;
  s.pps.refsL0Minus1 = 2;
  s.parse(s.idr());
  for (unsigned type : {0u, 1u, 5u, 6u}) {
    Slice p = slice(type, 1, 6);
    p.overrideRefs = type % 5 == 0;
    p.modifications = true;
    p.operations = {{1, 0}, {2, 3}, {3, 1, 2}, {4, 2}, {6, 1}};
    EXPECT_EQ(s.count(p, 2), 6) << type;
  }
}

TEST(AVCIndexerAccessUnit, UnknownMemoryManagementOperationFails) {
  Stream s;
  s.parse(s.idr());
  Slice p = slice(5, 1, 2);
  p.operations = {{7}};
  EXPECT_EQ(s.failure(s.unit(p, 2)), "assertion failure: valid memory_management_control_operation");
}

TEST(AVCIndexerAccessUnit, SliceGroupsOfPictureParameterSets) {
  Stream s;
  for (unsigned mapType : {0u, 1u, 2u, 6u}) {
    s.pps.sliceGroupsMinus1 = 2;
    s.pps.mapType = mapType;
    EXPECT_EQ(s.parse(s.idr(slice(7, 0, 8))).pictureOrderCount, 8) << mapType;
  }
  s.pps.sliceGroupsMinus1 = 1;
  s.pps.mapType = 4;
  EXPECT_EQ(s.parse(s.idr(slice(7, 0, 8))).pictureOrderCount, 8);
  s.pps.sliceGroupsMinus1 = 2;
  EXPECT_EQ(s.failure(s.idr()), "assertion failure: valid num_slice_groups_minus1");
  s.pps.mapType = 7;
  EXPECT_EQ(s.failure(s.idr()), "assertion failure: supported slice_group_map_type");
}

TEST(AVCIndexerAccessUnit, OversizedFrameNumAndCountFieldsFail) {
  Stream s;
  s.sps.log2MaxFrameNum = 17;
  EXPECT_EQ(s.failure(s.idr()), "assertion failure: valid log2_max_frame_num_minus4");
  s.sps.log2MaxFrameNum = 16;
  s.sps.log2MaxPocLsb = 17;
  EXPECT_EQ(s.failure(s.idr()), "assertion failure: valid log2_max_pic_order_cnt_lsb_minus4");
}

// ---------------------------------------------------------------------------
// Parameter sets and slice headers, read to their last bit

namespace {

// A reader behind the header of the first NAL unit of the octets, which
// must outlive it.
zelta::AVCBitReader behindHeader(const ByteVector& bytes) {
  zelta::AVCBitReader reader(bytes.data(), bytes.size());
  EXPECT_TRUE(reader.findStartCode());
  reader.enterNAL();
  reader.bits(8);
  return reader;
}

void store(zelta::AVCParameterSets& sets, const SPS& sps, const PPS& pps) {
  const ByteVector sequence = sps.bytes();
  zelta::AVCBitReader sequenceReader = behindHeader(sequence);
  sets.readSequenceParameterSet(sequenceReader);
  EXPECT_FALSE(sequenceReader.moreRBSPData());
  const ByteVector picture = pps.bytes();
  zelta::AVCBitReader pictureReader = behindHeader(picture);
  sets.readPictureParameterSet(pictureReader);
  EXPECT_FALSE(pictureReader.moreRBSPData());
}

// Reads the header and checks that the slice data comes right behind it.
zelta::AVCSliceHeader sliceHeader(const zelta::AVCParameterSets& sets, const ByteVector& bytes, bool idr,
                                  bool reference) {
  zelta::AVCBitReader reader = behindHeader(bytes);
  const zelta::AVCSliceHeader header = sets.readSliceHeader(reader, idr, reference);
  EXPECT_EQ(reader.bits(32), 0xA5F00F5Au);
  return header;
}

}  // namespace

TEST(AVCIndexerParameterSets, SequenceParameterSetsAreReadToTheirStopBit) {
  std::vector<SPS> variants(6);
  variants[1].profile = 100;
  variants[1].scalingLists = true;
  variants[2].profile = 244;
  variants[2].chromaFormat = 3;
  variants[2].scalingLists = true;
  variants[3].vui = true;
  variants[4].pocType = 1;
  variants[4].cycle = {5, -7, 9};
  variants[4].offsetForNonRef = -100;
  variants[5].frameMbsOnly = false;
  variants[5].pocType = 2;
  for (const SPS& sps : variants) {
    zelta::AVCParameterSets sets;
    store(sets, sps, PPS());
  }
}

TEST(AVCIndexerParameterSets, PictureParameterSetsAreReadToTheirStopBit) {
  zelta::AVCParameterSets sets;
  SPS sps;
  PPS pps;
  pps.extension = true;
  store(sets, sps, pps);
  for (unsigned mapType = 0; mapType <= 6; ++mapType) {
    pps.sliceGroupsMinus1 = mapType >= 3 && mapType <= 5 ? 1 : 3;
    pps.mapType = mapType;
    store(sets, sps, pps);
  }
  // Without its sequence set, a picture set takes 4:2:0 for its lists.
  zelta::AVCParameterSets alone;
  const ByteVector picture = pps.bytes();
  zelta::AVCBitReader reader = behindHeader(picture);
  alone.readPictureParameterSet(reader);
  EXPECT_FALSE(reader.moreRBSPData());
}

TEST(AVCIndexerParameterSets, SliceHeadersAreReadUpToDecRefPicMarking) {
  zelta::AVCParameterSets sets;
  SPS sps;
  sps.frameMbsOnly = false;
  PPS pps;
  pps.bottomFieldPicOrder = true;
  pps.weightedPred = true;
  pps.weightedBipred = 1;
  pps.redundantPicCnt = true;
  pps.refsL0Minus1 = 2;
  pps.refsL1Minus1 = 1;
  store(sets, sps, pps);
  for (unsigned type = 0; type < 10; ++type) {
    for (bool overrideRefs : {false, true}) {
      Slice s = slice(type, 9, 11);
      s.overrideRefs = overrideRefs;
      s.modifications = true;
      s.deltaBottom = -4;
      s.operations = {{1, 0}, {2, 3}, {3, 1, 2}, {4, 2}, {5}, {6, 1}};
      const zelta::AVCSliceHeader header = sliceHeader(sets, s.bytes(sps, pps, false, 1), false, true);
      EXPECT_EQ(header.sliceType, type);
      EXPECT_EQ(header.frameNum, 9u);
      EXPECT_EQ(header.picOrderCntLsb, 11u);
      EXPECT_EQ(header.deltaPicOrderCntBottom, -4);
      EXPECT_TRUE(header.resetsMemory);
      EXPECT_EQ(header.sequenceSet->id, 0u);
    }
  }
  Slice field = slice(7, 2, 5);
  field.field = true;
  field.bottom = true;
  const zelta::AVCSliceHeader idr = sliceHeader(sets, field.bytes(sps, pps, true, 3), true, true);
  EXPECT_TRUE(idr.fieldPic);
  EXPECT_TRUE(idr.bottomField);
  EXPECT_FALSE(idr.resetsMemory);
  // A picture that is no reference is read only up to its counts.
  const ByteVector unmarkedBytes = slice(1, 3, 4).bytes(sps, pps, false, 0);
  zelta::AVCBitReader reader = behindHeader(unmarkedBytes);
  const zelta::AVCSliceHeader unmarked = sets.readSliceHeader(reader, false, false);
  EXPECT_EQ(unmarked.frameNum, 3u);
  EXPECT_EQ(unmarked.picOrderCntLsb, 4u);
  EXPECT_FALSE(unmarked.resetsMemory);
}

// ---------------------------------------------------------------------------
// Picture order counts

TEST(AVCIndexerPictureOrderCount, Type0FollowsTheWrapOfTheLsb) {
  Stream s;  // MaxPicOrderCntLsb 16
  s.parse(s.idr());
  EXPECT_EQ(s.count(slice(5, 1, 8), 2), 8);
  EXPECT_EQ(s.count(slice(5, 2, 14), 2), 14);
  EXPECT_EQ(s.count(slice(6, 3, 2), 0), 18);  // not carried over
  EXPECT_EQ(s.count(slice(5, 3, 4), 2), 20);
  EXPECT_EQ(s.count(slice(6, 4, 12), 0), 28);
  EXPECT_EQ(s.count(slice(5, 4, 13), 2), 13);  // back by MaxPicOrderCntLsb
  // An IDR picture starts again from 0.
  EXPECT_EQ(s.parse(s.idr(slice(7, 0, 2))).pictureOrderCount, 2);
}

TEST(AVCIndexerPictureOrderCount, Type0FrameTakesTheLesserOfTopAndBottom) {
  Stream s;
  s.pps.bottomFieldPicOrder = true;
  s.parse(s.idr());
  Slice p = slice(5, 1, 8);
  p.deltaBottom = -3;
  EXPECT_EQ(s.count(p, 2), 5);
  p.deltaBottom = 3;
  EXPECT_EQ(s.count(p, 2), 8);
}

TEST(AVCIndexerPictureOrderCount, Type0MemoryManagementOperation5OnABottomFieldRestartsTheCount) {
  Stream s;
  s.sps.frameMbsOnly = false;
  s.parse(s.idr());
  EXPECT_EQ(s.count(slice(5, 1, 8), 2), 8);
  EXPECT_EQ(s.count(slice(5, 2, 14), 2), 14);
  Slice field = slice(5, 3, 4);
  field.field = true;
  field.bottom = true;
  field.operations = {{5}};
  EXPECT_EQ(s.count(field, 2), 20);
  EXPECT_EQ(s.count(slice(5, 1, 12), 2), -4);
  // Without the operation the count would have gone on from 20.
  Stream plain;
  plain.sps.frameMbsOnly = false;
  plain.parse(plain.idr());
  plain.count(slice(5, 1, 8), 2);
  plain.count(slice(5, 2, 14), 2);
  field.operations.clear();
  EXPECT_EQ(plain.count(field, 2), 20);
  EXPECT_EQ(plain.count(slice(5, 1, 12), 2), 28);
}

TEST(AVCIndexerPictureOrderCount, Type0MemoryManagementOperation5OnAFrameCarriesItsTop) {
  Stream s;
  s.parse(s.idr());
  s.count(slice(5, 1, 8), 2);
  Slice reset = slice(5, 2, 14);
  reset.operations = {{5}};
  EXPECT_EQ(s.count(reset, 2), 14);
  EXPECT_EQ(s.count(slice(5, 3, 2), 2), 18);
}

TEST(AVCIndexerPictureOrderCount, Type1ExpectedDeltaMethod) {
  Stream s;
  s.sps.pocType = 1;
  s.sps.cycle = {4, 2};
  s.sps.offsetForNonRef = -3;
  s.sps.offsetTopToBottom = 1;
  s.parse(s.idr());
  EXPECT_EQ(s.count(pocSlice(5, 1, 0), 2), 4);
  EXPECT_EQ(s.count(pocSlice(6, 2, 0), 0), 1);
  EXPECT_EQ(s.count(pocSlice(5, 2, 0), 2), 6);
  EXPECT_EQ(s.count(pocSlice(5, 3, -1), 2), 9);
  // frame_num wraps at 16: the offset grows by 16 frames, 8 cycles of 6.
  // frame_num wraps at 16: frame 16 is 7 cycles of 6 and both offsets.
  EXPECT_EQ(s.count(pocSlice(5, 0, 0), 2), 48);
}

TEST(AVCIndexerPictureOrderCount, Type1FieldsAndBottomDeltas) {
  Stream s;
  s.sps.pocType = 1;
  s.sps.frameMbsOnly = false;
  s.sps.cycle = {4, 2};
  s.sps.offsetTopToBottom = -5;
  s.pps.bottomFieldPicOrder = true;
  s.parse(s.idr());
  Slice frame = pocSlice(5, 1, 0);
  frame.delta1 = 2;
  EXPECT_EQ(s.count(frame, 2), 1);  // bottom 4 - 5 + 2
  Slice bottom = pocSlice(5, 2, 1);
  bottom.field = true;
  bottom.bottom = true;
  EXPECT_EQ(s.count(bottom, 2), 6 - 5 + 1);
  Slice top = pocSlice(5, 2, 1);
  top.field = true;
  EXPECT_EQ(s.count(top, 2), 7);
  s.sps.deltaAlwaysZero = true;
  EXPECT_EQ(s.parse(s.idr()).pictureOrderCount, -5);
}

TEST(AVCIndexerPictureOrderCount, Type1WithoutCycleCountsOnlyNonReferenceOffsets) {
  Stream s;
  s.sps.pocType = 1;
  s.sps.offsetForNonRef = -7;
  s.parse(s.idr());
  EXPECT_EQ(s.count(pocSlice(5, 3, 2), 2), 2);
  EXPECT_EQ(s.count(pocSlice(6, 4, 2), 0), -5);
}

TEST(AVCIndexerPictureOrderCount, Type2FollowsFrameNum) {
  Stream s;
  s.sps.pocType = 2;
  EXPECT_EQ(s.parse(s.idr()).pictureOrderCount, 0);
  EXPECT_EQ(s.count(slice(5, 1, 0), 2), 2);
  EXPECT_EQ(s.count(slice(6, 2, 0), 0), 3);
  EXPECT_EQ(s.count(slice(5, 2, 0), 2), 4);
  EXPECT_EQ(s.count(slice(5, 15, 0), 2), 30);
  EXPECT_EQ(s.count(slice(5, 3, 0), 2), 38);  // frame_num wrapped at 16
  Slice reset = slice(5, 4, 0);
  reset.operations = {{5}};
  EXPECT_EQ(s.count(reset, 2), 40);
  EXPECT_EQ(s.count(slice(5, 5, 0), 2), 10);  // the offset is 0 after operation 5
  EXPECT_EQ(s.parse(s.idr(slice(7, 9, 0))).pictureOrderCount, 0);
}

TEST(AVCIndexerPictureOrderCount, UnsupportedTypeFails) {
  Stream s;
  s.sps.pocType = 3;
  EXPECT_EQ(s.failure(s.idr()), "assertion failure: supported pic_order_cnt_type");
}

// ---------------------------------------------------------------------------
// MXFAVCIndexer

namespace {

const KLVKey pictureKey = MXFMPEGPictureElementKey;

std::string entryText(const MXFIndexEntry& entry) {
  char text[48];
  std::snprintf(text, sizeof text, "%d/%d/%02X@%llu", entry.temporalOffset, entry.keyFrameOffset, entry.flags,
                static_cast<unsigned long long>(entry.streamOffset));
  return text;
}

struct Indexer {
  Stream stream;
  RecordingGCHandler next;
  SettableLocator locator;
  MXFIndexTableSegment segment;
  MXFAVCIndexer indexer{&next, &next, &locator, &segment};

  void editUnit(std::streamoff position, const ByteVector& unit) {
    locator.setPosition(position);
    indexer.startEditUnit();
    indexer.startSlice();
    indexer.pictureElement(pictureKey, unit.data(), unit.size());
    indexer.endSlice();
    indexer.endEditUnit();
  }
  std::vector<std::string> entries() const {
    std::vector<std::string> texts;
    for (const MXFIndexEntry& entry : segment.indexEntryArray) texts.push_back(entryText(entry));
    return texts;
  }
};

}  // namespace

TEST(MXFAVCIndexer, OneAccessUnitProducesItsEntryOnlyAtFlushIndex) {
  Indexer x;
  x.editUnit(0x200, x.stream.idr());
  EXPECT_TRUE(x.segment.indexEntryArray.empty());
  EXPECT_EQ(x.segment.indexDuration, 0);
  x.indexer.flushIndex();
  EXPECT_EQ(x.entries(), (std::vector<std::string>{"0/0/C4@512"}));
  EXPECT_EQ(x.segment.indexDuration, 1);
}

TEST(MXFAVCIndexer, EntriesOfAGOPComeWhenTheNextGOPStarts) {
  Indexer x;
  const Stream& s = x.stream;
  x.editUnit(0, s.idr());
  x.editUnit(100, s.unit(slice(5, 1, 6), 2));
  x.editUnit(200, s.unit(slice(6, 2, 2), 0));
  x.editUnit(300, s.unit(slice(6, 2, 4), 0));
  EXPECT_TRUE(x.segment.indexEntryArray.empty());
  x.editUnit(400, s.idr());
  EXPECT_EQ(x.entries(), (std::vector<std::string>{"0/0/C4@0", "1/-1/26@100", "1/-2/33@200", "-2/-3/33@300"}));
  EXPECT_EQ(x.segment.indexDuration, 4);
  x.editUnit(500, s.unit(slice(5, 1, 2), 2));
  EXPECT_EQ(x.segment.indexEntryArray.size(), 4u);
  x.indexer.flushIndex();
  ASSERT_EQ(x.segment.indexEntryArray.size(), 6u);
  EXPECT_EQ(entryText(x.segment.indexEntryArray[4]), "0/0/C4@400");
  EXPECT_EQ(entryText(x.segment.indexEntryArray[5]), "0/-1/26@500");
  EXPECT_EQ(x.segment.indexDuration, 6);
}

TEST(MXFAVCIndexer, EntriesKeepTheirSliceOffsets) {
  Indexer x;
  x.locator.setPosition(0);
  x.indexer.startEditUnit();
  x.indexer.startSlice();
  const ByteVector unit = x.stream.idr();
  x.indexer.pictureElement(pictureKey, unit.data(), unit.size());
  x.locator.setPosition(0x1234);
  x.indexer.startSlice();
  x.indexer.endEditUnit();
  x.indexer.flushIndex();
  ASSERT_EQ(x.segment.indexEntryArray.size(), 1u);
  EXPECT_EQ(x.segment.indexEntryArray[0].sliceOffsets, (std::vector<std::uint32_t>{0x1234}));
}

TEST(MXFAVCIndexer, EditUnitWithoutAccessUnitFails) {
  Indexer x;
  x.indexer.startEditUnit();
  EXPECT_EQ(assertionTextOf([&] { x.indexer.endEditUnit(); }), "assertion failure: has picture element");
  x.editUnit(0, x.stream.idr());
  x.indexer.startEditUnit();
  EXPECT_EQ(assertionTextOf([&] { x.indexer.endEditUnit(); }), "assertion failure: has picture element");
}

TEST(MXFAVCIndexer, AccessUnitThatCannotBeIndexedIsNotForwarded) {
  Indexer x;
  const ByteVector noSlice = joined({delimiter(0), x.stream.sps.bytes()});
  EXPECT_EQ(assertionTextOf([&] { x.indexer.pictureElement(pictureKey, noSlice.data(), noSlice.size()); }),
            "assertion failure: valid AVC access unit");
  EXPECT_TRUE(x.next.elements.empty());
}

TEST(MXFAVCIndexer, OtherKeysAreForwardedWithoutALook) {
  Indexer x;
  const KLVKey otherPicture = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.06.00");
  const KLVKey sound = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.16.01.01.00");
  const KLVKey data = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.17.01.02.00");
  const KLVKey compound = keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.18.01.02.00");
  const ByteVector junk{1, 2, 3};
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(x.indexer.startEssenceElement(otherPicture, 3, buffer));
  x.indexer.essenceLengthForm(0x87);
  x.indexer.pictureElement(otherPicture, junk.data(), junk.size());
  x.indexer.soundElement(sound, junk.data(), junk.size());
  x.indexer.dataElement(data, junk.data(), junk.size());
  x.indexer.compoundElement(compound, junk.data(), junk.size());
  EXPECT_EQ(x.next.events,
            (std::vector<std::string>{"startEssenceElement " + toString(otherPicture) + " 3", "essenceLengthForm 0x87",
                                      "pictureElement " + toString(otherPicture) + " 3",
                                      "soundElement " + toString(sound) + " 3", "dataElement " + toString(data) + " 3",
                                      "compoundElement " + toString(compound) + " 3"}));
}

TEST(MXFAVCIndexer, NeedsAnEssenceHandlerAndASegment) {
  RecordingGCHandler next;
  SettableLocator locator;
  MXFIndexTableSegment segment;
  MXFAVCIndexer withoutEssence(&next, nullptr, &locator, &segment);
  EXPECT_EQ(assertionTextOf([&] { withoutEssence.essenceLengthForm(0x83); }), "assertion failure: handler is present");
  MXFAVCIndexer withoutSegment(&next, &next, &locator, nullptr);
  EXPECT_EQ(assertionTextOf([&] { withoutSegment.flushIndex(); }), "assertion failure: segment is present");
}
