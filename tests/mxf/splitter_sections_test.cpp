#include <algorithm>

#include "mxf/splitter_fixture.h"

using namespace zelta_test;

namespace {

using Lines = std::vector<std::string>;

// A local set of one item with four octets: 28 octets in all.
ByteVector metadataSet() { return localSet(metadataSetKey(), {4}); }
ByteVector indexSegment() { return localSet(indexSegmentKey(), {4}); }
// Ten octets of essence: 30 octets in all.
ByteVector essenceItem() { return essenceElement(10); }

const std::string setKey = toString(metadataSetKey());
const std::string segmentKey = toString(indexSegmentKey());
const std::string itemKey = toString(essenceElementKey());

}  // namespace

TEST_F(SplitterRead, OnePartitionGivesEachSectionACompleteStreamInOrder) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(28, 28)), fillItem(smallFillSize), metadataSet(),
                             indexSegment(), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  Lines expected{"structure startStream",
                 "structure startPartition " + header() + " 128",
                 "metadata setLocator",
                 "metadata startStream 1",
                 "metadata setLengthForm 131",
                 "metadata startLocalSet " + setKey + " 8",
                 "metadata startLocalItem 15361 4",
                 "metadata value 4",
                 "metadata endLocalItem 15361",
                 "metadata endLocalSet " + setKey,
                 "metadata endStream 0",
                 "index setLocator",
                 "index startStream 1",
                 "index setLengthForm 131",
                 "index startLocalSet " + segmentKey + " 8",
                 "index startLocalItem 15361 4",
                 "index value 4",
                 "index endLocalItem 15361",
                 "index endLocalSet " + segmentKey,
                 "index endStream 0",
                 "essence setLocator",
                 "essence startStream 1",
                 "essence setLengthForm 131",
                 "essence startIndividualItem " + itemKey + " 10",
                 "essence value 10",
                 "essence endIndividualItem " + itemKey,
                 "essence endStream 0",
                 "structure endPartition " + header(),
                 "structure endStream 0"};
  EXPECT_EQ(expected, journal.lines);
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(SplitterRead, SectionWithoutElementsGivesItsDelegateNoEvents) {
  ByteVector bytes =
      concat({partitionPack(2, 4, packWithCounts(28, 0)), fillItem(smallFillSize), metadataSet(), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_TRUE(linesOf("index").empty());
  EXPECT_EQ(9u, linesOf("metadata").size());
  EXPECT_EQ(7u, linesOf("essence").size());
}

TEST_F(SplitterRead, PackWithoutFillOpensThePartitionAtTheNextElement) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(28, 0)), metadataSet()});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ((Lines{"startStream", "startPartition " + header() + " 108", "endPartition " + header(), "endStream 0"}),
            linesOf("structure"));
  EXPECT_EQ("startLocalSet " + setKey + " 8", linesOf("metadata").at(3));
}

TEST_F(SplitterRead, OnlyTheFirstFillItemBehindThePackBelongsToIt) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(40 + 28, 0)), fillItem(smallFillSize), fillItem(40),
                             metadataSet()});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ("structure startPartition " + header() + " 128", journal.lines.at(1));
  Lines expected{"setLocator",
                 "startStream 1",
                 "setLengthForm 131",
                 "startIndividualItem " + toString(fillKey()) + " 20",
                 "value 20",
                 "endIndividualItem " + toString(fillKey()),
                 "startLocalSet " + setKey + " 8",
                 "startLocalItem 15361 4",
                 "value 4",
                 "endLocalItem 15361",
                 "endLocalSet " + setKey,
                 "endStream 0"};
  EXPECT_EQ(expected, linesOf("metadata"));
}

TEST_F(SplitterRead, ZeroByteCountsWithoutEssenceOpenThePartitionAtTheNextPack) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), partitionPack(4, 4, packWithCounts(0, 0))});
  EXPECT_EQ("no failure", read(bytes));
  Lines expected{"structure startStream",
                 "structure startPartition " + header() + " 108",
                 "structure endPartition " + header(),
                 "structure startPartition " + footer() + " 108",
                 "structure endPartition " + footer(),
                 "structure endStream 0"};
  EXPECT_EQ(expected, journal.lines);
}

