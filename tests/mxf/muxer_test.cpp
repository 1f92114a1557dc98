// Files written through the four ports of MXFMuxer and read back.
#include <gtest/gtest.h>

#include <sstream>

#include "mxf.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

MXFPartitionPack packOf(std::uint32_t kagSize, std::uint64_t headerByteCount) {
  MXFPartitionPack pack;
  pack.kagSize = kagSize;
  pack.headerByteCount = headerByteCount;
  pack.operationalPattern = keyOf("06.0E.2B.34.04.01.01.01.0D.01.02.01.01.01.09.00");
  return pack;
}

// A muxer over a writer on a string.
struct MuxedFile {
  std::ostringstream out;
  GenericKLVWriter writer{out};
  MXFMuxer muxer{&writer};

  ByteVector bytes() const {
    const std::string text = out.str();
    return ByteVector(text.begin(), text.end());
  }
  void partition(MXFPartitionKind kind, const MXFPartitionPack& pack) {
    muxer.getStructureHandler()->startPartition(MXFPartitionPackKey(kind, MXFClosedComplete), pack, 0);
  }
  void endPartition(MXFPartitionKind kind) {
    muxer.getStructureHandler()->endPartition(MXFPartitionPackKey(kind, MXFClosedComplete));
  }
  void finish() {
    partition(MXFFooterPartition, packOf(1, 0));
    endPartition(MXFFooterPartition);
    muxer.getStructureHandler()->randomIndex({});
    muxer.getStructureHandler()->endStream(false);
  }
};

// Pack: key, four-octet length, 88 octets of fields and no labels.
constexpr std::size_t packSize = 16 + 4 + 88;
constexpr std::size_t ripSize = 16 + 4 + 2 * 12 + 4;

void writeItem(KLVHandler& handler, std::size_t valueLength) {
  const ByteVector value(valueLength, 0x5A);
  handler.setLengthForm(0x83);
  writeIndividualItem(handler, keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.01"), value.data(),
                      value.size());
}

void writeMetadata(MuxedFile& file, std::size_t valueLength) {
  KLVHandler* port = file.muxer.getMetadataHandler();
  port->startStream(true);
  writeItem(*port, valueLength);
  port->endStream(false);
}

}  // namespace

TEST(MXFMuxer, HeaderAndFooterWithoutEssenceReadBackClean) {
  MuxedFile file;
  file.muxer.getStructureHandler()->startStream();
  file.partition(MXFHeaderPartition, packOf(1, 0));
  file.endPartition(MXFHeaderPartition);
  file.finish();
  const ByteVector bytes = file.bytes();
  ASSERT_EQ(bytes.size(), 2 * packSize + ripSize);
  ReaderRun run;
  readWithMXFReader(bytes, run);
  EXPECT_EQ(run.failure, "no failure");
  EXPECT_TRUE(run.reports().empty());
  ASSERT_EQ(run.structure.packs.size(), 2u);
  EXPECT_EQ(run.structure.packs[1].thisPartition, packSize);
  EXPECT_EQ(run.structure.packs[1].previousPartition, 0u);
  EXPECT_EQ(run.structure.packs[1].footerPartition, packSize);
  EXPECT_EQ(run.structure.entries, (std::vector<MXFRandomIndexEntry>{{0, 0}, {0, packSize}}));
}

TEST(MXFMuxer, MetadataPortGivenNothingWithHeaderByteCountZeroWritesNothing) {
  MuxedFile file;
  file.muxer.getStructureHandler()->startStream();
  file.partition(MXFHeaderPartition, packOf(1, 0));
  file.muxer.getMetadataHandler()->startStream(true);
  file.muxer.getMetadataHandler()->endStream(false);
  file.muxer.getIndexHandler()->startStream(true);
  file.muxer.getIndexHandler()->endStream(false);
  file.endPartition(MXFHeaderPartition);
  EXPECT_EQ(file.bytes().size(), packSize);
}

