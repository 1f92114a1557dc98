// The driver's variable rate road: long-GOP MPEG-2 in body partitions that
// begin at a GOP about every ten seconds, each carrying the index of the
// one before it, or every segment kept for the footer.
#include <gtest/gtest.h>

#include <memory>
#include <sstream>
#include <string>

#include "support/kit_masters.h"
#include "support/kit_readers.h"
#include "support/kit_sources.h"

using namespace zelta_test;

namespace {

constexpr std::size_t frameSize = 2000;
constexpr std::uint64_t unitCount = 600;
// The picture and four channels of sound.
constexpr std::size_t elementsPerUnit = 5;

std::shared_ptr<TestSource> longGOPSource(bool closedGOP, bool deferred) {
  std::shared_ptr<ZeltaDefaultMetadata> m = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 0x0103));
  m->origin = 0;
  m->duration = unitCount;
  m->closedGOP = closedGOP;
  auto source = std::make_shared<TestSource>(m, unitCount);
  source->uids = std::make_shared<CountingGenerator>();
  source->frames = mpeg2Frames(24, closedGOP, frameSize);
  source->soundSize = 1920 * 3;
  source->indexDeferred = deferred;
  return source;
}

ReadRecord written(const std::shared_ptr<TestSource>& source) {
  auto out = std::make_shared<std::stringstream>();
  createZeltaDriver(source)->drive(createZeltaWriter(out));
  ReadRecord record;
  readThroughZeltaReader(std::make_shared<std::istringstream>(out->str()), record, true);
  return record;
}

std::vector<MXFPartitionKind> kindsOf(const ReadRecord& record) {
  std::vector<MXFPartitionKind> kinds;
  for (const std::string& event : record.structure.events)
    if (event.compare(0, 15, "startPartition ") == 0) kinds.push_back(getMXFPartitionKind(keyOf(event.substr(15, 47))));
  return kinds;
}

}  // namespace

// GOPs of twelve: within the last twelve units of a target of 250, the GOP
// that starts at unit 240 begins the next partition.
TEST(DriverVariableRate, BodyPartitionsBeginAtTheGOPBeforeTenSecondsAndCarryTheIndexOfTheOneBefore) {
  for (bool closedGOP : {true, false}) {
    SCOPED_TRACE(closedGOP);
    const ReadRecord record = written(longGOPSource(closedGOP, false));
    EXPECT_EQ(record.failure, "");
    EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
    const std::vector<MXFPartitionKind> kinds = kindsOf(record);
    EXPECT_EQ(kinds, (std::vector<MXFPartitionKind>{MXFHeaderPartition, MXFBodyPartition, MXFBodyPartition,
                                                    MXFBodyPartition, MXFFooterPartition}));
    const std::vector<MXFPartitionPack>& packs = record.structure.packs;
    ASSERT_EQ(packs.size(), 5U);
    EXPECT_EQ(packs[0].bodySID, 0U);
    EXPECT_EQ(packs[0].indexByteCount, 0U);
    EXPECT_EQ(packs[1].indexByteCount, 0U);
    EXPECT_EQ(packs[1].bodyOffset, 0U);
    EXPECT_EQ(packs[2].indexByteCount, 4096U);
    EXPECT_EQ(packs[4].indexByteCount, 4096U);
    ASSERT_EQ(record.index.segments.size(), 3U);
    EXPECT_EQ(record.index.segments[0].indexStartPosition, 0);
    EXPECT_EQ(record.index.segments[0].indexDuration, 240);
    EXPECT_EQ(record.index.segments[1].indexStartPosition, 240);
    EXPECT_EQ(record.index.segments[1].indexDuration, 240);
    EXPECT_EQ(record.index.segments[2].indexStartPosition, 480);
    EXPECT_EQ(record.index.segments[2].indexDuration, 120);
    // Each edit unit takes 27136 octets: the system item's 512, the picture's
    // 20 + 2000 filled to 2048, and in the second slice four channels of
    // 6144. Body offsets count the essence before each partition, as the
    // entries do.
    EXPECT_EQ(packs[2].bodyOffset, 240U * 27136U);
    EXPECT_EQ(packs[3].bodyOffset, 480U * 27136U);
    EXPECT_EQ(record.index.segments[1].indexEntryArray.front().streamOffset, 240U * 27136U);
    EXPECT_EQ(record.index.segments[0].indexEntryArray.at(1).streamOffset, 27136U);
    EXPECT_EQ(record.index.segments[0].indexEntryArray.at(1).sliceOffsets, std::vector<std::uint32_t>{2560});
    ASSERT_EQ(record.gc.elements.size(), unitCount * elementsPerUnit);
  }
}

TEST(DriverVariableRate, DeferredIndexKeepsOneBodyPartitionAndEverySegmentForTheFooter) {
  const ReadRecord record = written(longGOPSource(true, true));
  EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
  EXPECT_EQ(kindsOf(record), (std::vector<MXFPartitionKind>{MXFHeaderPartition, MXFBodyPartition, MXFFooterPartition}));
  EXPECT_EQ(record.structure.packs.back().indexByteCount, 3U * 4096U);
  ASSERT_EQ(record.index.segments.size(), 3U);
  EXPECT_EQ(record.index.segments[2].indexStartPosition, 480);
}

TEST(DriverVariableRate, PicturesAreTheSourcesFramesAndEachEntryKnowsItsPicture) {
  auto source = longGOPSource(true, false);
  const ReadRecord record = written(source);
  ASSERT_EQ(record.gc.elements.size(), unitCount * elementsPerUnit);
  for (std::uint64_t unit = 0; unit < 30; ++unit)
    EXPECT_EQ(record.gc.elements[unit * elementsPerUnit].bytes, source->frames[unit % source->frames.size()]);
  const MXFIndexTableSegment& first = record.index.segments.front();
  ASSERT_EQ(first.indexEntryArray.size(), 240U);
  // An I picture of a closed GOP with its sequence header; a B picture
  // whose anchor is that key picture.
  EXPECT_EQ(first.indexEntryArray[0].flags, 0xC0);
  EXPECT_EQ(first.indexEntryArray[1].flags, 0x13);
  EXPECT_EQ(first.sliceCount, 1);
  EXPECT_EQ(first.indexEntryArray[1].sliceOffsets.size(), 1U);
}
