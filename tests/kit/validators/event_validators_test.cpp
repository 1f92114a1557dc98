// The structure, index and system validators: each report raised once by
// the smallest sequence of events, the event still forwarded unchanged, and
// the assertions of their states.
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "core/failure.h"
#include "kit.h"
#include "kit/validators/container_labels.h"
#include "kit/validators/index_validator.h"
#include "kit/validators/structure_validator.h"
#include "kit/validators/system_validator.h"
#include "support/essence_recording.h"
#include "support/kit_readers.h"
#include "support/mxf_index_segments.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

typedef std::vector<std::string> Lines;

const KLVKey& d10 = d10Label;
const KLVKey& mpeg = mpegLabel;
const KLVKey& proxy = proxyLabel;
const KLVKey& op1a = op1aLabel;
const KLVKey& proxyPattern = proxyPatternLabel;

// Kind 2 header, 3 body, 4 footer; status 4 closed complete.
const KLVKey closedHeader = partitionKey(2, 4);
const KLVKey openHeader = partitionKey(2, 1);
const KLVKey body = partitionKey(3, 4);
const KLVKey footer = partitionKey(4, 4);

std::vector<std::string> findings(const RecordingErrorHandler& errors) {
  EXPECT_EQ(kitReports(errors.reports).size(), errors.reports.size());
  return kitFindings(errors.reports);
}

MXFPartitionPack packOf(const KLVKey& picture, std::uint64_t offset, std::uint32_t bodySID = 1,
                        std::uint32_t indexSID = 2) {
  MXFPartitionPack pack;
  pack.kagSize = 512;
  pack.thisPartition = offset;
  pack.bodySID = bodySID;
  pack.indexSID = indexSID;
  pack.operationalPattern = picture == proxy ? proxyPattern : op1a;
  pack.essenceContainers = {picture};
  if (picture == proxy) pack.kagSize = 0;
  return pack;
}

struct Structure {
  Structure() : validator(&next, &cross) {
    cross.setErrorHandler(&errors);
    validator.setErrorHandler(&errors);
    validator.startStream();
  }
  void partition(const KLVKey& key, const MXFPartitionPack& pack) {
    validator.startPartition(key, pack, 0);
    validator.endPartition(key);
  }
  RecordingStructureHandler next;
  RecordingErrorHandler errors;
  ZeltaCrossValidator cross;
  ZeltaStructureValidator validator;
};

TEST(StructureValidator, D10FileWithBodyPartitionButNotProxy) {
  Structure d10File;
  d10File.partition(closedHeader, packOf(d10, 0));
  d10File.partition(body, packOf(d10, 1024, 1, 0));
  EXPECT_EQ(findings(d10File.errors), Lines{"error 03 unexpected body partition"});
  Structure proxyFile;
  proxyFile.partition(closedHeader, packOf(proxy, 0));
  proxyFile.partition(body, packOf(proxy, 1000, 1, 0));
  EXPECT_EQ(findings(proxyFile.errors), Lines{});
}

TEST(StructureValidator, WellFormedMPEGFileHasNoFinding) {
  Structure f;
  f.partition(closedHeader, packOf(mpeg, 0, 0, 0));
  f.partition(body, packOf(mpeg, 1024, 1, 0));
  f.partition(footer, packOf(mpeg, 4096, 0, 2));
  f.validator.randomIndex({});
  f.validator.endStream(false);
  EXPECT_EQ(findings(f.errors), Lines{});
  // Every event went on, unchanged.
  EXPECT_EQ(f.next.events.size(), 9u);
  EXPECT_EQ(f.next.packs.size(), 3u);
  EXPECT_TRUE(f.next.packs[1] == packOf(mpeg, 1024, 1, 0));
}

TEST(StructureValidator, EndOfStreamWithoutFooterOrRandomIndex) {
  Structure f;
  f.partition(closedHeader, packOf(mpeg, 0, 1, 2));
  f.validator.endStream(false);
  EXPECT_EQ(findings(f.errors), (Lines{"error 05 missing footer partition", "error 06 missing random index"}));
  // D-10 is not asked for a random index.
  Structure d10File;
  d10File.partition(closedHeader, packOf(d10, 0));
  d10File.validator.endStream(false);
  EXPECT_EQ(findings(d10File.errors), Lines{"error 05 missing footer partition"});
}

