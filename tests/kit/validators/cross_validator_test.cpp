// The cross validator: each rule broken once by the smallest sequence of
// calls, with the report's severity, identifier and text.
#include "kit/validators/cross_validator.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "core/failure.h"
#include "kit.h"
#include "kit/validators/container_labels.h"
#include "support/kit_readers.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey& d10 = d10Label;
const KLVKey& mpeg = mpegLabel;
const KLVKey& proxy = proxyLabel;
const KLVKey& aes3 = aes3Label;
const KLVKey& wave = waveLabel;
const KLVKey& proxySound = proxySoundLabel;
const KLVKey& anc = ancLabel;
const KLVKey& multiple = multipleLabel;
const KLVKey& op1a = op1aLabel;
const KLVKey& proxyPattern = proxyPatternLabel;
const KLVKey& opAtom = opAtomLabel;

struct Fixture {
  Fixture() { cross.setErrorHandler(&errors); }
  // Every report, each a finding of the kit's.
  std::vector<std::string> findings() const {
    EXPECT_EQ(kitReports(errors.reports).size(), errors.reports.size());
    return kitFindings(errors.reports);
  }
  RecordingErrorHandler errors;
  ZeltaCrossValidator cross;
};

typedef std::vector<std::string> Lines;

TEST(CrossValidator, OneLabelWithoutMultipleEssencePasses) {
  Fixture f;
  f.cross.setEssenceContainers({mpeg});
  EXPECT_EQ(f.findings(), Lines{});
  EXPECT_EQ(*f.cross.getEssenceContainer(), mpeg);
}

TEST(CrossValidator, ProxyWithTwoLabelsAndNoMultipleEssencePassesAndMPEGGetsTheWarning) {
  Fixture proxyFile;
  proxyFile.cross.setEssenceContainers({proxy, proxySound});
  EXPECT_EQ(proxyFile.findings(), Lines{});
  EXPECT_EQ(*proxyFile.cross.getAuxiliaryContainer(), proxySound);
  Fixture mpegFile;
  mpegFile.cross.setEssenceContainers({mpeg, aes3});
  EXPECT_EQ(mpegFile.findings(), Lines{"warning 02 unexpected essenceContainers value (missing MULTIPLE_ESSENCE)"});
  EXPECT_EQ(*mpegFile.cross.getAuxiliaryContainer(), aes3);
}

TEST(CrossValidator, PictureSoundDataAndMultipleEssencePass) {
  Fixture f;
  f.cross.setEssenceContainers({multiple, anc, aes3, mpeg});
  EXPECT_EQ(f.findings(), Lines{});
  EXPECT_EQ(*f.cross.getEssenceContainer(), mpeg);
}

TEST(CrossValidator, NoPictureContainerIsUnsupported) {
  Fixture f;
  f.cross.setEssenceContainers({aes3});
  EXPECT_EQ(f.findings(), Lines{"error 02 unsupported essenceContainers value"});
  EXPECT_FALSE(f.cross.getEssenceContainer().has_value());
}

TEST(CrossValidator, LabelLeftOverIsUnexpected) {
  Fixture f;
  f.cross.setEssenceContainers({mpeg, wave, multiple});
  EXPECT_EQ(f.findings(), Lines{"error 02 unexpected essenceContainers value"});
}

TEST(CrossValidator, D10ContainerComesAlone) {
  Fixture alone;
  alone.cross.setEssenceContainers({d10});
  EXPECT_EQ(alone.findings(), Lines{});
  Fixture withSound;
  withSound.cross.setEssenceContainers({d10, aes3});
  EXPECT_EQ(withSound.findings(), Lines{"error 02 unexpected essenceContainers value"});
}

TEST(CrossValidator, LaterSetMustEqualTheFirst) {
  Fixture f;
  f.cross.setEssenceContainers({mpeg, aes3, multiple});
  f.cross.setEssenceContainers({multiple, mpeg, aes3});
  EXPECT_EQ(f.findings(), Lines{});
  f.cross.setEssenceContainers({mpeg});
  EXPECT_EQ(f.findings(), Lines{"error 02 unexpected essenceContainers value"});
  // Cleared, the next set is a first one again.
  f.cross.clearEssenceContainers();
  f.cross.setEssenceContainers({d10});
  EXPECT_EQ(*f.cross.getEssenceContainer(), d10);
}

