// The SDTI-CP system element: key tests, the parser's order and count
// checks, the coder, and the two through octets.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/essence_recording.h"
#include "support/klv_output.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey packKey = keyOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00");
const KLVKey controlKey = keyOf("06 0E 2B 34 02 63 01 01 0D 01 03 01 04 01 06 00");
const KLVKey containerLabel = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 01");

// A metadata set key of a kind (octet 14) and a block count (octet 15).
KLVKey setKey(std::uint8_t kind, std::uint8_t count) {
  KLVKey key = keyOf("06 0E 2B 34 02 43 01 01 0D 01 03 01 04 01 00 00");
  key[14] = kind;
  key[15] = count;
  return key;
}

MXFSDTICPSystemMetadata samplePack(std::uint8_t bitmap, std::uint16_t continuityCount) {
  MXFSDTICPSystemMetadata pack;
  pack.bitmap = bitmap;
  pack.rate = 0x04;
  pack.type = 0x01;
  pack.channelHandle = 0x0203;
  pack.continuityCount = continuityCount;
  pack.label = containerLabel;
  for (std::size_t i = 0; i < pack.creationStamp.size(); ++i) {
    pack.creationStamp[i] = static_cast<std::uint8_t>(0x80 + i);
    pack.userStamp[i] = static_cast<std::uint8_t>(0xC0 + i);
  }
  return pack;
}

// The 57 octets of samplePack.
ByteVector packBytes(std::uint8_t bitmap, std::uint16_t continuityCount) {
  // Bitmap, rate, type, channel handle, continuity count.
  ByteVector bytes = bytesOf("00 04 01 02 03 00 00");
  bytes[0] = bitmap;
  bytes[5] = static_cast<std::uint8_t>(continuityCount >> 8);
  bytes[6] = static_cast<std::uint8_t>(continuityCount);
  bytes.insert(bytes.end(), containerLabel.data(), containerLabel.data() + 16);
  for (std::uint8_t i = 0; i < 17; ++i) bytes.push_back(static_cast<std::uint8_t>(0x80 + i));
  for (std::uint8_t i = 0; i < 17; ++i) bytes.push_back(static_cast<std::uint8_t>(0xC0 + i));
  return bytes;
}

class MXFSDTICPSystemParserTest : public ::testing::Test {
 protected:
  MXFSDTICPSystemParserTest() { parser.setErrorHandler(&errors); }

  void pack(std::uint8_t bitmap, std::uint16_t continuityCount = 0) {
    parser.systemFixedPack(packKey, packBytes(bitmap, continuityCount));
  }
  void set(const KLVKey& key, const MXFGCLocalItems& items) { parser.systemLocalSet(key, items); }
  std::vector<std::string> reports() const { return reportLines(errors); }

  RecordingSDTICPHandler handler;
  RecordingErrorHandler errors;
  MXFSDTICPSystemParser parser{&handler};
};

const MXFGCLocalItems oneItem{{0x83, {0x0A, 0x0B}}};

}  // namespace

// ---------------------------------------------------------------------------
// Key tests

TEST(MXFSDTICPKeys, EachSetKindIsTakenFromOctet14WhateverOctet15AndTheVersion) {
  KLVKey picture = setKey(3, 0x7F);
  picture[7] = 0x05;
  EXPECT_TRUE(isMXFSDTICPPackageMetadataSet(setKey(2, 0)));
  EXPECT_TRUE(isMXFSDTICPPictureMetadataSet(picture));
  EXPECT_TRUE(isMXFSDTICPSoundMetadataSet(setKey(4, 1)));
  EXPECT_TRUE(isMXFSDTICPDataMetadataSet(setKey(5, 9)));
  EXPECT_TRUE(isMXFSDTICPControlDataSet(keyOf("06 0E 2B 34 02 63 01 0A 0D 01 03 01 04 01 06 03")));
  EXPECT_FALSE(isMXFSDTICPPackageMetadataSet(setKey(3, 0)));
  EXPECT_FALSE(isMXFSDTICPSoundMetadataSet(setKey(5, 0)));
  EXPECT_FALSE(isMXFSDTICPDataMetadataSet(setKey(2, 0)));
  EXPECT_FALSE(isMXFSDTICPPictureMetadataSet(packKey));
}