TEST_F(SplitterRead, ZeroByteCountsWithoutEssenceOpenThePartitionAtTheEndOfTheStream) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), fillItem(smallFillSize)});
  EXPECT_EQ("no failure", read(bytes));
  Lines expected{"structure startStream", "structure startPartition " + header() + " 128",
                 "structure endPartition " + header(), "structure endStream 0"};
  EXPECT_EQ(expected, journal.lines);
}

TEST_F(SplitterRead, PartitionPackAsTheLastElementStillStartsAndEndsItsPartition) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), essenceItem(),
                             partitionPack(4, 4, packWithCounts(0, 0))});
  EXPECT_EQ("no failure", read(bytes));
  Lines expected{"startStream",
                 "startPartition " + header() + " 108",
                 "endPartition " + header(),
                 "startPartition " + footer() + " 108",
                 "endPartition " + footer(),
                 "endStream 0"};
  EXPECT_EQ(expected, linesOf("structure"));
  EXPECT_EQ("essence endStream 0", journal.lines.at(8));
}

TEST_F(SplitterRead, PartitionPackInsideHeaderMetadataGoesToTheMetadataDelegate) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(packSize, 0)), fillItem(smallFillSize),
                             partitionPack(3, 4, packWithCounts(0, 0))});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ((Lines{"startStream", "startPartition " + header() + " 128", "endPartition " + header(), "endStream 0"}),
            linesOf("structure"));
  EXPECT_EQ("startFixedLengthPack " + body() + " 88", linesOf("metadata").at(3));
}

TEST_F(SplitterRead, BodyPartitionEndsThePartitionBeforeIt) {
  MXFPartitionPack bodyPack = packWithCounts(0, 0);
  bodyPack.bodySID = 1;
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(28, 0)), fillItem(smallFillSize), metadataSet(),
                             partitionPack(3, 4, bodyPack), essenceItem(), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  Lines expected{"startStream",
                 "startPartition " + header() + " 128",
                 "endPartition " + header(),
                 "startPartition " + body() + " 108",
                 "endPartition " + body(),
                 "endStream 0"};
  EXPECT_EQ(expected, linesOf("structure"));
  ASSERT_EQ(2u, structure.packs.size());
  EXPECT_EQ(28u, structure.packs[0].headerByteCount);
  EXPECT_EQ(1u, structure.packs[1].bodySID);
  EXPECT_EQ(10u, linesOf("essence").size());
}

TEST_F(SplitterRead, ByteCountsRuleOverKeys) {
  // The essence element falls in the index section by its byte count.
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 30)), essenceItem(), indexSegment()});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ("startIndividualItem " + itemKey + " 10", linesOf("index").at(3));
  EXPECT_EQ("startLocalSet " + segmentKey + " 8", linesOf("essence").at(3));
}

TEST_F(SplitterRead, DelegateHearsTheCurrentFormAtItsStartAndEachChangeWhileStarted) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(23 + 28, 0)), fillItem(smallFillSize),
                             element(metadataSetKey(), bytesOf("3C01 0002 ABCD"), 1), metadataSet(), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  Lines metadataLines = linesOf("metadata");
  EXPECT_EQ("setLengthForm 1", metadataLines.at(2));
  EXPECT_EQ("setLengthForm 131", metadataLines.at(8));
  Lines essenceLines = linesOf("essence");
  EXPECT_EQ("setLengthForm 131", essenceLines.at(2));
  EXPECT_EQ(1, std::count(essenceLines.begin(), essenceLines.end(), "setLengthForm 131"));
}

TEST_F(SplitterRead, DelegatesSeeTheSplittersPositions) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(28, 0)), fillItem(smallFillSize), metadataSet(),
                             essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  // setLocator and startStream at the section's start, the start event at
  // the first octet of the value, the end event behind the element.
  std::vector<std::streamoff> metadataPositions{128, 128, 148, 148, 152, 156, 156, 156, 156};
  EXPECT_EQ(metadataPositions, positionsOf("metadata"));
  std::vector<std::streamoff> essencePositions{156, 156, 176, 176, 186, 186, 186};
  EXPECT_EQ(essencePositions, positionsOf("essence"));
}

TEST_F(SplitterRead, DelegatesSeeTheSamePositionsFromAPipe) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(28, 0)), fillItem(smallFillSize), metadataSet(),
                             essenceItem()});
  EXPECT_EQ("no failure", runtimeErrorTextOf([&] { readThroughPipe(bytes, splitter, &errors); }));
  std::vector<std::streamoff> metadataPositions{128, 128, 148, 148, 152, 156, 156, 156, 156};
  EXPECT_EQ(metadataPositions, positionsOf("metadata"));
  std::vector<std::streamoff> essencePositions{156, 156, 176, 176, 186, 186, 186};
  EXPECT_EQ(essencePositions, positionsOf("essence"));
  EXPECT_EQ("structure startPartition " + header() + " 128", journal.lines.at(1));
}