TEST(MXFMuxer, ContentThatFillsItsRegionExactlyWritesNoFillItem) {
  MuxedFile file;
  file.muxer.getStructureHandler()->startStream();
  file.partition(MXFHeaderPartition, packOf(1, 20 + 100));
  writeMetadata(file, 100);
  file.endPartition(MXFHeaderPartition);
  const ByteVector bytes = file.bytes();
  ASSERT_EQ(bytes.size(), packSize + 120);
  EXPECT_EQ(ByteVector(bytes.begin() + packSize, bytes.begin() + packSize + 20),
            concat({bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 01"), bytesOf("83 00 00 64")}));
}

TEST(MXFMuxer, ContentLeavingTooLittleRoomForAFillItemFails) {
  MuxedFile file;
  file.muxer.getStructureHandler()->startStream();
  // 19 octets left: a fill item needs 20 for its key and length.
  file.partition(MXFHeaderPartition, packOf(1, 20 + 100 + 19));
  EXPECT_EQ(assertionTextOf([&] { writeMetadata(file, 100); }), "assertion failure: achievable padded length");
}

TEST(MXFMuxer, ContentLeavingRoomIsFilledToTheHeaderByteCount) {
  MuxedFile file;
  file.muxer.getStructureHandler()->startStream();
  file.partition(MXFHeaderPartition, packOf(1, 20 + 100 + 20 + 5));
  writeMetadata(file, 100);
  file.endPartition(MXFHeaderPartition);
  const ByteVector bytes = file.bytes();
  ASSERT_EQ(bytes.size(), packSize + 145);
  EXPECT_EQ(ByteVector(bytes.begin() + packSize + 120, bytes.begin() + packSize + 140),
            bytesOf("06 0E 2B 34 01 01 01 01 03 01 02 10 01 00 00 00 83 00 00 05"));
}

TEST(MXFMuxer, PositionSeenThroughAPortIsThatOfTheWholeFile) {
  MuxedFile file;
  file.muxer.getStructureHandler()->startStream();
  file.partition(MXFHeaderPartition, packOf(1, 200));
  auto* metadataPort = dynamic_cast<KLVFiller*>(file.muxer.getMetadataHandler());
  auto* indexPort = dynamic_cast<KLVFiller*>(file.muxer.getIndexHandler());
  ASSERT_NE(metadataPort, nullptr);
  ASSERT_NE(indexPort, nullptr);
  EXPECT_EQ(std::streamoff(metadataPort->getLocator()->getPosition()), std::streamoff(packSize));
  EXPECT_EQ(std::streamoff(indexPort->getLocator()->getPosition()), std::streamoff(packSize));
  writeMetadata(file, 100);
  writeItem(*file.muxer.getEssenceHandler(), 30);
  file.endPartition(MXFHeaderPartition);
  MXFPartitionPack body = packOf(1, 0);
  body.bodySID = 1;
  file.partition(MXFBodyPartition, body);
  EXPECT_EQ(std::streamoff(indexPort->getLocator()->getPosition()), std::streamoff(2 * packSize + 200 + 50));
  file.endPartition(MXFBodyPartition);
  file.finish();
  ReaderRun run;
  readWithMXFReader(file.bytes(), run);
  EXPECT_TRUE(run.reports().empty());
  ASSERT_EQ(run.structure.packs.size(), 3u);
  EXPECT_EQ(run.structure.packs[1].thisPartition, packSize + 200 + 50);
  EXPECT_EQ(run.structure.packs[2].previousPartition, packSize + 200 + 50);
}

TEST(MXFMuxer, HandlerIsTheMonitorsNextHandler) {
  MXFMuxer muxer;
  RecordingKLVHandler recording;
  muxer.setHandler(&recording);
  EXPECT_EQ(muxer.getHandler(), &recording);
  muxer.getStructureHandler()->startStream();
  writeItem(*muxer.getEssenceHandler(), 3);
  EXPECT_FALSE(recording.events.empty());
}