TEST(MXFSDTICPKeys, KindOfTheOtherSetCodingIsNoSetOfEither) {
  EXPECT_FALSE(isMXFSDTICPControlDataSet(setKey(6, 1)));
  EXPECT_FALSE(isMXFSDTICPPackageMetadataSet(keyOf("06 0E 2B 34 02 63 01 01 0D 01 03 01 04 01 02 01")));
}

// ---------------------------------------------------------------------------
// Elements wanted

TEST_F(MXFSDTICPSystemParserTest, PackAndBothSetFamiliesAreWanted) {
  EXPECT_TRUE(parser.startSystemElement(packKey));
  EXPECT_TRUE(parser.startSystemElement(setKey(2, 1)));
  EXPECT_TRUE(parser.startSystemElement(setKey(9, 0)));
  EXPECT_TRUE(parser.startSystemElement(controlKey));
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFSDTICPSystemParserTest, OtherSystemElementIsReportedAndNotWanted) {
  const KLVKey proxy = keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00");
  EXPECT_FALSE(parser.startSystemElement(proxy));
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine(
                           "error", invalidSDTICPSystemElementId,
                           "invalid SDTI-CP system element - 06.0E.2B.34.02.53.01.01.0D.01.03.01.14.02.01.00")}));
}

// ---------------------------------------------------------------------------
// The system metadata pack

TEST_F(MXFSDTICPSystemParserTest, PackIsReadFieldByField) {
  pack(0x5C, 0x1234);
  ASSERT_EQ(handler.packs.size(), 1u);
  EXPECT_EQ(handler.packs[0], samplePack(0x5C, 0x1234));
  EXPECT_EQ(handler.packs[0].channelHandle, 0x0203);
  EXPECT_EQ(handler.packs[0].userStamp[16], 0xD0);
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFSDTICPSystemParserTest, PackOf56OctetsIsReportedAndYieldsNoEvent) {
  ByteVector bytes = packBytes(0x5C, 1);
  bytes.pop_back();
  parser.systemFixedPack(packKey, bytes);
  EXPECT_TRUE(handler.events.empty());
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", invalidSDTICPSystemMetadataId,
                                      "invalid SDTI-CP system metadata value - assertion failure: successful get()")}));
}

TEST_F(MXFSDTICPSystemParserTest, PackOf58OctetsIsReportedAndYieldsNoEvent) {
  ByteVector bytes = packBytes(0x5C, 1);
  bytes.push_back(0);
  parser.systemFixedPack(packKey, bytes);
  EXPECT_TRUE(handler.events.empty());
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine(
                           "error", invalidSDTICPSystemMetadataId,
                           "invalid SDTI-CP system metadata value - assertion failure: valid external length")}));
}

TEST_F(MXFSDTICPSystemParserTest, PackCutInItsLabelFailsTheRead) {
  ByteVector bytes = packBytes(0x5C, 1);
  bytes.resize(20);
  parser.systemFixedPack(packKey, bytes);
  EXPECT_TRUE(handler.events.empty());
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine(
                           "error", invalidSDTICPSystemMetadataId,
                           "invalid SDTI-CP system metadata value - assertion failure: successful read()")}));
}

TEST_F(MXFSDTICPSystemParserTest, FixedPackOfAnotherKeyFailsTheAssertion) {
  EXPECT_EQ(assertionTextOf([&] { parser.systemFixedPack(setKey(2, 0), packBytes(0, 0)); }),
            "assertion failure: valid SDTI-CP fixed length pack");
}

TEST_F(MXFSDTICPSystemParserTest, VariablePackFailsTheAssertion) {
  EXPECT_EQ(assertionTextOf([&] { parser.systemVariablePack(packKey, {{1}}); }),
            "assertion failure: valid SDTI-CP variable length pack");
}

