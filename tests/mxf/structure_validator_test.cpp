// The structure validator driven by hand: order of partitions, run-in,
// version, offsets, KAG, fields and the way to the end of a file.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "mxf.h"
#include "support/klv_output.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;
using zelta_test::klv::SettableLocator;

namespace {

constexpr std::uint64_t packLength = 512;  // every pack here takes 512 octets with its fill

const KLVKey headerKey = partitionKey(2, 4);
const KLVKey bodyKey = partitionKey(3, 4);
const KLVKey footerKey = partitionKey(4, 4);

MXFPartitionPack packAt(std::uint64_t thisPartition, std::uint64_t previousPartition,
                        std::uint64_t footerPartition = 0) {
  MXFPartitionPack pack;
  pack.thisPartition = thisPartition;
  pack.previousPartition = previousPartition;
  pack.footerPartition = footerPartition;
  return pack;
}

std::string warning(const MXFUID& identifier, const std::string& message) {
  return reportLine("warning", identifier, message);
}

std::string error(const MXFUID& identifier, const std::string& message) {
  return reportLine("error", identifier, message);
}

class Validator : public ::testing::Test {
protected:
  Validator() : validator(&next) { validator.setErrorHandler(&errors); }

  // Starts a stream with the locator at the run-in's end.
  void start(std::uint32_t runIn = 0) {
    this->runIn = runIn;
    if (runIn != 0) validator.setRunIn(runIn);
    locator.setPosition(runIn);
    validator.setLocator(&locator);
    validator.startStream();
  }

  // A whole partition whose pack begins at `offset` behind the run-in.
  void partition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t offset) {
    locator.setPosition(static_cast<std::streamoff>(runIn + offset + packLength));
    validator.startPartition(key, pack, packLength);
    validator.endPartition(key);
  }

  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) { validator.randomIndex(entries); }

  std::vector<std::string> reports() const { return reportLines(errors); }

  RecordingStructureHandler next;
  RecordingErrorHandler errors;
  SettableLocator locator;
  MXFStructureValidator validator;
  std::uint32_t runIn = 0;
};

}  // namespace

TEST(StructureIdentifiers, NewIdentifiersHaveTheirOctets) {
  EXPECT_EQ(ZeltaErrorId(0x4C, 0x4C, 0x01, 0x03), partitionOrderId);
  EXPECT_EQ(ZeltaErrorId(0x4C, 0x4C, 0x01, 0x04), thisPartitionId);
  EXPECT_EQ(ZeltaErrorId(0x4C, 0x4C, 0x01, 0x05), previousPartitionId);
  EXPECT_EQ(ZeltaErrorId(0x4C, 0x4C, 0x01, 0x06), footerPartitionId);
  EXPECT_EQ(ZeltaErrorId(0x4C, 0x4C, 0x01, 0x07), indexSIDId);
  EXPECT_EQ(ZeltaErrorId(0x4C, 0x4C, 0x01, 0x08), bodySIDId);
}

// ---------------------------------------------------------------------------
// The way to the end of the file

TEST_F(Validator, HeaderWithoutFooterOffsetAndFileWithRandomIndexPass) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  partition(footerKey, packAt(512, 0, 512), 512);
  randomIndex({{0, 0}, {0, 512}});
  validator.endStream(false);
  EXPECT_EQ(std::vector<std::string>{}, reports());
}

TEST_F(Validator, HeaderNamingTheFooterWithoutRandomIndexPasses) {
  start();
  partition(headerKey, packAt(0, 0, 512), 0);
  partition(footerKey, packAt(512, 0, 512), 512);
  validator.endStream(false);
  EXPECT_EQ(std::vector<std::string>{}, reports());
}

TEST_F(Validator, NeitherRandomIndexNorFooterOffsetGivesOneReportAtTheEnd) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  partition(footerKey, packAt(512, 0, 512), 512);
  EXPECT_EQ(std::vector<std::string>{}, reports());
  validator.endStream(false);
  EXPECT_EQ(std::vector<std::string>{error(
                randomIndexMissingId, "missing random index or non-zero footerPartition in the header partition pack")},
            reports());
}

