// Index table segments read from spelled octets.
#include <gtest/gtest.h>

#include "mxf.h"
#include "support/mxf_index_segments.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"

using namespace zelta_test;

namespace {

SpelledItems withItems(SpelledItems items, const SpelledItems& more) {
  items.insert(items.end(), more.begin(), more.end());
  return items;
}

// Count 0, entry length 0.
const char* const emptyBatch = "00 00 00 00 00 00 00 00";

}  // namespace

TEST(MXFIndexParser, ConstantSizeTableReadsWithoutReports) {
  IndexRun run;
  parseIndex(segmentBytes(withItems(requiredItems(0, 6), {{0x3F05, bytesOf("00 02 50 BC")},
                                                          {0x3F0A, bytesOf(emptyBatch)}})),
             run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  const MXFIndexTableSegment& segment = run.index.segments[0];
  EXPECT_EQ(segment.editUnitByteCount, 0x250BCu);
  EXPECT_EQ(segment.indexStartPosition, 0);
  EXPECT_EQ(segment.indexDuration, 6);
  EXPECT_TRUE(segment.indexEntryArray.empty());
  EXPECT_EQ(segment.indexEditRate, (MXFRational{25, 1}));
  EXPECT_EQ(segment.bodySID, 2u);
  EXPECT_TRUE(run.errors.reports.empty());
}

TEST(MXFIndexParser, OpenEndedConstantSizeTableIsClean) {
  IndexRun run;
  parseIndex(segmentBytes(withItems(requiredItems(0, 0), {{0x3F05, bytesOf("00 00 02 00")}})), run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  EXPECT_EQ(run.index.segments[0].indexDuration, 0);
  EXPECT_TRUE(run.errors.reports.empty());
}

TEST(MXFIndexParser, NoPosTableCountReadsAsZeroAndEntriesHaveNoPosTable) {
  // One entry: temporal offset, key frame offset, flags, stream offset, one
  // slice offset (sliceCount 1).
  IndexRun run;
  parseIndex(segmentBytes(withItems(requiredItems(0, 1),
                                    {{0x3F08, bytesOf("01")},
                                     {0x3F0A, bytesOf("00 00 00 01 00 00 00 0F FF 00 C0 "
                                                      "00 00 00 00 00 00 12 34 00 00 00 40")}})),
             run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  const MXFIndexTableSegment& segment = run.index.segments[0];
  EXPECT_EQ(segment.posTableCount, 0u);
  ASSERT_EQ(segment.indexEntryArray.size(), 1u);
  const MXFIndexEntry& entry = segment.indexEntryArray[0];
  EXPECT_EQ(entry.temporalOffset, -1);
  EXPECT_EQ(entry.keyFrameOffset, 0);
  EXPECT_EQ(entry.flags, 0xC0u);
  EXPECT_EQ(entry.streamOffset, 0x1234u);
  EXPECT_EQ(entry.sliceOffsets, (std::vector<std::uint32_t>{0x40}));
  EXPECT_TRUE(entry.posTable.empty());
  EXPECT_TRUE(run.errors.reports.empty());
}

TEST(MXFIndexParser, EntryLongerThanKnownFieldsParsesWithExcessSkipped) {
  // Entry length 14: eleven known octets and three more.
  IndexRun run;
  parseIndex(segmentBytes(withItems(requiredItems(0, 2),
                                    {{0x3F0A, bytesOf("00 00 00 02 00 00 00 0E "
                                                      "00 00 80 00 00 00 00 00 00 00 00 EE EE EE "
                                                      "01 FF 00 00 00 00 00 00 00 01 00 EE EE EE")}})),
             run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  const std::vector<MXFIndexEntry>& entries = run.index.segments[0].indexEntryArray;
  ASSERT_EQ(entries.size(), 2u);
  EXPECT_EQ(entries[0].flags, 0x80u);
  EXPECT_EQ(entries[1].temporalOffset, 1);
  EXPECT_EQ(entries[1].keyFrameOffset, -1);
  EXPECT_EQ(entries[1].streamOffset, 0x100u);
}

TEST(MXFIndexParser, EntryShorterThanKnownFieldsIsReportedAsInvalidValue) {
  IndexRun run;
  parseIndex(segmentBytes(withItems(requiredItems(0, 1),
                                    {{0x3F0A, bytesOf("00 00 00 01 00 00 00 0A "
                                                      "00 00 80 00 00 00 00 00 00 00 00")}})),
             run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  EXPECT_EQ(run.errors.reports.size(), 2u);
  EXPECT_EQ(reportLines(run.errors)[0],
            reportLine("error", invalidIndexPropertyId,
                       "invalid indexEntryArray value - assertion failure: valid external length"));
}

TEST(MXFIndexParser, PosTableEntriesAreReadByPosTableCount) {
  IndexRun run;
  parseIndex(segmentBytes(withItems(requiredItems(0, 1),
                                    {{0x3F0E, bytesOf("01")},
                                     {0x3F0A, bytesOf("00 00 00 01 00 00 00 13 "
                                                      "00 00 80 00 00 00 00 00 00 00 00 00 00 00 01 00 00 00 03")}})),
             run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  ASSERT_EQ(run.index.segments[0].indexEntryArray.size(), 1u);
  EXPECT_EQ(run.index.segments[0].indexEntryArray[0].posTable, (std::vector<MXFRational>{{1, 3}}));
}

TEST(MXFIndexParser, MissingRequiredPropertiesAreReported) {
  IndexRun run;
  parseIndex(segmentBytes({{0x3F05, bytesOf("00 00 02 00")}}), run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  EXPECT_EQ(reportLines(run.errors),
            (std::vector<std::string>{reportLine("error", missingIndexPropertyId, "missing instanceUID"),
                                      reportLine("error", missingIndexPropertyId, "missing indexEditRate"),
                                      reportLine("error", missingIndexPropertyId, "missing indexStartPosition"),
                                      reportLine("error", missingIndexPropertyId, "missing indexDuration"),
                                      reportLine("error", missingIndexPropertyId, "missing bodySID")}));
}

TEST(MXFIndexParser, InvalidValueIsReportedAndParsingGoesOn) {
  IndexRun run;
  parseIndex(segmentBytes(withItems(requiredItems(0, 0),
                                    {{0x3F05, bytesOf("00 00 02 00 00")}, {0x3F06, bytesOf("00 00 00 07")}})),
             run);
  ASSERT_EQ(run.index.segments.size(), 1u);
  EXPECT_EQ(run.index.segments[0].indexSID, 7u);
  EXPECT_EQ(run.index.segments[0].editUnitByteCount, 0x200u);
  EXPECT_EQ(reportLines(run.errors),
            (std::vector<std::string>{reportLine(
                "error", invalidIndexPropertyId,
                "invalid editUnitByteCount value - assertion failure: valid external length")}));
}

TEST(MXFIndexParser, InconsistentFieldsAreWarnedWithAnErrorHandlerOnly) {
  // Duration 2, one entry, start 5 with a constant size.
  const ByteVector bytes = segmentBytes(
      withItems(requiredItems(5, 2), {{0x3F05, bytesOf("00 00 02 00")},
                                      {0x3F0A, bytesOf("00 00 00 01 00 00 00 0B 00 00 80 00 00 00 00 00 00 00 00")}}));
  IndexRun run;
  parseIndex(bytes, run);
  EXPECT_EQ(reportLines(run.errors),
            (std::vector<std::string>{
                reportLine("warning", inconsistentIndexSegmentId, "inconsistent indexDuration and indexEntryArray"),
                reportLine("warning", inconsistentIndexSegmentId,
                           "inconsistent editUnitByteCount and indexStartPosition"),
                reportLine("warning", inconsistentIndexSegmentId,
                           "inconsistent editUnitByteCount and indexEntryArray")}));
  IndexRun silent;
  parseIndex(bytes, silent, false);
  EXPECT_EQ(silent.index.segments.size(), 1u);
}

TEST(MXFIndexParser, ZeroDurationAndZeroEditUnitByteCountAreWarned) {
  IndexRun run;
  parseIndex(segmentBytes(requiredItems(0, 0)), run);
  EXPECT_EQ(reportLines(run.errors),
            (std::vector<std::string>{
                reportLine("warning", inconsistentIndexSegmentId, "inconsistent indexDuration and editUnitByteCount"),
                reportLine("warning", inconsistentIndexSegmentId,
                           "inconsistent editUnitByteCount and indexEntryArray")}));
}

TEST(MXFIndexParser, SegmentTagsDoNotNeedAPrimerAndOtherSetsAreSkipped) {
  IndexRun run;
  const ByteVector other = twoOctetSet(keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.30.00"),
                                       {{0x3C0A, bytesOf("22 22 22 22 22 22 22 22 22 22 22 22 22 22 22 22")}});
  parseIndex(concat({other, segmentBytes(withItems(requiredItems(0, 0), {{0x3F05, bytesOf("00 00 00 10")}}))}), run);
  EXPECT_EQ(run.index.events, (std::vector<std::string>{"startIndex", "segment", "endIndex"}));
  EXPECT_TRUE(run.errors.reports.empty());
}

TEST(MXFIndexParser, SecondStartWithoutEndFailsBeforeStart) {
  RecordingIndexHandler handler;
  MXFIndexParser parser(&handler);
  parser.startStream(true);
  EXPECT_EQ(assertionTextOf([&] { parser.startStream(true); }), "assertion failure: before start");
}