// ---------------------------------------------------------------------------
// Control expectation

TEST_F(MXFSDTICPSystemParserTest, AnnouncedControlDataPassesWithoutReport) {
  pack(0x01, 0);
  set(setKey(2, 1), oneItem);
  set(controlKey, {{5, {0x0C}}});
  pack(0x01, 1);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"systemMetadata 0", "packageMetadata 131=0A 0B;",
                                                      "controlData 5=0C", "systemMetadata 1"}));
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFSDTICPSystemParserTest, AnnouncedControlDataThatNeverCameIsReportedAtTheNextPack) {
  pack(0x01, 0);
  set(setKey(2, 1), oneItem);
  pack(0x01, 1);
  EXPECT_EQ(handler.events.back(), "systemMetadata 1");
  EXPECT_EQ(reports(),
            (std::vector<std::string>{reportLine("error", sdticpControlDataId, "missing SDTI-CP control data")}));
}

TEST_F(MXFSDTICPSystemParserTest, ControlDataThatThePackDidNotAnnounceIsReportedAndDelivered) {
  pack(0x5C, 0);
  set(controlKey, {{5, {0x0C}}});
  EXPECT_EQ(handler.events.back(), "controlData 5=0C");
  EXPECT_EQ(reports(),
            (std::vector<std::string>{reportLine("error", sdticpControlDataId, "unexpected SDTI-CP control data")}));
}

TEST_F(MXFSDTICPSystemParserTest, SetBeforeAnyPackIsReportedAsMissingThePackAndDelivered) {
  set(setKey(2, 1), oneItem);
  set(setKey(3, 1), oneItem);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"packageMetadata 131=0A 0B;", "pictureMetadata 131=0A 0B;"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", invalidSDTICPSystemMetadataId, "missing SDTI-CP system metadata")}));
}

TEST_F(MXFSDTICPSystemParserTest, ControlDataBeforeAnyPackMissesThePackAndWasNotExpected) {
  set(controlKey, {{5, {0x0C}}});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"controlData 5=0C"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", invalidSDTICPSystemMetadataId, "missing SDTI-CP system metadata"),
                           reportLine("error", sdticpControlDataId, "unexpected SDTI-CP control data")}));
}

TEST_F(MXFSDTICPSystemParserTest, AfterControlDataASetMissesItsPack) {
  pack(0x01, 0);
  set(controlKey, {{5, {0x0C}}});
  set(setKey(2, 1), oneItem);
  EXPECT_EQ(handler.events.back(), "packageMetadata 131=0A 0B;");
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", invalidSDTICPSystemMetadataId, "missing SDTI-CP system metadata")}));
}

TEST_F(MXFSDTICPSystemParserTest, WithoutControlDataSetsAfterAPackGoOnBeingAccepted) {
  pack(0x5C, 0);
  set(setKey(2, 1), oneItem);
  set(setKey(3, 1), oneItem);
  set(setKey(4, 1), oneItem);
  set(setKey(5, 1), oneItem);
  EXPECT_EQ(handler.events.size(), 5u);
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFSDTICPSystemParserTest, NextPackClearsTheKindsSeen) {
  pack(0x5C, 0);
  set(setKey(2, 1), oneItem);
  pack(0x5C, 1);
  set(setKey(2, 1), oneItem);
  EXPECT_EQ(handler.events.size(), 4u);
  EXPECT_TRUE(reports().empty());
}

TEST_F(MXFSDTICPSystemParserTest, UnreadablePackExpectsNoControlData) {
  pack(0x01, 0);
  parser.systemFixedPack(packKey, ByteVector(56, 0x01));
  set(controlKey, {{5, {0x0C}}});
  pack(0x5C, 1);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"systemMetadata 0", "controlData 5=0C", "systemMetadata 1"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", sdticpControlDataId, "missing SDTI-CP control data"),
                           reportLine("error", invalidSDTICPSystemMetadataId,
                                      "invalid SDTI-CP system metadata value - assertion failure: successful get()"),
                           reportLine("error", sdticpControlDataId, "unexpected SDTI-CP control data")}));
}