TEST_F(Validator, NeitherRandomIndexNorFooterOffsetInAnAbortedReadGivesNoReport) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  validator.endStream(true);
  EXPECT_EQ(std::vector<std::string>{}, reports());
  EXPECT_EQ("endStream 1", next.events.back());
}

// A footer offset in a body pack does not count: a reader looks in the
// header pack only.
TEST_F(Validator, FooterOffsetInABodyPackOnlyDoesNotShowTheWayToTheEnd) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  partition(bodyKey, packAt(512, 0, 1024), 512);
  validator.endStream(false);
  EXPECT_EQ(std::vector<std::string>{error(
                randomIndexMissingId, "missing random index or non-zero footerPartition in the header partition pack")},
            reports());
}

// ---------------------------------------------------------------------------
// Order of partitions and random index

TEST_F(Validator, RandomIndexDirectlyAfterStartIsReportedAndTheStateMovesOn) {
  validator.setLocator(nullptr);
  validator.startStream();
  randomIndex({{0, 0}});
  EXPECT_EQ(std::vector<std::string>{error(randomIndexMissingId, "unexpected random index")}, reports());
  // After a random index any partition is out of place.
  validator.startPartition(headerKey, packAt(0, 0), packLength);
  EXPECT_EQ(error(randomIndexMissingId, "unexpected partition"), reports().back());
  validator.endStream(false);
  EXPECT_EQ(2u, reports().size());
}

TEST_F(Validator, SecondRandomIndexIsUnexpected) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  randomIndex({{0, 0}});
  EXPECT_EQ(std::vector<std::string>{}, reports());
  randomIndex({{0, 0}});
  EXPECT_EQ(std::vector<std::string>{error(randomIndexMissingId, "unexpected random index")}, reports());
}

TEST_F(Validator, PartitionAfterRandomIndexIsUnexpectedUnderTheRandomIndexIdentifier) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  randomIndex({{0, 0}});
  partition(bodyKey, packAt(512, 0), 512);
  EXPECT_EQ(std::vector<std::string>{error(randomIndexMissingId, "unexpected partition")}, reports());
}

TEST_F(Validator, PartitionAfterTheFooterIsUnexpectedUnderThePartitionOrderIdentifier) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  partition(footerKey, packAt(512, 0, 512), 512);
  partition(bodyKey, packAt(1024, 512), 1024);
  EXPECT_EQ(std::vector<std::string>{error(partitionOrderId, "unexpected partition")}, reports());
}

TEST_F(Validator, FirstPartitionThatIsNoHeaderIsReported) {
  start();
  partition(bodyKey, packAt(0, 0), 0);
  EXPECT_EQ(std::vector<std::string>{error(partitionOrderId, "missing header partition")}, reports());
}

TEST_F(Validator, SecondHeaderPartitionIsReported) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  partition(headerKey, packAt(512, 0), 512);
  EXPECT_EQ(std::vector<std::string>{error(partitionOrderId, "unexpected header partition")}, reports());
}

TEST_F(Validator, PartitionInsideAPartitionOrBeforeTheStreamFails) {
  EXPECT_EQ("assertion failure: before partition",
            assertionTextOf([&] { validator.startPartition(headerKey, packAt(0, 0), packLength); }));
  start();
  validator.startPartition(headerKey, packAt(0, 0), packLength);
  EXPECT_EQ("assertion failure: before partition",
            assertionTextOf([&] { validator.startPartition(bodyKey, packAt(0, 0), packLength); }));
}

TEST_F(Validator, KeyThatIsNoPartitionKeyFails) {
  start();
  EXPECT_EQ("assertion failure: is partition",
            assertionTextOf([&] { validator.startPartition(randomIndexKey(), packAt(0, 0), packLength); }));
  EXPECT_EQ("assertion failure: is partition",
            assertionTextOf([&] { validator.startPartition(partitionKey(3, 5), packAt(0, 0), packLength); }));
}