TEST(StructureValidator, AbortedStreamReportsNeitherEndOfStreamError) {
  Structure f;
  f.partition(closedHeader, packOf(mpeg, 0, 1, 2));
  f.validator.endStream(true);
  EXPECT_EQ(findings(f.errors), Lines{});
  EXPECT_EQ(f.next.events.back(), "endStream 1");
}

TEST(StructureValidator, KAGByFormatAndAlignment) {
  Structure zeroKAG;
  MXFPartitionPack pack = packOf(mpeg, 0);
  pack.kagSize = 0;
  zeroKAG.partition(closedHeader, pack);
  EXPECT_EQ(findings(zeroKAG.errors), Lines{"error 07 unsupported KAG value"});
  Structure proxyKAG;
  pack = packOf(proxy, 0);
  pack.kagSize = 512;
  proxyKAG.partition(closedHeader, pack);
  EXPECT_EQ(findings(proxyKAG.errors), Lines{"error 07 unsupported KAG value"});
  Structure misaligned;
  misaligned.partition(closedHeader, packOf(mpeg, 0));
  misaligned.partition(body, packOf(mpeg, 1000, 1, 0));
  EXPECT_EQ(findings(misaligned.errors), Lines{"error 07 incorrect KLV alignment"});
}

TEST(StructureValidator, HeaderStatusAndByteCount) {
  Structure f;
  MXFPartitionPack pack = packOf(mpeg, 0);
  pack.headerByteCount = 0x4FFE01;
  f.partition(openHeader, pack);
  EXPECT_EQ(findings(f.errors),
            (Lines{"warning 04 open or incomplete partition status", "error 08 unsupported headerByteCount value"}));
  Structure below;
  pack.headerByteCount = 0x4FFE00;
  below.partition(closedHeader, pack);
  EXPECT_EQ(findings(below.errors), Lines{});
}

TEST(StructureValidator, BodyWithHeaderMetadataAndSecondFooter) {
  Structure f;
  f.partition(closedHeader, packOf(mpeg, 0, 0, 0));
  MXFPartitionPack withMetadata = packOf(mpeg, 1024, 1, 0);
  withMetadata.headerByteCount = 512;
  f.partition(body, withMetadata);
  f.partition(footer, packOf(mpeg, 4096, 0, 0));
  f.partition(footer, packOf(mpeg, 8192, 0, 0));
  EXPECT_EQ(findings(f.errors),
            (Lines{"warning 08 non-zero headerByteCount value", "error 03 unexpected footer partition"}));
}

TEST(StructureValidator, ClosedD10HeaderWantsNoIndexInTheFooter) {
  Structure closed;
  closed.partition(closedHeader, packOf(d10, 0, 1, 2));
  closed.partition(footer, packOf(d10, 4096, 0, 2));
  EXPECT_EQ(findings(closed.errors), Lines{"warning 0A non-zero indexSID value"});
  // With an open header the footer's index SID must be the header's.
  Structure open;
  open.partition(openHeader, packOf(d10, 0, 1, 2));
  open.partition(footer, packOf(d10, 4096, 0, 3));
  EXPECT_EQ(findings(open.errors),
            (Lines{"warning 04 open or incomplete partition status", "error 0A unexpected indexSID value"}));
}

TEST(StructureValidator, StateAssertions) {
  Structure f;
  f.validator.startPartition(closedHeader, packOf(mpeg, 0), 0);
  EXPECT_EQ(failureOf([&] { f.validator.startPartition(body, packOf(mpeg, 512), 0); }),
            "assertion failure: valid state change, entering MXF partition");
  EXPECT_EQ(failureOf([&] { f.validator.randomIndex({}); }), "assertion failure: valid state, between MXF partitions");
  f.validator.endPartition(closedHeader);
  EXPECT_EQ(failureOf([&] { f.validator.endPartition(closedHeader); }),
            "assertion failure: valid state change, leaving MXF partition");
  Structure notAPartition;
  EXPECT_EQ(failureOf([&] {
              notAPartition.validator.startPartition(keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 "
                                                           "05 04 00"),
                                                     packOf(mpeg, 0), 0);
            }),
            "assertion failure: valid partition key");
}