TEST_F(SplitterRead, DelegatedLocatorKeepsTheLastPositionAfterTheStreamEnds) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  ASSERT_NE(nullptr, essence.locator());
  EXPECT_EQ(138, essence.locator()->getPosition());
}

TEST_F(SplitterRead, HeaderMetadataOverrunStopsAtTheFirstElementEndBeyondIt) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(20, 0)), fillItem(smallFillSize), metadataSet(),
                             metadataSet()});
  EXPECT_EQ("incorrect headerByteCount", read(bytes));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("fatal", errors.reports[0].severity);
  EXPECT_EQ(partitionByteCountId, errors.reports[0].identifier);
  EXPECT_EQ("incorrect headerByteCount", errors.reports[0].message);
  EXPECT_EQ(156, errors.positions[0]);
  Lines metadataLines = linesOf("metadata");
  EXPECT_EQ("endLocalSet " + setKey, metadataLines.at(metadataLines.size() - 2));
  EXPECT_EQ("endStream 1", metadataLines.back());
  Lines tail(journal.lines.end() - 2, journal.lines.end());
  EXPECT_EQ((Lines{"structure endPartition " + header(), "structure endStream 1"}), tail);
}

TEST_F(SplitterRead, EssenceOverrunningTheIndexSectionFailsIncorrectIndexByteCount) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 40)), indexSegment(), essenceItem()});
  EXPECT_EQ("incorrect indexByteCount", read(bytes));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("fatal", errors.reports[0].severity);
  EXPECT_EQ(partitionByteCountId, errors.reports[0].identifier);
  EXPECT_EQ("incorrect indexByteCount", errors.reports[0].message);
  EXPECT_EQ("startIndividualItem " + itemKey + " 10", linesOf("index").at(8));
  EXPECT_TRUE(linesOf("essence").empty());
}

TEST_F(SplitterRead, CutAtAnElementBoundaryInsideHeaderMetadataFailsInEndStream) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(56, 0)), fillItem(smallFillSize), metadataSet()});
  EXPECT_EQ("incorrect headerByteCount", read(bytes));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("fatal", errors.reports[0].severity);
  EXPECT_EQ(partitionByteCountId, errors.reports[0].identifier);
  EXPECT_EQ("incorrect headerByteCount", errors.reports[0].message);
  EXPECT_EQ(1, errors.ends);
  // Whoever had started hears of the end as of an aborted stream.
  Lines tail(journal.lines.end() - 3, journal.lines.end());
  EXPECT_EQ((Lines{"metadata endStream 1", "structure endPartition " + header(), "structure endStream 1"}), tail);
}

TEST_F(SplitterRead, CutAtAnElementBoundaryInsideTheIndexFailsInEndStream) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(28, 56)), fillItem(smallFillSize), metadataSet(),
                             indexSegment()});
  EXPECT_EQ("incorrect indexByteCount", read(bytes));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ(partitionByteCountId, errors.reports[0].identifier);
  EXPECT_EQ("incorrect indexByteCount", errors.reports[0].message);
  EXPECT_EQ("index endStream 1", journal.lines.at(journal.lines.size() - 3));
}

TEST_F(SplitterRead, CutInsideAnElementReportsOnlyTheShortRead) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(56, 0)), fillItem(smallFillSize), metadataSet(),
                             metadataSet()});
  bytes.resize(bytes.size() - 3);
  EXPECT_EQ("unsuccessful read()", read(bytes));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ(streamFailureId, errors.reports[0].identifier);
  EXPECT_EQ("structure endStream 1", journal.lines.back());
}

TEST_F(SplitterRead, CutAtAnElementBoundaryInsideTheBodyEndsNormally) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(28, 0)), fillItem(smallFillSize), metadataSet(),
                             essenceItem(), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_TRUE(errors.reports.empty());
  Lines tail(journal.lines.end() - 3, journal.lines.end());
  EXPECT_EQ((Lines{"essence endStream 0", "structure endPartition " + header(), "structure endStream 0"}), tail);
}