TEST_F(Validator, EndPartitionMustMatchThePartitionItEnds) {
  start();
  validator.startPartition(headerKey, packAt(0, 0), packLength);
  EXPECT_EQ("assertion failure: is header or body partition",
            assertionTextOf([&] { validator.endPartition(footerKey); }));
  validator.endPartition(headerKey);
  EXPECT_EQ("assertion failure: in partition", assertionTextOf([&] { validator.endPartition(headerKey); }));
  locator.setPosition(512 + packLength);
  validator.startPartition(footerKey, packAt(512, 0, 512), packLength);
  EXPECT_EQ("assertion failure: is footer partition", assertionTextOf([&] { validator.endPartition(bodyKey); }));
}

TEST_F(Validator, RandomIndexInsideAPartitionFails) {
  start();
  validator.startPartition(headerKey, packAt(0, 0), packLength);
  EXPECT_EQ("assertion failure: before random index", assertionTextOf([&] { randomIndex({{0, 0}}); }));
}

TEST_F(Validator, RunInAndStartMayComeOnceBeforeTheStream) {
  validator.setRunIn(10);
  EXPECT_EQ("assertion failure: before run-in", assertionTextOf([&] { validator.setRunIn(10); }));
  validator.startStream();
  EXPECT_EQ("assertion failure: before start", assertionTextOf([&] { validator.startStream(); }));
  EXPECT_EQ("assertion failure: before run-in", assertionTextOf([&] { validator.setRunIn(10); }));
}

TEST_F(Validator, StreamMustStartWhereTheRunInEnds) {
  validator.setRunIn(100);
  locator.setPosition(99);
  validator.setLocator(&locator);
  EXPECT_EQ("assertion failure: correct runIn", assertionTextOf([&] { validator.startStream(); }));
}

// ---------------------------------------------------------------------------
// Run-in and operational pattern

TEST_F(Validator, GeneralizedPatternWithRunInIsReportedForEachPartition) {
  MXFPartitionPack header = packAt(0, 0, 512);
  header.operationalPattern = keyOf("06.0E.2B.34.04.01.01.01.0D.01.02.01.03.03.09.00");  // OP3c
  MXFPartitionPack footer = packAt(512, 0, 512);
  footer.operationalPattern = keyOf("06.0E.2B.34.04.01.01.05.0D.01.02.01.01.01.01.00");  // OP1a, version 5
  start(1000);
  partition(headerKey, header, 0);
  partition(footerKey, footer, 512);
  validator.endStream(false);
  const std::string report = error(runInErrorId, "generalized operational pattern with run-in");
  EXPECT_EQ((std::vector<std::string>{report, report}), reports());
  EXPECT_EQ("setRunIn 1000", next.events.front());
}

TEST_F(Validator, SpecializedPatternOrNoRunInPasses) {
  MXFPartitionPack atom = packAt(0, 0, 512);
  atom.operationalPattern = keyOf("06.0E.2B.34.04.01.01.02.0D.01.02.01.10.03.00.00");  // OP-Atom
  start(1000);
  partition(headerKey, atom, 0);
  validator.endStream(false);
  MXFPartitionPack outOfRange = packAt(0, 0, 512);
  outOfRange.operationalPattern = keyOf("06.0E.2B.34.04.01.01.01.0D.01.02.01.04.01.01.00");
  start(1000);
  partition(headerKey, outOfRange, 0);
  validator.endStream(false);
  MXFPartitionPack op1a = packAt(0, 0, 512);
  op1a.operationalPattern = keyOf("06.0E.2B.34.04.01.01.01.0D.01.02.01.01.01.09.00");
  start();
  partition(headerKey, op1a, 0);
  validator.endStream(false);
  EXPECT_EQ(std::vector<std::string>{}, reports());
}