TEST(IndexValidator, SegmentsStreamIdentifiersAndRateGoToTheCrossValidator) {
  RecordingIndexHandler next;
  RecordingErrorHandler errors;
  ZeltaCrossValidator cross;
  cross.setErrorHandler(&errors);
  cross.setEssenceContainers({mpeg});
  ZeltaIndexValidator validator(&next, &cross);
  validator.startIndex();
  MXFIndexTableSegment segment = sampleSegment();
  segment.bodySID = 1;
  segment.indexSID = 2;
  segment.indexEditRate = {25, 1};
  validator.indexTableSegment(segment);
  segment.bodySID = 3;
  segment.indexEditRate = {50, 1};
  validator.indexTableSegment(segment);
  validator.endIndex();
  EXPECT_EQ(findings(errors), (Lines{"error 09 unexpected bodySID value", "error 0C unexpected indexEditRate value"}));
  EXPECT_EQ(next.events, (Lines{"startIndex", "segment", "segment", "endIndex"}));
  EXPECT_TRUE(next.segments[1] == segment);
}

struct System {
  System() : validator(&next, &cross) {
    cross.setErrorHandler(&errors);
    validator.setErrorHandler(&errors);
    validator.setStructureHandler(&gc);
    cross.setEssenceContainers({mpeg});
    cross.setEditRate({25, 1});
    cross.setStartTimecode(0, 0, 100, false);
  }
  void editUnit(const MXFSDTICPSystemMetadata& pack) {
    validator.startEditUnit();
    validator.systemMetadata(pack);
    validator.endEditUnit();
  }
  RecordingSDTICPHandler next;
  RecordingGCHandler gc;
  RecordingErrorHandler errors;
  ZeltaCrossValidator cross;
  ZeltaSystemValidator validator;
};

MXFSDTICPSystemMetadata packWithStamp(std::uint8_t frames) {
  MXFSDTICPSystemMetadata pack;
  pack.bitmap = 0x5C;
  pack.userStamp[0] = 0x81;
  pack.userStamp[1] = frames;
  return pack;
}

TEST(SystemValidator, UserStampsOfEachEditUnitAgainstTheStartTimecode) {
  System f;
  f.validator.start(512);
  f.editUnit(packWithStamp(0x00));
  f.editUnit(packWithStamp(0x01));
  f.editUnit(packWithStamp(0x09));
  f.editUnit(packWithStamp(0x07));
  f.validator.end();
  EXPECT_EQ(findings(f.errors), Lines{"warning 0E inconsistent user stamp and startTimecode"});
  EXPECT_EQ(f.next.events.size(), 4u);
  EXPECT_EQ(f.gc.events, (Lines{"start 512", "startEditUnit", "endEditUnit", "startEditUnit", "endEditUnit",
                                "startEditUnit", "endEditUnit", "startEditUnit", "endEditUnit", "end"}));
}

TEST(SystemValidator, UserStampNotPresentIsReportedOnce) {
  System f;
  MXFSDTICPSystemMetadata pack;
  pack.bitmap = 0x4C;
  f.editUnit(pack);
  f.editUnit(pack);
  EXPECT_EQ(findings(f.errors), Lines{"warning 0E user stamp not present"});
  EXPECT_EQ(f.next.events.size(), 2u);
}

TEST(SystemValidator, ForwardsToNoHandlerWhenNoneIsSet) {
  RecordingErrorHandler errors;
  ZeltaCrossValidator cross;
  ZeltaSystemValidator validator(nullptr, &cross);
  validator.setErrorHandler(&errors);
  validator.start(0);
  validator.startEditUnit();
  validator.systemMetadata(packWithStamp(0));
  validator.packageMetadata({});
  validator.controlData(1, {});
  validator.endEditUnit();
  validator.end();
  EXPECT_EQ(findings(errors), Lines{});
}

}  // namespace