TEST(CrossValidator, OperationalPatternByFormat) {
  Fixture unknown;
  unknown.cross.setOperationalPattern(op1a);
  unknown.cross.setOperationalPattern(proxyPattern);
  EXPECT_EQ(unknown.findings(), Lines{});
  unknown.cross.setOperationalPattern(opAtom);
  EXPECT_EQ(unknown.findings(), Lines{"error 02 unsupported operationalPattern value"});
  Fixture proxyFile;
  proxyFile.cross.setEssenceContainers({proxy});
  proxyFile.cross.setOperationalPattern(op1a);
  EXPECT_EQ(proxyFile.findings(), Lines{"error 02 unsupported operationalPattern value"});
  Fixture mpegFile;
  mpegFile.cross.setEssenceContainers({mpeg});
  mpegFile.cross.setOperationalPattern(proxyPattern);
  EXPECT_EQ(mpegFile.findings(), Lines{"error 02 unsupported operationalPattern value"});
}

TEST(CrossValidator, StreamIdentifiersAreZeroOrChangingOnlyByMistake) {
  Fixture f;
  f.cross.setBodySID(0);
  f.cross.setBodySID(1);
  f.cross.setBodySID(1);
  f.cross.setBodySID(2);
  f.cross.setIndexSID(0);
  f.cross.setIndexSID(2);
  f.cross.setIndexSID(3);
  EXPECT_EQ(f.findings(), (Lines{"error 09 unexpected bodySID value", "error 09 unexpected bodySID value",
                                 "error 0A unexpected indexSID value", "error 0A unexpected indexSID value"}));
}

TEST(CrossValidator, EditRateOfTheFormatAndTheSameLater) {
  Fixture f;
  f.cross.setEssenceContainers({d10});
  f.cross.setEditRate({50, 1});
  f.cross.setEditRate({100, 2});
  f.cross.setEditRate({25, 1});
  EXPECT_EQ(f.findings(), (Lines{"error 0C unsupported TimelineTrack.editRate value",
                                 "error 0C unexpected TimelineTrack.editRate value"}));
}

TEST(CrossValidator, IndexEditRateAgainstTheTimeline) {
  Fixture unknown;
  unknown.cross.setIndexEditRate({1, 2});
  unknown.cross.setIndexEditRate({500, 1001});
  unknown.cross.setIndexEditRate({60, 1});
  unknown.cross.setIndexEditRate({7, 1});
  EXPECT_EQ(unknown.findings(), Lines{"error 0C unsupported indexEditRate value"});
  Fixture mpegFile;
  mpegFile.cross.setEssenceContainers({mpeg});
  mpegFile.cross.setIndexEditRate({48, 1});
  mpegFile.cross.setIndexEditRate({50, 1});
  mpegFile.cross.setEditRate({50, 1});
  mpegFile.cross.setIndexEditRate({25, 1});
  EXPECT_EQ(mpegFile.findings(),
            (Lines{"error 0C unsupported indexEditRate value", "error 0C unexpected indexEditRate value"}));
}

TEST(CrossValidator, ProxyIndexHasOneEntryPerFiftyOrSixtyFrames) {
  Fixture before;
  before.cross.setEssenceContainers({proxy});
  before.cross.setIndexEditRate({1, 2});
  before.cross.setIndexEditRate({500, 1001});
  before.cross.setIndexEditRate({25, 1});
  EXPECT_EQ(before.findings(), Lines{"error 0C unsupported indexEditRate value"});
  Fixture pal;
  pal.cross.setEssenceContainers({proxy});
  pal.cross.setEditRate({25, 1});
  pal.cross.setIndexEditRate({1, 2});
  pal.cross.setIndexEditRate({500, 1001});
  EXPECT_EQ(pal.findings(), Lines{"error 0C unsupported indexEditRate value"});
  Fixture film;
  film.cross.setEssenceContainers({proxy});
  film.cross.setEditRate({24000, 1001});
  film.cross.setIndexEditRate({500, 1001});
  EXPECT_EQ(film.findings(), Lines{});
}

