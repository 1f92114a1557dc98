#include "mxf/splitter_fixture.h"

using namespace zelta_test;

namespace {

using Lines = std::vector<std::string>;

ByteVector essenceItem() { return essenceElement(10); }

// A fixed length pack of eight octets under the given key.
ByteVector smallPack(const KLVKey& key) { return element(key, bytesOf("0102030405060708")); }

}  // namespace

TEST_F(SplitterRead, PartitionShapedKeyWithVersionZeroInTheBodyIsEssence) {
  KLVKey versionZero = partitionKey(3, 4, 0x00);
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), smallPack(versionZero), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ("startFixedLengthPack 06.0E.2B.34.02.05.01.00.0D.01.02.01.01.03.04.00 8", linesOf("essence").at(3));
  EXPECT_EQ((Lines{"startStream", "startPartition " + header() + " 108", "endPartition " + header(), "endStream 0"}),
            linesOf("structure"));
}

TEST_F(SplitterRead, PartitionShapedKeyWithStatusFiveInTheBodyIsEssence) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), smallPack(partitionKey(3, 5))});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ("startFixedLengthPack 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.03.05.00 8", linesOf("essence").at(3));
  EXPECT_EQ(1u, structure.packs.size());
}

TEST_F(SplitterRead, PartitionShapedKeyWithVersionZeroFirstIsUnexpected) {
  EXPECT_EQ("unexpected fixed length pack - 06.0E.2B.34.02.05.01.00.0D.01.02.01.01.03.04.00",
            read(smallPack(partitionKey(3, 4, 0x00))));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("fatal", errors.reports[0].severity);
  EXPECT_EQ(unexpectedElementId, errors.reports[0].identifier);
  EXPECT_EQ("unexpected fixed length pack - 06.0E.2B.34.02.05.01.00.0D.01.02.01.01.03.04.00",
            errors.reports[0].message);
  EXPECT_EQ((Lines{"structure startStream", "structure endStream 1"}), journal.lines);
}

TEST_F(SplitterRead, PartitionShapedKeyWithStatusFiveFirstIsUnexpected) {
  EXPECT_EQ("unexpected fixed length pack - 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.03.05.00",
            read(smallPack(partitionKey(3, 5))));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ(unexpectedElementId, errors.reports[0].identifier);
}

