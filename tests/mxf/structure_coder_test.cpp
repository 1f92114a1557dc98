// The structure coder behind a monitor and a writer, with header metadata,
// index and essence written between its packs as a muxer would.
#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/klv_output.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;
using zelta_test::klv::outputOf;

namespace {

constexpr std::uint64_t packOctets = 16 + 4 + 88;  // key, four-octet length, value without labels
constexpr std::uint64_t fillOverhead = 16 + 4;

const KLVKey headerKey = partitionKey(2, 4);
const KLVKey bodyKey = partitionKey(3, 4);
const KLVKey footerKey = partitionKey(4, 4);
const KLVKey op1a = keyOf("06.0E.2B.34.04.01.01.01.0D.01.02.01.01.01.09.00");

// The ports of a file being written: structure events to the coder, the
// rest through the padders or straight on, all counted by one monitor.
struct CoderBench {
  std::ostringstream out;
  GenericKLVWriter writer{out};
  KLVMonitor monitor{&writer};
  KLVStreamFilter sections{&monitor};
  KLVStreamPadder headerPadder{&sections};
  KLVStreamPadder indexPadder{&sections};
  MXFStructureCoder coder{&monitor, monitor.getLocator(), &headerPadder, &indexPadder};

  ByteVector bytes() const { return outputOf(out); }
  std::uint64_t size() const { return bytes().size(); }

  // A local set of the given item sizes through a padder.
  static void writeSet(KLVStreamPadder& padder, const KLVKey& key, const std::vector<std::size_t>& sizes) {
    padder.startStream(true);
    padder.setLengthForm(0x83);
    KLVLocalItems items;
    std::uint32_t tag = 0x3C01;
    for (std::size_t size : sizes) items.emplace_back(tag++, ByteVector(size, 0x5A));
    writeLocalSet(padder, key, items, 0x83);
    padder.endStream(false);
  }

  void writeEssence(std::size_t length) {
    ByteVector value(length, 0xE5);
    sections.setLengthForm(0x83);
    writeIndividualItem(sections, essenceElementKey(), value.data(), value.size());
  }
};

MXFPartitionPack packOf(std::uint32_t kag, std::uint64_t headerByteCount = 0, std::uint64_t indexByteCount = 0) {
  MXFPartitionPack pack;
  pack.majorVersion = 1;
  pack.minorVersion = 3;
  pack.kagSize = kag;
  pack.headerByteCount = headerByteCount;
  pack.indexByteCount = indexByteCount;
  pack.operationalPattern = op1a;
  return pack;
}

// The pack value written at an offset of the output.
MXFPartitionPack packIn(const ByteVector& bytes, std::uint64_t offset) {
  MXFPartitionPack pack;
  internalize(ByteVector(bytes.begin() + static_cast<std::ptrdiff_t>(offset + 20),
                         bytes.begin() + static_cast<std::ptrdiff_t>(offset + packOctets)),
              pack);
  return pack;
}

// Offsets of every partition pack key in the bytes, found by a plain scan.
std::vector<std::uint64_t> partitionOffsets(const ByteVector& bytes) {
  const ByteVector prefix = bytesOf("06 0e 2b 34 02 05 01 01 0d 01 02 01 01");
  std::vector<std::uint64_t> offsets;
  for (std::size_t i = 0; i + 16 <= bytes.size(); ++i)
    if (std::equal(prefix.begin(), prefix.end(), bytes.begin() + static_cast<std::ptrdiff_t>(i)) &&
        bytes[i + 13] >= 2 && bytes[i + 13] <= 4)
      offsets.push_back(i);
  return offsets;
}

}  // namespace

// ---------------------------------------------------------------------------
// Packs and their fill

TEST(StructureCoder, HeaderPackIsFollowedByFillToTheKAG) {
  CoderBench bench;
  bench.coder.startStream();
  MXFPartitionPack pack = packOf(512);
  bench.coder.startPartition(headerKey, pack, 0);
  // 108 octets of pack, a fill item of 20 + 384: one KAG.
  const ByteVector expected = concat({element(headerKey, packValue(pack)), element(fillKey(), ByteVector(384, 0))});
  EXPECT_EQ(expected, bench.bytes());
}

TEST(StructureCoder, PackLengthGivesTheExactSizeOfPackAndFill) {
  CoderBench bench;
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, packOf(512), 1024);
  const ByteVector bytes = bench.bytes();
  ASSERT_EQ(1024u, bytes.size());
  EXPECT_EQ(bytesOf("83 00 03 80"), ByteVector(bytes.begin() + 124, bytes.begin() + 128));  // 1024 - 108 - 20
}

