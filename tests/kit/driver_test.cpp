// The driver: what it asks of a source, what it refuses, and the shape of
// the file it makes, read back through the kit's reader.
#include <gtest/gtest.h>

#include <memory>
#include <sstream>
#include <string>

#include "support/kit_masters.h"
#include "support/kit_readers.h"
#include "support/kit_sources.h"
#include "support/mxf_streams.h"

using namespace zelta_test;

namespace {

constexpr MXFRational rate25{25, 1};
constexpr MXFRational rate2997{30000, 1001};

std::shared_ptr<ZeltaDefaultMetadata> master(ZeltaEssenceFormat format, bool sound, bool ancillary = false,
                                             PictureKind picture = PictureKind::plain, MXFRational rate = rate25,
                                             std::uint16_t version = 0x0102) {
  return masterOf(shapeOf(format, rate, version, sound, ancillary, picture));
}

// A source of small elements: the driver pads each to the room of its slot.
std::shared_ptr<TestSource> sourceOf(std::shared_ptr<ZeltaDefaultMetadata> m, std::uint64_t units) {
  m->duration = units;
  auto source = std::make_shared<TestSource>(m, units);
  source->pictureSize = 3000;
  source->soundSize = 1920 * 3;
  source->dataSize = 100;
  return source;
}

std::string driven(const std::shared_ptr<TestSource>& source) {
  auto out = std::make_shared<std::stringstream>();
  createZeltaDriver(source)->drive(createZeltaWriter(out));
  return out->str();
}

ReadRecord readBack(const std::string& bytes) {
  ReadRecord record;
  readThroughZeltaReader(std::make_shared<std::istringstream>(bytes), record, true);
  return record;
}

std::string keyOf(std::uint8_t kind, std::uint8_t status) {
  return toString(MXFPartitionPackKey(static_cast<MXFPartitionKind>(kind), static_cast<MXFPartitionStatus>(status)));
}

std::string refusal(const std::string& text) { return "assertion failure: " + text; }

bool hasEvent(const std::vector<std::string>& events, const std::string& prefix) {
  for (const std::string& event : events)
    if (event.compare(0, prefix.size(), prefix) == 0) return true;
  return false;
}

// A source that has no master to give.
class MasterlessSource : public TestSource {
 public:
  MasterlessSource() : TestSource(nullptr, 0) {}
  std::shared_ptr<const ZeltaMasterMetadata> getMasterMetadata() override { return nullptr; }
};

}  // namespace

TEST(Driver, StartWithoutWriterSourceOrMasterFails) {
  auto writer = createZeltaWriter(std::make_shared<std::stringstream>());
  auto source = sourceOf(master(ZeltaEssenceFormat::D10, true), 1);
  EXPECT_EQ(assertionTextOf([&] { createZeltaDriver(source)->start(nullptr); }), refusal("writer is present"));
  EXPECT_EQ(assertionTextOf([&] { createZeltaDriver(nullptr)->start(writer); }), refusal("source is present"));
  EXPECT_EQ(assertionTextOf([&] { createZeltaDriver(std::make_shared<MasterlessSource>())->start(writer); }),
            refusal("master metadata is present"));
}

TEST(Driver, EditUnitsAndFinishBeforeStartFailWriterIsPresent) {
  auto driver = createZeltaDriver(sourceOf(master(ZeltaEssenceFormat::D10, true), 1));
  EXPECT_EQ(assertionTextOf([&] { driver->writeAll(); }), refusal("writer is present"));
  EXPECT_EQ(assertionTextOf([&] { driver->writeEditUnit(); }), refusal("writer is present"));
  EXPECT_EQ(assertionTextOf([&] { driver->finish(); }), refusal("writer is present"));
}