TEST_F(SplitterRead, StreamThatDoesNotStartWithAPartitionPackStopsAtItsFirstElement) {
  EXPECT_EQ("unexpected individual item - " + toString(essenceElementKey()), read(essenceItem()));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ(unexpectedElementId, errors.reports[0].identifier);
  EXPECT_EQ("unexpected local set - " + toString(metadataSetKey()), read(localSet(metadataSetKey(), {4})));
  EXPECT_EQ("unexpected label - 06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.01.01",
            read(bytesOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 01")));
}

TEST_F(SplitterRead, RandomIndexPackAsFirstElementIsAcceptedWithoutAPartition) {
  EXPECT_EQ("no failure", read(randomIndexPack({{0, 0}, {1, 0x1234}})));
  EXPECT_EQ((Lines{"structure startStream", "structure randomIndex 2", "structure endStream 0"}), journal.lines);
  EXPECT_EQ((std::vector<MXFRandomIndexEntry>{{0, 0}, {1, 0x1234}}), structure.entries);
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(SplitterRead, RandomIndexWithWrongOverallLengthIsAnErrorAndTheReadGoesOn) {
  ByteVector value = randomIndexValue({{0, 0}});
  value.back() ^= 1;
  ByteVector bytes = concat({partitionPack(4, 4, packWithCounts(0, 0)), element(randomIndexKey(), value)});
  EXPECT_EQ("no failure", read(bytes));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("error", errors.reports[0].severity);
  EXPECT_EQ(randomIndexValueId, errors.reports[0].identifier);
  EXPECT_EQ("invalid random index value - assertion failure: correct overall length", errors.reports[0].message);
  Lines expected{"startStream", "startPartition " + footer() + " 108", "endPartition " + footer(), "endStream 0"};
  EXPECT_EQ(expected, linesOf("structure"));
  EXPECT_EQ(1, errors.ends);
}

TEST_F(SplitterRead, RandomIndexWithoutEntriesIsAnError) {
  EXPECT_EQ("no failure", read(randomIndexPack({})));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("error", errors.reports[0].severity);
  EXPECT_EQ(randomIndexValueId, errors.reports[0].identifier);
  EXPECT_EQ("invalid random index value - assertion failure: has entries", errors.reports[0].message);
  EXPECT_EQ((Lines{"structure startStream", "structure endStream 0"}), journal.lines);
}

TEST_F(SplitterRead, RandomIndexOverallLengthFollowsTheFormOfItsOwnLength) {
  ByteVector value = randomIndexValue({{0, 0}});
  value.back() = static_cast<std::uint8_t>(16 + 9 + 16);
  EXPECT_EQ("no failure", read(element(randomIndexKey(), value, 0x88)));
  EXPECT_TRUE(errors.reports.empty());
  EXPECT_EQ(1u, structure.entries.size());
}

TEST_F(SplitterRead, ElementAfterTheRandomIndexIsUnexpected) {
  ByteVector rip = randomIndexPack({{0, 0}});
  EXPECT_EQ("unexpected individual item - " + toString(essenceElementKey()), read(concat({rip, essenceItem()})));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("fatal", errors.reports[0].severity);
  EXPECT_EQ(unexpectedElementId, errors.reports[0].identifier);
  EXPECT_EQ("unexpected individual item - " + toString(essenceElementKey()), errors.reports[0].message);
  EXPECT_EQ("structure endStream 1", journal.lines.back());
}

TEST_F(SplitterRead, PackAfterTheRandomIndexIsUnexpected) {
  ByteVector bytes = concat({randomIndexPack({{0, 0}}), partitionPack(4, 4, packWithCounts(0, 0))});
  EXPECT_EQ("unexpected fixed length pack - " + footer(), read(bytes));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ(unexpectedElementId, errors.reports[0].identifier);
  EXPECT_EQ("unexpected fixed length pack - " + toString(randomIndexKey()),
            read(concat({randomIndexPack({{0, 0}}), randomIndexPack({{0, 0}})})));
}

TEST_F(SplitterRead, OtherElementsAfterTheRandomIndexAreUnexpectedByKind) {
  ByteVector rip = randomIndexPack({{0, 0}});
  KLVKey set = keyOf("06.0E.2B.34.02.01.01.01.0D.01.01.01.01.01.2F.00");
  KLVKey pack = keyOf("06.0E.2B.34.02.04.01.01.0D.01.01.01.01.01.2F.00");
  KLVKey wrapper = keyOf("06.0E.2B.34.03.01.01.01.0D.01.01.01.01.01.2F.00");
  EXPECT_EQ("unexpected universal set - " + toString(set), read(concat({rip, element(set, {})})));
  EXPECT_EQ("unexpected variable length pack - " + toString(pack), read(concat({rip, element(pack, {})})));
  EXPECT_EQ("unexpected wrapper - " + toString(wrapper), read(concat({rip, element(wrapper, {})})));
}

TEST_F(SplitterRead, ShortPartitionValueIsAnInvalidPartitionValue) {
  ByteVector value = packValue(packWithCounts(0, 0));
  value.resize(40);
  EXPECT_EQ("invalid partition value - assertion failure: successful get()",
            read(element(partitionKey(2, 4), value)));
  ASSERT_EQ(1u, errors.reports.size());
  EXPECT_EQ("fatal", errors.reports[0].severity);
  EXPECT_EQ(partitionValueId, errors.reports[0].identifier);
  EXPECT_EQ("invalid partition value - assertion failure: successful get()", errors.reports[0].message);
  EXPECT_EQ((Lines{"structure startStream", "structure endStream 1"}), journal.lines);
}

TEST_F(SplitterRead, PartitionValueWithLeftoverOctetsIsAnInvalidPartitionValue) {
  ByteVector value = packValue(packWithCounts(0, 0));
  value.push_back(0);
  EXPECT_EQ("invalid partition value - assertion failure: valid external length",
            read(element(partitionKey(2, 4), value)));
}

TEST_F(SplitterRead, PackFieldsAndEssenceContainersReachTheStructureHandler) {
  MXFPartitionPack pack = packWithCounts(0, 0);
  pack.kagSize = 512;
  pack.bodySID = 1;
  pack.operationalPattern = keyOf("06.0E.2B.34.04.01.01.01.0D.01.02.01.01.01.09.00");
  pack.essenceContainers = {keyOf("06.0E.2B.34.04.01.01.02.0D.01.03.01.02.01.01.01")};
  EXPECT_EQ("no failure", read(partitionPack(2, 3, pack)));
  ASSERT_EQ(1u, structure.packs.size());
  EXPECT_EQ(512u, structure.packs[0].kagSize);
  EXPECT_EQ(1u, structure.packs[0].bodySID);
  EXPECT_EQ(pack.operationalPattern, structure.packs[0].operationalPattern);
  EXPECT_EQ(pack.essenceContainers, structure.packs[0].essenceContainers);
  EXPECT_EQ("structure startPartition " + header(3) + " " + std::to_string(packSize + 16), journal.lines.at(1));
}

TEST_F(SplitterRead, WholeFileGivesPartitionsInOrderThenTheRandomIndex) {
  MXFPartitionPack bodyPack = packWithCounts(0, 0);
  bodyPack.bodySID = 1;
  ByteVector bytes = concat({partitionPack(2, 2, packWithCounts(28, 0)), fillItem(smallFillSize),
                             localSet(metadataSetKey(), {4}), partitionPack(3, 2, bodyPack), essenceItem(),
                             partitionPack(4, 4, packWithCounts(0, 0)),
                             randomIndexPack({{0, 0}, {1, 156}, {0, 294}})});
  EXPECT_EQ("no failure", read(bytes));
  Lines expected{"startStream",
                 "startPartition " + header(2) + " 128",
                 "endPartition " + header(2),
                 "startPartition " + body(2) + " 108",
                 "endPartition " + body(2),
                 "startPartition " + footer() + " 108",
                 "endPartition " + footer(),
                 "randomIndex 3",
                 "endStream 0"};
  EXPECT_EQ(expected, linesOf("structure"));
  EXPECT_EQ((std::vector<MXFRandomIndexEntry>{{0, 0}, {1, 156}, {0, 294}}), structure.entries);
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(SplitterRead, SplitterReadsASecondStreamAfterTheFirst) {
  ByteVector bytes = concat({partitionPack(2, 4, packWithCounts(0, 0)), essenceItem()});
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ("no failure", read(bytes));
  EXPECT_EQ(2u, structure.packs.size());
  EXPECT_EQ("structure endStream 0", journal.lines.back());
}

TEST_F(SplitterRead, FatalReportWithoutAnErrorHandlerStillStopsTheRead) {
  MXFSplitter quiet(&structure, &metadata, &index, &essence, true);
  EXPECT_EQ("unexpected individual item - " + toString(essenceElementKey()),
            runtimeErrorTextOf([&] { readThrough(essenceItem(), quiet); }));
}