TEST(StructureCoder, PackLengthThatIsNoMultipleOfTheKAGFails) {
  CoderBench bench;
  bench.coder.startStream();
  EXPECT_EQ("assertion failure: padded length is multiple of alignment",
            assertionTextOf([&] { bench.coder.startPartition(headerKey, packOf(512), 1000); }));
}

// Nor are the byte counts held to any multiple.
TEST(StructureCoder, KAGOfZeroWritesNoFillBehindThePack) {
  CoderBench bench;
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, packOf(0, 1000, 7), 0);
  EXPECT_EQ(packOctets, bench.size());
}

TEST(StructureCoder, CallersPackIsNotChanged) {
  CoderBench bench;
  bench.coder.startStream();
  bench.writeEssence(100);
  MXFPartitionPack pack = packOf(0);
  pack.thisPartition = 77;
  pack.previousPartition = 66;
  const MXFPartitionPack copy = pack;
  bench.coder.startPartition(footerKey, pack, 0);
  EXPECT_EQ(copy, pack);
  MXFPartitionPack written = packIn(bench.bytes(), 120);
  EXPECT_EQ(120u, written.thisPartition);
  EXPECT_EQ(0u, written.previousPartition);
}

TEST(StructureCoder, OffsetsComeFromThePlaceInTheFile) {
  CoderBench bench;
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, packOf(512), 0);
  bench.writeEssence(1000);  // 512 + 1020
  bench.coder.startPartition(bodyKey, packOf(512), 0);
  bench.writeEssence(1000);  // 1532 + 512 + 1020
  bench.coder.startPartition(footerKey, packOf(512), 0);
  const ByteVector bytes = bench.bytes();
  ASSERT_EQ((std::vector<std::uint64_t>{0, 1532, 3064}), partitionOffsets(bytes));
  const MXFPartitionPack header = packIn(bytes, 0);
  const MXFPartitionPack body = packIn(bytes, 1532);
  const MXFPartitionPack footer = packIn(bytes, 3064);
  EXPECT_EQ(0u, header.thisPartition);
  EXPECT_EQ(0u, header.previousPartition);
  EXPECT_EQ(0u, header.footerPartition);
  EXPECT_EQ(1532u, body.thisPartition);
  EXPECT_EQ(0u, body.previousPartition);
  EXPECT_EQ(0u, body.footerPartition);
  EXPECT_EQ(3064u, footer.thisPartition);
  EXPECT_EQ(1532u, footer.previousPartition);
  EXPECT_EQ(3064u, footer.footerPartition);
}

// The caller that knows the end of the file in advance puts it in every pack.
TEST(StructureCoder, FooterOffsetSetByTheCallerIsCheckedAgainstEachLaterPartition) {
  CoderBench bench;
  MXFPartitionPack pack = packOf(512);
  pack.footerPartition = 2048;
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, pack, 0);
  bench.writeEssence(492);  // to 1024
  bench.coder.startPartition(bodyKey, pack, 0);
  bench.writeEssence(492);  // to 2048
  const std::uint64_t before = bench.size();
  ASSERT_EQ(2048u, before);
  EXPECT_EQ("assertion failure: valid footer partition offset",
            assertionTextOf([&] { bench.coder.startPartition(bodyKey, pack, 0); }));
  EXPECT_EQ(before, bench.size());
  bench.writeEssence(100);  // behind it
  EXPECT_EQ("assertion failure: valid footer partition offset",
            assertionTextOf([&] { bench.coder.startPartition(bodyKey, pack, 0); }));
  EXPECT_EQ("assertion failure: valid footer partition offset",
            assertionTextOf([&] { bench.coder.startPartition(footerKey, pack, 0); }));
}

TEST(StructureCoder, FooterAtTheOffsetTheCallerSetPasses) {
  CoderBench bench;
  MXFPartitionPack pack = packOf(512);
  pack.footerPartition = 1024;
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, pack, 0);
  bench.writeEssence(492);
  bench.coder.startPartition(footerKey, pack, 0);
  EXPECT_EQ(1024u, packIn(bench.bytes(), 1024).footerPartition);
}

TEST(StructureCoder, ByteCountsMustBeMultiplesOfTheKAG) {
  CoderBench bench;
  bench.coder.startStream();
  EXPECT_EQ("assertion failure: header byte count is a multiple of KAG size",
            assertionTextOf([&] { bench.coder.startPartition(headerKey, packOf(512, 1000, 0), 0); }));
  EXPECT_EQ("assertion failure: index byte count is a multiple of KAG size",
            assertionTextOf([&] { bench.coder.startPartition(headerKey, packOf(512, 1024, 100), 0); }));
  EXPECT_EQ(0u, bench.size());
}