// ---------------------------------------------------------------------------
// Version

struct VersionCase {
  std::uint16_t major;
  std::uint16_t minor;
  std::string report;  // empty for none
};

class ValidatorVersion : public ::testing::TestWithParam<VersionCase> {};

TEST_P(ValidatorVersion, VersionIsJudgedAgainstTheImplementedRange) {
  RecordingStructureHandler next;
  RecordingErrorHandler errors;
  MXFStructureValidator validator(&next);
  validator.setErrorHandler(&errors);
  validator.startStream();
  MXFPartitionPack pack;
  pack.majorVersion = GetParam().major;
  pack.minorVersion = GetParam().minor;
  validator.startPartition(headerKey, pack, packLength);
  std::vector<std::string> expected;
  if (!GetParam().report.empty()) expected.push_back(GetParam().report);
  EXPECT_EQ(expected, reportLines(errors));
}

INSTANTIATE_TEST_SUITE_P(
    Versions, ValidatorVersion,
    ::testing::Values(VersionCase{1, 2, ""}, VersionCase{1, 3, ""},
                      VersionCase{1, 0, error(partitionVersionRangeId, "earlier version - 1.0 (implemented 1.2-1.3)")},
                      VersionCase{1, 1, error(partitionVersionRangeId, "earlier version - 1.1 (implemented 1.2-1.3)")},
                      VersionCase{1, 4, warning(partitionVersionRangeId, "later version - 1.4 (implemented 1.2-1.3)")},
                      VersionCase{1, 255,
                                  warning(partitionVersionRangeId, "later version - 1.255 (implemented 1.2-1.3)")},
                      VersionCase{2, 3,
                                  error(partitionVersionErrorId, "incompatible version - 2.3 (implemented 1.2-1.3)")},
                      VersionCase{0, 2,
                                  error(partitionVersionErrorId, "incompatible version - 0.2 (implemented 1.2-1.3)")},
                      VersionCase{1, 256,
                                  error(partitionVersionErrorId, "invalid version - 1.256 (implemented 1.2-1.3)")},
                      VersionCase{256, 1,
                                  error(partitionVersionErrorId, "invalid version - 256.1 (implemented 1.2-1.3)")}));

// ---------------------------------------------------------------------------
// Offsets

TEST_F(Validator, ThisPartitionThatIsNotWhereThePackIsIsWarned) {
  start();
  partition(headerKey, packAt(0, 0, 1024), 0);
  partition(bodyKey, packAt(500, 0, 1024), 512);
  EXPECT_EQ(std::vector<std::string>{warning(thisPartitionId, "incorrect thisPartition")}, reports());
}

TEST_F(Validator, PreviousPartitionThatPointsElsewhereIsWarned) {
  start();
  partition(headerKey, packAt(0, 0, 1536), 0);
  partition(bodyKey, packAt(512, 0, 1536), 512);
  partition(bodyKey, packAt(1024, 0, 1536), 1024);
  EXPECT_EQ(std::vector<std::string>{warning(previousPartitionId, "incorrect previousPartition")}, reports());
}

TEST_F(Validator, FooterThatNamesAnotherFooterIsWarned) {
  start();
  partition(headerKey, packAt(0, 0), 0);
  partition(footerKey, packAt(512, 0, 0), 512);
  EXPECT_EQ(std::vector<std::string>{warning(footerPartitionId, "incorrect footerPartition")}, reports());
}

TEST_F(Validator, FooterElsewhereThanEarlierPacksSaidIsWarned) {
  start();
  partition(headerKey, packAt(0, 0, 2048), 0);
  partition(footerKey, packAt(512, 0, 512), 512);
  EXPECT_EQ(std::vector<std::string>{warning(footerPartitionId, "incorrect previous footerPartition")}, reports());
}