TEST(Driver, EditUnitAfterFinishFailsWriterIsPresentAndTheDriverStartsAgain) {
  auto source = sourceOf(master(ZeltaEssenceFormat::D10, true), 2);
  auto driver = createZeltaDriver(source);
  auto first = std::make_shared<std::stringstream>();
  driver->drive(createZeltaWriter(first));
  EXPECT_EQ(assertionTextOf([&] { driver->writeEditUnit(); }), refusal("writer is present"));
  source->served = 0;
  auto second = std::make_shared<std::stringstream>();
  driver->drive(createZeltaWriter(second));
  EXPECT_EQ(readBack(second->str()).sdticp.packs.size(), 2U);
}

TEST(Driver, ProxyMasterFailsAtStartValidEssenceFormat) {
  auto source = sourceOf(master(ZeltaEssenceFormat::Proxy, true), 1);
  auto out = std::make_shared<std::stringstream>();
  EXPECT_EQ(assertionTextOf([&] { createZeltaDriver(source)->start(createZeltaWriter(out)); }),
            refusal("valid essence format"));
  EXPECT_EQ(out->str(), "");
}

TEST(Driver, SourceThatSaysNoAtOnceGetsNoEditUnit) {
  const ReadRecord record = readBack(driven(sourceOf(master(ZeltaEssenceFormat::D10, true), 0)));
  EXPECT_FALSE(hasEvent(record.gc.events, "startEditUnit"));
  EXPECT_EQ(record.failure, "");
}

TEST(Driver, SourceWithNoSoundHasBitmap58NoSoundElementAndOneContainerLabel) {
  for (ZeltaEssenceFormat format : {ZeltaEssenceFormat::D10, ZeltaEssenceFormat::Raw}) {
    const ReadRecord record = readBack(driven(sourceOf(master(format, false), 2)));
    ASSERT_EQ(record.sdticp.packs.size(), 2U);
    EXPECT_EQ(record.sdticp.packs[0].bitmap, 0x58);
    EXPECT_FALSE(hasEvent(record.gc.events, "soundElement"));
    EXPECT_EQ(record.structure.packs.front().essenceContainers.size(), 1U);
  }
}

TEST(Driver, SoundAndDataRaiseTheirBitsOfTheBitmap) {
  const ReadRecord record =
      readBack(driven(sourceOf(master(ZeltaEssenceFormat::MPEG, true, true, PictureKind::studio), 1)));
  ASSERT_EQ(record.sdticp.packs.size(), 1U);
  EXPECT_EQ(record.sdticp.packs[0].bitmap, 0x58 | 0x04 | 0x02);
  EXPECT_TRUE(hasEvent(record.gc.events, "dataElement"));
}

TEST(Driver, DurationUnknownAtStartAndKnownAtFinishGivesOpenIncompleteHeaderAndClosedCompleteFooter) {
  auto m = master(ZeltaEssenceFormat::MPEG, true, false, PictureKind::studio);
  auto source = sourceOf(m, 3);
  m->duration = ZeltaUnknownDuration;
  auto out = std::make_shared<std::stringstream>();
  auto driver = createZeltaDriver(source);
  driver->start(createZeltaWriter(out));
  driver->writeAll();
  m->duration = 3;
  driver->finish();
  const ReadRecord record = readBack(out->str());
  EXPECT_EQ(record.structure.events.at(1), "startPartition " + keyOf(2, 1) + " 512");
  EXPECT_TRUE(hasEvent(record.structure.events, "startPartition " + keyOf(4, 4)));
  // The kit's reader warns of the open header, as it must of any.
  ASSERT_EQ(kitFindings(record.errors.reports),
            std::vector<std::string>{"warning 04 open or incomplete partition status"});
  EXPECT_EQ(withoutKitReports(record.errors.reports).size(), 0U);
}

TEST(Driver, VersionZeroGives258ForD10And259ForMPEG) {
  for (auto [format, minor] : {std::pair{ZeltaEssenceFormat::D10, 2}, std::pair{ZeltaEssenceFormat::MPEG, 3}}) {
    auto m = master(format, true, false, PictureKind::studio);
    m->prefaceVersion = 0;
    const ReadRecord record = readBack(driven(sourceOf(m, 1)));
    EXPECT_EQ(record.structure.packs.front().majorVersion, 1);
    EXPECT_EQ(record.structure.packs.front().minorVersion, minor);
    std::shared_ptr<const ZeltaMasterMetadata> back =
        createZeltaMasterMetadata(std::dynamic_pointer_cast<const Preface>(record.metadata.models.front().front()));
    EXPECT_EQ(back->getPrefaceVersion(), 0x0100 + minor);
  }
}