// ---------------------------------------------------------------------------
// Set counts and kinds

TEST_F(MXFSDTICPSystemParserTest, ControlDataSetOfTwoItemsIsReportedAndItsFirstItemDelivered) {
  pack(0x01, 0);
  set(controlKey, {{5, {0x0C}}, {6, {0x0D}}});
  EXPECT_EQ(handler.events.back(), "controlData 5=0C");
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", sdticpControlDataId, "incorrect SDTI-CP control data block count")}));
}

TEST_F(MXFSDTICPSystemParserTest, EmptyControlDataSetIsReportedAndDeliversNothing) {
  pack(0x01, 0);
  set(controlKey, {});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"systemMetadata 0"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", sdticpControlDataId, "incorrect SDTI-CP control data block count")}));
  // The set still took the place of the announced control data.
  pack(0x5C, 1);
  EXPECT_EQ(reports().size(), 1u);
}

TEST_F(MXFSDTICPSystemParserTest, TwoPackageSetsAfterOnePackReportTheSecondAsExtraAndDeliverBoth) {
  pack(0x5C, 0);
  set(setKey(2, 1), oneItem);
  set(setKey(2, 1), {{0x84, {0x0C}}});
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{"systemMetadata 0", "packageMetadata 131=0A 0B;", "packageMetadata 132=0C;"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine("error", unexpectedSDTICPMetadataId,
                                                            "unexpected extra SDTI-CP package metadata")}));
}

TEST_F(MXFSDTICPSystemParserTest, ExtraSetsOfTheOtherKindsNameTheirKind) {
  pack(0x5C, 0);
  for (std::uint8_t kind = 3; kind <= 5; ++kind) {
    set(setKey(kind, 1), oneItem);
    set(setKey(kind, 1), oneItem);
  }
  EXPECT_EQ(handler.events.size(), 7u);
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("error", unexpectedSDTICPMetadataId, "unexpected extra SDTI-CP picture metadata"),
                           reportLine("error", unexpectedSDTICPMetadataId, "unexpected extra SDTI-CP sound metadata"),
                           reportLine("error", unexpectedSDTICPMetadataId, "unexpected extra SDTI-CP data metadata")}));
}

TEST_F(MXFSDTICPSystemParserTest, MetadataSetCountingZeroBlocksWithOneItemIsWarnedAndDelivered) {
  pack(0x5C, 0);
  set(setKey(2, 0), oneItem);
  EXPECT_EQ(handler.events.back(), "packageMetadata 131=0A 0B;");
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine("warning", sdticpBlockCountId,
                                                            "incorrect SDTI-CP package metadata block count")}));
}

TEST_F(MXFSDTICPSystemParserTest, BlockCountWarningsNameTheirKind) {
  pack(0x5C, 0);
  set(setKey(3, 2), oneItem);
  set(setKey(4, 0), oneItem);
  set(setKey(5, 1), {});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"systemMetadata 0", "pictureMetadata 131=0A 0B;",
                                                      "soundMetadata 131=0A 0B;", "dataMetadata"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{
                           reportLine("warning", sdticpBlockCountId, "incorrect SDTI-CP picture metadata block count"),
                           reportLine("warning", sdticpBlockCountId, "incorrect SDTI-CP sound metadata block count"),
                           reportLine("warning", sdticpBlockCountId, "incorrect SDTI-CP data metadata block count")}));
}

TEST_F(MXFSDTICPSystemParserTest, OneByteTagSetWithTheControlKindIsInvalid) {
  pack(0x01, 0);
  set(setKey(6, 1), oneItem);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"systemMetadata 0"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine(
                           "error", invalidSDTICPSystemElementId,
                           "invalid SDTI-CP system element - 06.0E.2B.34.02.43.01.01.0D.01.03.01.04.01.06.01")}));
}