TEST_F(Validator, FooterOffsetsThatDisagreeAreWarned) {
  start();
  partition(headerKey, packAt(0, 0, 2048), 0);
  partition(bodyKey, packAt(512, 0, 1536), 512);
  partition(bodyKey, packAt(1024, 512, 0), 1024);
  EXPECT_EQ(std::vector<std::string>{warning(footerPartitionId, "inconsistent footerPartition")}, reports());
}

TEST_F(Validator, OffsetsCountFromTheEndOfTheRunIn) {
  MXFPartitionPack header = packAt(0, 0, 512);
  header.operationalPattern = keyOf("06.0E.2B.34.04.01.01.02.0D.01.02.01.10.03.00.00");
  MXFPartitionPack footer = packAt(512, 0, 512);
  footer.operationalPattern = header.operationalPattern;
  start(300);
  partition(headerKey, header, 0);
  partition(footerKey, footer, 512);
  randomIndex({{0, 0}, {0, 512}});
  validator.endStream(false);
  EXPECT_EQ(std::vector<std::string>{}, reports());
}

TEST_F(Validator, WithoutALocatorOffsetsAreNotChecked) {
  validator.startStream();
  validator.startPartition(headerKey, packAt(7, 5, 3), packLength);
  validator.endPartition(headerKey);
  validator.startPartition(footerKey, packAt(9, 9, 1), packLength);
  validator.endPartition(footerKey);
  randomIndex({{4, 4}});
  validator.endStream(false);
  EXPECT_EQ(std::vector<std::string>{}, reports());
}

TEST_F(Validator, RandomIndexThatDiffersFromThePartitionsIsWarnedOnce) {
  const std::vector<std::vector<MXFRandomIndexEntry>> wrong{
      {{0, 0}},                    // too few
      {{0, 0}, {0, 512}, {0, 0}},  // too many
      {{1, 0}, {0, 512}},          // another bodySID
      {{0, 0}, {0, 513}},          // another offset
  };
  for (const auto& entries : wrong) {
    errors.reports.clear();
    start();
    partition(headerKey, packAt(0, 0), 0);
    partition(footerKey, packAt(512, 0, 512), 512);
    randomIndex(entries);
    validator.endStream(false);
    EXPECT_EQ(std::vector<std::string>{warning(randomIndexValueId, "incorrect random index value")}, reports());
  }
}

// ---------------------------------------------------------------------------
// KAG and fields

TEST_F(Validator, ByteCountsThatAreNoMultipleOfTheKAGAreWarned) {
  MXFPartitionPack pack = packAt(0, 0, 512);
  pack.kagSize = 512;
  pack.headerByteCount = 1000;
  pack.indexByteCount = 7;
  pack.indexSID = 2;
  start();
  partition(headerKey, pack, 0);
  EXPECT_EQ((std::vector<std::string>{warning(headerByteCountKagId, "headerByteCount is not a multiple of kagSize"),
                                      warning(indexByteCountKagId, "indexByteCount is not a multiple of kagSize")}),
            reports());
}

TEST_F(Validator, KAGOfZeroTurnsOffTheMultipleChecks) {
  MXFPartitionPack pack = packAt(0, 0, 512);
  pack.kagSize = 0;
  pack.headerByteCount = 1000;
  pack.indexByteCount = 7;
  pack.indexSID = 2;
  start();
  partition(headerKey, pack, 0);
  EXPECT_EQ(std::vector<std::string>{}, reports());
}

TEST_F(Validator, IndexSIDAndIndexByteCountMustBeZeroTogether) {
  MXFPartitionPack sidOnly = packAt(0, 0, 1024);
  sidOnly.indexSID = 2;
  MXFPartitionPack countOnly = packAt(512, 0, 1024);
  countOnly.indexByteCount = 512;
  start();
  partition(headerKey, sidOnly, 0);
  partition(bodyKey, countOnly, 512);
  const std::string report = warning(indexSIDId, "inconsistent indexSID and indexByteCount");
  EXPECT_EQ((std::vector<std::string>{report, report}), reports());
}