TEST(Driver, D10WithDurationKnownAtStartEndsWithoutRandomIndexPack) {
  const ReadRecord record = readBack(driven(sourceOf(master(ZeltaEssenceFormat::D10, true), 2)));
  EXPECT_FALSE(hasEvent(record.structure.events, "randomIndex"));
  EXPECT_EQ(record.structure.events.front(), "startStream");
  EXPECT_EQ(record.structure.packs.back().headerByteCount, 0U);
  EXPECT_EQ(record.structure.packs.back().indexByteCount, 0U);
  EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
}

TEST(Driver, D10StartedWithDurationUnknownGetsRandomIndexAndAFooterOf15872MetadataAnd512Index) {
  auto m = master(ZeltaEssenceFormat::D10, true);
  auto source = sourceOf(m, 2);
  m->duration = ZeltaUnknownDuration;
  const ReadRecord record = readBack(driven(source));
  EXPECT_TRUE(hasEvent(record.structure.events, "randomIndex 2"));
  const MXFPartitionPack& footer = record.structure.packs.back();
  EXPECT_EQ(footer.headerByteCount, 15872U);
  EXPECT_EQ(footer.indexByteCount, 512U);
  EXPECT_EQ(footer.indexSID, m->indexSID);
  EXPECT_TRUE(hasEvent(record.structure.events, "startPartition " + keyOf(4, 4)));
  ASSERT_EQ(record.index.segments.size(), 2U);
  EXPECT_EQ(record.index.segments.back().indexDuration, 2);
}

TEST(Driver, AVCSourceThatChangesItsWrappingAfterStartKeepsTheRoadOfStart) {
  auto source = sourceOf(master(ZeltaEssenceFormat::AVC, true, false, PictureKind::fullSize), 2);
  source->avcWrappings = {1, 2};
  const ReadRecord record = readBack(driven(source));
  EXPECT_EQ(source->avcWrappingQuestions, 1U);
  ASSERT_EQ(record.index.segments.size(), 1U);
  // 512 + (568832: 569344) + 4 * (1920 * 3: 6144), one segment for the file.
  EXPECT_EQ(record.index.segments.front().editUnitByteCount, 594432U);
  EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
}

TEST(Driver, D10At50MbitAnd625LinesTakes312832OctetsAnEditUnit) {
  const ReadRecord record = readBack(driven(sourceOf(master(ZeltaEssenceFormat::D10, true), 1)));
  ASSERT_EQ(record.index.segments.size(), 1U);
  const MXFIndexTableSegment& segment = record.index.segments.front();
  // System item 512; picture 250000 + 20 + fill, 250368; sound 1920 * 32 + 4
  // + 20 + fill, 61952.
  EXPECT_EQ(segment.editUnitByteCount, 512U + 250368U + 61952U);
  ASSERT_EQ(segment.deltaEntryArray.size(), 3U);
  EXPECT_EQ(segment.deltaEntryArray[1].elementDelta, 512U);
  EXPECT_EQ(segment.deltaEntryArray[2].elementDelta, 512U + 250368U);
}