// 10:00:00:00 at 25: frame 900000.
MXFSDTICPTimeStamp stampOf(std::uint8_t frames, std::uint8_t seconds, std::uint8_t minutes, std::uint8_t hours) {
  MXFSDTICPTimeStamp stamp{};
  stamp[0] = 0x81;
  stamp[1] = frames;
  stamp[2] = seconds;
  stamp[3] = minutes;
  stamp[4] = hours;
  return stamp;
}

Fixture& timedAt25(Fixture& f) {
  f.cross.setEssenceContainers({mpeg});
  f.cross.setEditRate({25, 1});
  f.cross.setStartTimecode(900000, 0, 10, false);
  return f;
}

TEST(CrossValidator, UserStampsOfTheClipAgreeWithTheStartTimecode) {
  Fixture f;
  timedAt25(f);
  f.cross.checkUserStamp(stampOf(0x00, 0x00, 0x00, 0x10), 0);
  f.cross.checkUserStamp(stampOf(0x09, 0x00, 0x00, 0x10), 9);
  // The free flags of the hours and minutes octets are masked.
  f.cross.checkUserStamp(stampOf(0x05, 0x00, 0x80, 0xD0), 5);
  EXPECT_EQ(f.findings(), Lines{});
}

TEST(CrossValidator, AfterTheFirstUserStampFindingNoMoreAreReported) {
  Fixture f;
  timedAt25(f);
  f.cross.checkUserStamp(stampOf(0x01, 0x00, 0x00, 0x10), 0);
  f.cross.checkUserStamp(stampOf(0x07, 0x00, 0x00, 0x10), 1);
  MXFSDTICPTimeStamp other = stampOf(0x02, 0x00, 0x00, 0x10);
  other[0] = 0x00;
  f.cross.checkUserStamp(other, 2);
  EXPECT_EQ(f.findings(), Lines{"warning 0E inconsistent user stamp and startTimecode"});
}

TEST(CrossValidator, StampOfAnotherKindIsReportedOnce) {
  Fixture f;
  timedAt25(f);
  MXFSDTICPTimeStamp stamp = stampOf(0x00, 0x00, 0x00, 0x10);
  stamp[0] = 0x00;
  f.cross.checkUserStamp(stamp, 0);
  f.cross.checkUserStamp(stamp, 1);
  EXPECT_EQ(f.findings(), Lines{"warning 0E expected SMPTE12M userstamp"});
}

TEST(CrossValidator, PositionOutsideTheClipIsNotChecked) {
  Fixture f;
  f.cross.setEssenceContainers({mpeg});
  f.cross.setEditRate({25, 1});
  f.cross.setStartTimecode(900000, 3, 10, false);
  MXFSDTICPTimeStamp wrong{};
  f.cross.checkUserStamp(wrong, 2);
  f.cross.checkUserStamp(wrong, 13);
  f.cross.checkUserStamp(wrong, -1);
  EXPECT_EQ(f.findings(), Lines{});
  f.cross.checkUserStamp(wrong, 3);
  EXPECT_EQ(f.findings(), Lines{"warning 0E expected SMPTE12M userstamp"});
}

TEST(CrossValidator, DropFrameStampsAtThirtyThousandOverThousandAndOne) {
  Fixture f;
  f.cross.setEssenceContainers({mpeg});
  f.cross.setEditRate({30000, 1001});
  // 01:00:00;00 is frame 107892; the drop frame flag is bit 6 of the frames.
  f.cross.setStartTimecode(107892, 0, 5, true);
  f.cross.checkUserStamp(stampOf(0x42, 0x00, 0x00, 0x01), 2);
  EXPECT_EQ(f.findings(), Lines{});
  f.cross.checkUserStamp(stampOf(0x02, 0x00, 0x00, 0x01), 2);
  EXPECT_EQ(f.findings(), Lines{"warning 0E inconsistent user stamp and startTimecode"});
}

TEST(CrossValidator, SecondStartTimecodeThatDiffersIsInconsistent) {
  Fixture f;
  f.cross.setEditRate({25, 1});
  f.cross.setStartTimecode(100, 0, 10, false);
  f.cross.setStartTimecode(100, 0, 10, false);
  f.cross.setStartTimecode(101, 0, 10, false);
  EXPECT_EQ(f.findings(), Lines{"warning 0E inconsistent startTimecodes"});
}

}  // namespace