TEST_F(Validator, BodyOffsetWithoutBodySIDAndBodySIDInTheFooterAreWarned) {
  MXFPartitionPack header = packAt(0, 0, 1024);
  header.bodyOffset = 10;
  MXFPartitionPack body = packAt(512, 0, 1024);
  body.bodySID = 1;
  body.bodyOffset = 10;
  MXFPartitionPack footer = packAt(1024, 512, 1024);
  footer.bodySID = 1;
  start();
  partition(headerKey, header, 0);
  partition(bodyKey, body, 512);
  partition(footerKey, footer, 1024);
  EXPECT_EQ((std::vector<std::string>{warning(bodySIDId, "inconsistent bodySID and bodyOffset"),
                                      warning(bodySIDId, "non-zero bodySID in footer")}),
            reports());
}

// ---------------------------------------------------------------------------
// Events and reporting

TEST_F(Validator, EveryEventIsPassedOn) {
  start(1000);
  MXFPartitionPack header = packAt(0, 0, 512);
  header.operationalPattern = keyOf("06.0E.2B.34.04.01.01.02.0D.01.02.01.10.03.00.00");
  partition(headerKey, header, 0);
  randomIndex({{0, 0}});
  validator.endStream(false);
  EXPECT_EQ((std::vector<std::string>{"setRunIn 1000", "startStream",
                                      "startPartition " + toString(headerKey) + " 512",
                                      "endPartition " + toString(headerKey), "randomIndex 1", "endStream 0"}),
            next.events);
  ASSERT_EQ(1u, next.packs.size());
  EXPECT_EQ(header, next.packs[0]);
}

TEST_F(Validator, WithoutAnErrorHandlerNothingIsReportedAndTheWorkGoesOn) {
  RecordingStructureHandler quietNext;
  MXFStructureValidator quiet(&quietNext);
  quiet.startStream();
  quiet.startPartition(bodyKey, packAt(0, 0), packLength);
  quiet.endPartition(bodyKey);
  quiet.randomIndex({{0, 0}});
  quiet.randomIndex({{0, 0}});
  quiet.endStream(false);
  EXPECT_EQ(6u, quietNext.events.size());
}

// ---------------------------------------------------------------------------
// The splitter's switch

TEST(SplitterValidation, ValidatingSplitterReportsWithItsOwnPositions) {
  // A header at 0 that says it is at 5, and no way to the end of the file.
  MXFPartitionPack pack = packWithCounts(0, 0);
  pack.thisPartition = 5;
  const ByteVector bytes = concat({partitionPack(2, 4, pack), essenceElement(10)});
  RecordingStructureHandler structure;
  DullKLVHandler delegate;
  RecordingErrorHandler errors;
  MXFSplitter splitter(&structure, &delegate, &delegate, &delegate, true);
  splitter.setErrorHandler(&errors);
  readThrough(bytes, splitter, &errors);
  EXPECT_EQ((std::vector<std::string>{warning(thisPartitionId, "incorrect thisPartition"),
                                      error(randomIndexMissingId,
                                            "missing random index or non-zero footerPartition in the header "
                                            "partition pack")}),
            reportLines(errors));
  EXPECT_EQ(5u, structure.packs.at(0).thisPartition);
}

TEST(SplitterValidation, SplitterWithoutValidationReportsNothing) {
  MXFPartitionPack pack = packWithCounts(0, 0);
  pack.thisPartition = 5;
  const ByteVector bytes = concat({partitionPack(2, 4, pack), essenceElement(10)});
  RecordingStructureHandler structure;
  DullKLVHandler delegate;
  RecordingErrorHandler errors;
  MXFSplitter splitter(&structure, &delegate, &delegate, &delegate, false);
  splitter.setErrorHandler(&errors);
  readThrough(bytes, splitter, &errors);
  EXPECT_EQ(std::vector<std::string>{}, reportLines(errors));
  EXPECT_EQ(4u, structure.events.size());
}