TEST_F(MXFSDTICPSystemParserTest, FourByteLengthSetWithThePackageKindIsInvalid) {
  pack(0x5C, 0);
  set(keyOf("06 0E 2B 34 02 63 01 01 0D 01 03 01 04 01 02 01"), oneItem);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"systemMetadata 0"}));
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine(
                           "error", invalidSDTICPSystemElementId,
                           "invalid SDTI-CP system element - 06.0E.2B.34.02.63.01.01.0D.01.03.01.04.01.02.01")}));
}

TEST_F(MXFSDTICPSystemParserTest, SetOfAnUnknownKindIsInvalid) {
  pack(0x5C, 0);
  set(setKey(7, 0), {});
  EXPECT_EQ(reports(), (std::vector<std::string>{reportLine(
                           "error", invalidSDTICPSystemElementId,
                           "invalid SDTI-CP system element - 06.0E.2B.34.02.43.01.01.0D.01.03.01.04.01.07.00")}));
}

TEST(MXFSDTICPSystemParser, WithoutAnErrorHandlerNothingIsReportedAndEventsStillCome) {
  RecordingSDTICPHandler handler;
  MXFSDTICPSystemParser parser(&handler);
  EXPECT_FALSE(parser.startSystemElement(keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00")));
  parser.systemLocalSet(setKey(2, 0), oneItem);
  parser.systemFixedPack(packKey, ByteVector(3, 0));
  parser.systemLocalSet(controlKey, {});
  EXPECT_EQ(handler.events, (std::vector<std::string>{"packageMetadata 131=0A 0B;"}));
}

// ---------------------------------------------------------------------------
// The coder

TEST(MXFSDTICPSystemCoder, PackIsOneFixedPackOf57OctetsInFieldOrder) {
  RecordingGCHandler recorder;
  MXFSDTICPSystemCoder coder(&recorder);
  coder.systemMetadata(samplePack(0x5C, 0x1234));
  EXPECT_EQ(recorder.events,
            (std::vector<std::string>{"startSystemElement " + toString(packKey),
                                      "systemFixedPack " + toString(packKey) + " " + hexOf(packBytes(0x5C, 0x1234))}));
  ASSERT_EQ(recorder.fixedPacks.size(), 1u);
  EXPECT_EQ(recorder.fixedPacks[0].size(), MXFSDTICPSystemMetadataPackLength);
}

TEST(MXFSDTICPSystemCoder, MetadataSetKeysCarryTheirKindAndItemCount) {
  RecordingGCHandler recorder;
  MXFSDTICPSystemCoder coder(&recorder);
  const MXFGCLocalItems twoItems{{0x83, {0x01}}, {0x84, {}}};
  coder.packageMetadata({});
  coder.pictureMetadata(oneItem);
  coder.soundMetadata(twoItems);
  coder.dataMetadata(oneItem);
  EXPECT_EQ(recorder.events, (std::vector<std::string>{"startSystemElement " + toString(setKey(2, 0)),
                                                       "systemLocalSet " + toString(setKey(2, 0)) + " ",
                                                       "startSystemElement " + toString(setKey(3, 1)),
                                                       "systemLocalSet " + toString(setKey(3, 1)) + " 0083=0A 0B;",
                                                       "startSystemElement " + toString(setKey(4, 2)),
                                                       "systemLocalSet " + toString(setKey(4, 2)) + " 0083=01;0084=;",
                                                       "startSystemElement " + toString(setKey(5, 1)),
                                                       "systemLocalSet " + toString(setKey(5, 1)) + " 0083=0A 0B;"}));
}

TEST(MXFSDTICPSystemCoder, ControlDataIsAlwaysOneItemSoNeverAnEmptySet) {
  RecordingGCHandler recorder;
  MXFSDTICPSystemCoder coder(&recorder);
  coder.controlData(0x05, {});
  EXPECT_EQ(recorder.events, (std::vector<std::string>{"startSystemElement " + toString(controlKey),
                                                       "systemLocalSet " + toString(controlKey) + " 0005=;"}));
}

TEST(MXFSDTICPSystemCoder, DeclinedElementsAreNotWritten) {
  RecordingGCHandler recorder(RecordingGCHandler::take, false);
  MXFSDTICPSystemCoder coder(&recorder);
  coder.systemMetadata(samplePack(0, 0));
  coder.packageMetadata(oneItem);
  coder.controlData(5, {1});
  EXPECT_EQ(recorder.events, (std::vector<std::string>{"startSystemElement " + toString(packKey),
                                                       "startSystemElement " + toString(setKey(2, 1)),
                                                       "startSystemElement " + toString(controlKey)}));
}

TEST(MXFSDTICPSystemCoder, SystemItemIsCodedInTheSetCodingsOfItsKeys) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  writer.startStream(true);
  MXFGCSystemCoder system(&writer);
  MXFSDTICPSystemCoder coder(&system);
  coder.packageMetadata(oneItem);
  coder.controlData(0x05, {0x0C});
  writer.endStream(false);
  // One-octet tags with two-octet lengths, then with four-octet lengths.
  EXPECT_EQ(
      klv::outputOf(out),
      concat({bytesOf("06 0E 2B 34 02 43 01 01 0D 01 03 01 04 01 02 01 83 00 00 05"), bytesOf("83 00 02 0A 0B"),
              bytesOf("06 0E 2B 34 02 63 01 01 0D 01 03 01 04 01 06 00 83 00 00 06"), bytesOf("05 00 00 00 01 0C")}));
}

TEST(MXFSDTICPSystemMetadata, PacksAreEqualWhenEveryFieldIs) {
  const MXFSDTICPSystemMetadata pack = samplePack(0x5C, 7);
  EXPECT_TRUE(pack == samplePack(0x5C, 7));
  EXPECT_FALSE(pack != samplePack(0x5C, 7));
  MXFSDTICPSystemMetadata other = pack;
  other.userStamp[16] = 0;
  EXPECT_NE(pack, other);
  other = pack;
  other.label[15] = 0x02;
  EXPECT_NE(pack, other);
  other = pack;
  other.type = 0;
  EXPECT_NE(pack, other);
}

// ---------------------------------------------------------------------------
// Coder and parser through octets

TEST(MXFSDTICPSystemCoder, EditUnitsReadBackAsTheyWereCoded) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  {
    MXFGCMuxer muxer(&writer);
    MXFSDTICPSystemCoder coder(muxer.getSystemHandler());
    muxer.getStructureHandler()->start(0);
    for (std::uint16_t unit = 0; unit < 2; ++unit) {
      coder.systemMetadata(samplePack(0x5D, unit));
      coder.packageMetadata(oneItem);
      coder.pictureMetadata({{0x01, {0x11}}, {0x02, {}}});
      coder.soundMetadata({});
      coder.dataMetadata(oneItem);
      coder.controlData(0x09, {0x21, 0x22});
    }
    muxer.getStructureHandler()->end();
  }
  RecordingSDTICPHandler handler;
  RecordingErrorHandler errors;
  MXFSDTICPSystemParser parser(&handler);
  parser.setErrorHandler(&errors);
  MXFGCSplitter splitter(nullptr, &parser, nullptr);
  splitter.setErrorHandler(&errors);
  readThrough(klv::outputOf(out), splitter, &errors);
  const std::vector<std::string> unit{"packageMetadata 131=0A 0B;", "pictureMetadata 1=11;2=;", "soundMetadata",
                                      "dataMetadata 131=0A 0B;", "controlData 9=21 22"};
  std::vector<std::string> expected{"systemMetadata 0"};
  expected.insert(expected.end(), unit.begin(), unit.end());
  expected.push_back("systemMetadata 1");
  expected.insert(expected.end(), unit.begin(), unit.end());
  EXPECT_EQ(handler.events, expected);
  ASSERT_EQ(handler.packs.size(), 2u);
  EXPECT_EQ(handler.packs[1], samplePack(0x5D, 1));
  EXPECT_TRUE(reportLines(errors).empty());
}