TEST(StructureCoder, KeyMustBeAPartitionKey) {
  CoderBench bench;
  bench.coder.startStream();
  EXPECT_EQ("assertion failure: valid partition key",
            assertionTextOf([&] { bench.coder.startPartition(randomIndexKey(), packOf(512), 0); }));
  EXPECT_EQ("assertion failure: valid partition key",
            assertionTextOf([&] { bench.coder.startPartition(partitionKey(3, 5), packOf(512), 0); }));
  EXPECT_EQ(0u, bench.size());
}

// ---------------------------------------------------------------------------
// Header metadata and index through the padders

TEST(StructureCoder, HeaderByteCountOfZeroWithNoHeaderMetadataWritesNoFill) {
  CoderBench bench;
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, packOf(512, 0, 0), 0);
  bench.headerPadder.startStream(true);
  bench.headerPadder.endStream(false);
  EXPECT_EQ(512u, bench.size());
}

TEST(StructureCoder, HeaderMetadataAndIndexArePaddedToTheirByteCounts) {
  CoderBench bench;
  bench.coder.startStream();
  MXFPartitionPack pack = packOf(512, 1024, 512);
  pack.indexSID = 2;
  bench.coder.startPartition(headerKey, pack, 0);
  CoderBench::writeSet(bench.headerPadder, metadataSetKey(), {16, 300});
  ASSERT_EQ(512u + 1024u, bench.size());
  CoderBench::writeSet(bench.indexPadder, indexSegmentKey(), {4, 8});
  const ByteVector bytes = bench.bytes();
  ASSERT_EQ(512u + 1024u + 512u, bytes.size());
  // Set at 512 (20 + 4 + 16 + 4 + 300 octets), then the fill; set at 1536.
  EXPECT_EQ(toString(metadataSetKey()), toString(KLVKey(bytes.data() + 512)));
  EXPECT_EQ(toString(fillKey()), toString(KLVKey(bytes.data() + 512 + 344)));
  EXPECT_EQ(toString(indexSegmentKey()), toString(KLVKey(bytes.data() + 1536)));
  EXPECT_EQ(toString(fillKey()), toString(KLVKey(bytes.data() + 1536 + 40)));
}

TEST(StructureCoder, HeaderMetadataThatLeavesNoRoomForTheFillFails) {
  CoderBench bench;
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, packOf(512, 512, 0), 0);
  // 20 + 4 + 470 = 494 octets: 18 left, too few for a fill item.
  EXPECT_EQ("assertion failure: achievable padded length",
            assertionTextOf([&] { CoderBench::writeSet(bench.headerPadder, metadataSetKey(), {470}); }));
}

// ---------------------------------------------------------------------------
// Random index

TEST(StructureCoder, RandomIndexComesFromTheCoderOwnList) {
  CoderBench bench;
  bench.coder.startStream();
  MXFPartitionPack header = packOf(0);
  header.bodySID = 1;
  bench.coder.startPartition(headerKey, header, 0);
  bench.coder.startPartition(footerKey, packOf(0), 0);
  bench.coder.randomIndex({{9, 9}, {9, 9}, {9, 9}});
  const ByteVector bytes = bench.bytes();
  const ByteVector pack(bytes.begin() + 2 * packOctets, bytes.end());
  EXPECT_EQ(bytesOf("06 0e 2b 34 02 05 01 01 0d 01 02 01 01 11 01 00  83 00 00 1c"
                    "00 00 00 01  00 00 00 00 00 00 00 00"
                    "00 00 00 00  00 00 00 00 00 00 00 6c"
                    "00 00 00 30"),
            pack);
}

TEST(StructureCoder, AddedPartitionJoinsTheListWithoutWriting) {
  CoderBench bench;
  MXFPartitionPack existing = packOf(0);
  existing.bodySID = 3;
  existing.thisPartition = 4096;
  bench.coder.addPartition(existing);
  bench.coder.startStream();
  EXPECT_EQ(0u, bench.size());
  bench.coder.startPartition(footerKey, packOf(0), 0);
  EXPECT_EQ(4096u, packIn(bench.bytes(), 0).previousPartition);
  bench.coder.randomIndex({});
  const ByteVector bytes = bench.bytes();
  EXPECT_EQ(bytesOf("00 00 00 03  00 00 00 00 00 00 10 00  00 00 00 00  00 00 00 00 00 00 00 00  00 00 00 30"),
            ByteVector(bytes.begin() + packOctets + 20, bytes.end()));
}