TEST(Driver, UserStampIsBuiltFromTheStartTimecodeWhenTheSourceGivesNone) {
  auto m = master(ZeltaEssenceFormat::D10, true);
  m->startTimecode = 90000 + 25 * 61 + 7;  // 01:01:01:07
  m->origin = 0;
  const ReadRecord record = readBack(driven(sourceOf(m, 2)));
  ASSERT_EQ(record.sdticp.packs.size(), 2U);
  const MXFSDTICPTimeStamp& stamp = record.sdticp.packs[1].userStamp;
  EXPECT_EQ(stamp[0], 0x81);
  EXPECT_EQ(stamp[1], 0x08);
  EXPECT_EQ(stamp[2], 0x01);
  EXPECT_EQ(stamp[3], 0x01);
  EXPECT_EQ(stamp[4], 0x01);
  EXPECT_EQ(record.sdticp.packs[0].continuityCount + 1, record.sdticp.packs[1].continuityCount);
  EXPECT_EQ(record.sdticp.packs[0].rate, 4);
}

TEST(Driver, DropFrameStampCarriesTheFlagInItsFramesOctet) {
  auto m = master(ZeltaEssenceFormat::D10, true, false, PictureKind::plain, rate2997);
  m->dropFrame = true;
  m->startTimecode = 1800;  // 00:01:00:02 in drop frame counting
  m->origin = 0;
  const ReadRecord record = readBack(driven(sourceOf(m, 1)));
  ASSERT_EQ(record.sdticp.packs.size(), 1U);
  const MXFSDTICPTimeStamp& stamp = record.sdticp.packs[0].userStamp;
  EXPECT_EQ(stamp[1], 0x40 | 0x02);
  EXPECT_EQ(stamp[3], 0x01);
  EXPECT_EQ(record.sdticp.packs[0].rate, 7);
  EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
}

TEST(Driver, UserStampOfTheSourceGoesOutAsItStands) {
  auto source = sourceOf(master(ZeltaEssenceFormat::D10, true), 1);
  source->userStamp = MXFSDTICPTimeStamp{0x81, 0x24, 0x13, 0x02, 0x10};
  const ReadRecord record = readBack(driven(source));
  ASSERT_EQ(record.sdticp.packs.size(), 1U);
  EXPECT_EQ(record.sdticp.packs[0].userStamp, source->userStamp);
}

TEST(Driver, PackageAndPictureMetadataOfTheSourceGoIntoTheSystemItem) {
  auto source = sourceOf(master(ZeltaEssenceFormat::D10, true), 1);
  source->packageItems = {{0x88, ByteVector{1, 2, 3}}};
  source->pictureItems = {{0x89, ByteVector{4, 5}}};
  const ReadRecord record = readBack(driven(source));
  EXPECT_TRUE(hasEvent(record.sdticp.events, "packageMetadata"));
  EXPECT_TRUE(hasEvent(record.sdticp.events, "pictureMetadata"));
}

TEST(Driver, RawOfAnotherCodeOrWidthIsRefused) {
  auto m = master(ZeltaEssenceFormat::Raw, false);
  m->profileAndLevel = 1234;
  auto out = std::make_shared<std::stringstream>();
  EXPECT_EQ(assertionTextOf([&] { createZeltaDriver(sourceOf(m, 1))->start(createZeltaWriter(out)); }),
            refusal("supported Orvane Raw profile and level"));
  m->profileAndLevel = 1057;
  m->displaySize = {3840, 2160};
  EXPECT_EQ(assertionTextOf([&] { createZeltaDriver(sourceOf(m, 1))->start(createZeltaWriter(out)); }),
            refusal("supported display width"));
}

// The MPEG studio model of the older version with four channels takes 8,765
// octets, more than the 9 * 1024 - 512 the layout plans: the header gets the
// least multiple of 512 that holds it with a fill item, and the footer's
// offset moves on with it.
TEST(Driver, ModelLargerThanThePlannedRoomGetsTheLeastRoomThatHoldsIt) {
  auto m = master(ZeltaEssenceFormat::MPEG, true, false, PictureKind::studio);
  ASSERT_EQ(m->audioChannelCount, 4U);
  const ReadRecord record = readBack(driven(sourceOf(m, 2)));
  EXPECT_EQ(record.failure, "");
  EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
  EXPECT_EQ(record.structure.packs.front().headerByteCount, 9216U);
  EXPECT_EQ(record.structure.packs.front().footerPartition, record.structure.packs.back().thisPartition);
}