TEST(StructureCoder, RunInAndEndPartitionWriteNothing) {
  CoderBench bench;
  bench.coder.setRunIn(1000);
  bench.coder.startStream();
  bench.coder.startPartition(headerKey, packOf(0), 0);
  bench.coder.endPartition(headerKey);
  bench.coder.endStream(false);
  EXPECT_EQ(packOctets, bench.size());
}

// ---------------------------------------------------------------------------
// What the coder writes, the reader takes without a report

namespace {

// Header with metadata and index, a body, a footer with index, a random
// index; KAG 512.
ByteVector writtenFile() {
  CoderBench bench;
  bench.coder.startStream();
  MXFPartitionPack header = packOf(512, 1024, 512);
  header.indexSID = 2;
  header.bodySID = 1;
  bench.coder.startPartition(headerKey, header, 0);
  CoderBench::writeSet(bench.headerPadder, metadataSetKey(), {16, 300, 40});
  CoderBench::writeSet(bench.indexPadder, indexSegmentKey(), {4, 8, 8});
  bench.writeEssence(3000);
  bench.writeEssence(100);
  MXFPartitionPack body = packOf(512);
  body.bodySID = 1;
  body.bodyOffset = 3140;
  bench.coder.startPartition(bodyKey, body, 0);
  bench.writeEssence(2000);
  MXFPartitionPack footer = packOf(512, 0, 512);
  footer.indexSID = 2;
  bench.coder.startPartition(footerKey, footer, 0);
  CoderBench::writeSet(bench.indexPadder, indexSegmentKey(), {4, 8, 8});
  bench.coder.randomIndex({});
  bench.coder.endStream(false);
  return bench.bytes();
}

void overwrite(ByteVector& bytes, std::uint64_t offset, std::uint64_t value) {
  for (unsigned i = 0; i < 8; ++i) bytes[offset + i] = static_cast<std::uint8_t>(value >> (8 * (7 - i)));
}

}  // namespace

TEST(StructureCoder, WrittenFileReadsBackWithoutReport) {
  const ByteVector bytes = writtenFile();
  const std::vector<std::uint64_t> offsets = partitionOffsets(bytes);
  // Header 512 + 1024 + 512, essence 3020 + 120; body 512, essence 2020.
  ASSERT_EQ((std::vector<std::uint64_t>{0, 5188, 7720}), offsets);
  ReaderRun run;
  readWithMXFReader(bytes, run);
  EXPECT_EQ("no failure", run.failure);
  EXPECT_EQ(std::vector<std::string>{}, run.reports());
  ASSERT_EQ(3u, run.structure.packs.size());
  for (std::size_t i = 0; i < 3; ++i) {
    EXPECT_EQ(offsets[i], run.structure.packs[i].thisPartition) << i;
    EXPECT_EQ(i == 0 ? 0 : offsets[i - 1], run.structure.packs[i].previousPartition) << i;
  }
  EXPECT_EQ(7720u, run.structure.packs[2].footerPartition);
  EXPECT_EQ((std::vector<MXFRandomIndexEntry>{{1, 0}, {1, 5188}, {0, 7720}}), run.structure.entries);
  EXPECT_EQ((std::vector<std::string>{"startStream", "startPartition " + toString(headerKey) + " 512",
                                      "endPartition " + toString(headerKey),
                                      "startPartition " + toString(bodyKey) + " 512",
                                      "endPartition " + toString(bodyKey),
                                      "startPartition " + toString(footerKey) + " 512",
                                      "endPartition " + toString(footerKey), "randomIndex 3", "endStream 0"}),
            run.structure.events);
}

// The same file with one offset spoiled: the offset checks were at work.
TEST(StructureCoder, WrittenFileWithASpoiledOffsetIsReported) {
  ByteVector bytes = writtenFile();
  overwrite(bytes, 5188 + 20 + 8, 5000);  // thisPartition of the body
  overwrite(bytes, 7720 + 20 + 16, 0);    // previousPartition of the footer
  ReaderRun run;
  readWithMXFReader(bytes, run);
  EXPECT_EQ((std::vector<std::string>{reportLine("warning", thisPartitionId, "incorrect thisPartition"),
                                      reportLine("warning", previousPartitionId, "incorrect previousPartition")}),
            run.reports());
}
