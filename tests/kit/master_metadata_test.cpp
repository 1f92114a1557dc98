#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "core/failure.h"
#include "kit.h"

using zelta_test::failureOf;

namespace {

// A master whose every answer differs from the initial state and from the
// other answers of the same type.
std::shared_ptr<ZeltaDefaultMetadata> distinctMaster() {
  auto m = std::make_shared<ZeltaDefaultMetadata>();
  m->prefaceVersion = 0x0103;
  m->identification.companyName = L"company";
  m->identification.productName = L"product";
  m->identification.productVersion.major = 3;
  m->identification.productVersion.patch = 9;
  m->identification.versionString = L"3.0.0.9";
  m->identification.productUID[0] = 0xAB;
  m->creationDate.year = 2024;
  m->modificationDate.year = 2025;
  m->essenceFormat = static_cast<std::uint32_t>(ZeltaEssenceFormat::AVC);
  m->materialPackageUID = UMID::createNew(0x0F);
  m->filePackageUID = UMID::createNew(0x0F);
  m->packageName = L"clip";
  m->editRate = {30000, 1001};
  m->descriptiveText = "<xml/>";
  m->bitRate = 50000000;
  m->progressive = true;
  m->displaySize = {1920, 1080};
  m->videoLineMap = {42, 7};
  m->aspectRatio = {16, 9};
  m->rgb = true;
  m->wideRangeRGB = true;
  m->componentDepth = 10;
  m->subsampling = {2, 1};
  m->simpleStudioProfile = true;
  m->singleSequence = true;
  m->constantBFrames = true;
  m->lowDelay = true;
  m->closedGOP = true;
  m->identicalGOP = true;
  m->maxGOP = 15;
  m->bPictureCount = 2;
  m->profileAndLevel = 0x6E29;
  m->profileConstraint = 16;
  m->halfSize = true;
  m->audioChannelCount = 2;
  m->quantizationBits = 24;
  m->audioSamplingRates = {{48000, 1}, {44100, 1}};
  ZeltaChannelStatus second{};
  second[0] = 0x85;
  second[23] = 0x42;
  m->fixedChannelStatusData = {ZeltaChannelStatus{0x05}, second};
  m->ancillaryData = true;
  m->dropFrame = true;
  m->startTimecode = 108000;
  m->origin = -3;
  m->duration = 1234;
  m->indexSID = 2;
  m->bodySID = 1;
  return m;
}

TEST(MasterMetadata, DefaultMetadataStartsEmptyWithNoFormatAndUnknownDuration) {
  const ZeltaDefaultMetadata m;
  EXPECT_EQ(m.getPrefaceVersion(), 0);
  const ZeltaIdentification id = m.getIdentification();
  EXPECT_EQ(id.companyName, L"");
  EXPECT_EQ(id.productName, L"");
  EXPECT_EQ(id.productVersion, MXFProductVersion());
  EXPECT_EQ(id.versionString, L"");
  EXPECT_EQ(id.productUID, MXFUID());
  EXPECT_EQ(m.getCreationDate(), MXFTimestamp());
  EXPECT_EQ(m.getModificationDate(), MXFTimestamp());
  EXPECT_EQ(m.getEssenceFormat(), 0xFFFFFFFFu);
  EXPECT_EQ(m.getMaterialPackageUID(), UMID(UMID::basic, ByteVector(32, 0)));
  EXPECT_EQ(m.getFilePackageUID(), UMID(UMID::basic, ByteVector(32, 0)));
  EXPECT_EQ(m.getPackageName(), L"");
  EXPECT_EQ(m.getEditRate(), (MXFRational{0, 0}));
  EXPECT_EQ(m.getDescriptiveText(), "");
  EXPECT_EQ(m.getBitRate(), 0u);
  EXPECT_FALSE(m.isProgressive());
  EXPECT_EQ(m.getDisplaySize(), ZeltaSize(0, 0));
  EXPECT_EQ(m.getVideoLineMap(), ZeltaLineMap(0, 0));
  EXPECT_EQ(m.getAspectRatio(), (MXFRational{0, 0}));
  EXPECT_FALSE(m.isRGB());
  EXPECT_FALSE(m.isWideRangeRGB());
  EXPECT_EQ(m.getComponentDepth(), 0u);
  EXPECT_EQ(m.getSubsampling(), ZeltaSize(0, 0));
  EXPECT_FALSE(m.isSimpleStudioProfile());
  EXPECT_FALSE(m.isSingleSequence());
  EXPECT_FALSE(m.hasConstantBFrames());
  EXPECT_FALSE(m.isLowDelay());
  EXPECT_FALSE(m.isClosedGOP());
  EXPECT_FALSE(m.isIdenticalGOP());
  EXPECT_EQ(m.getMaxGOP(), 0);
  EXPECT_EQ(m.getBPictureCount(), 0);
  EXPECT_EQ(m.getProfileAndLevel(), 0);
  EXPECT_EQ(m.getProfileConstraint(), 0);
  EXPECT_FALSE(m.isHalfSize());
  EXPECT_EQ(m.getAudioChannelCount(), 0u);
  EXPECT_EQ(m.getQuantizationBits(), 0u);
  EXPECT_TRUE(m.audioSamplingRates.empty());
  EXPECT_TRUE(m.fixedChannelStatusData.empty());
  EXPECT_FALSE(m.hasAncillaryData());
  EXPECT_FALSE(m.isDropFrame());
  EXPECT_EQ(m.getStartTimecode(), 0u);
  EXPECT_EQ(m.getOrigin(), 0);
  EXPECT_EQ(m.getDuration(), 0xFFFFFFFFFFFFFFFFu);
  EXPECT_EQ(m.getIndexSID(), 0u);
  EXPECT_EQ(m.getBodySID(), 0u);
}

TEST(MasterMetadata, ChannelIndexEqualToTheCountAnswersTheOutOfRangeValues) {
  const auto m = distinctMaster();
  ZeltaChannelStatus outOfRange{};
  outOfRange[0] = 1;
  EXPECT_EQ(m->getAudioSamplingRate(1), (MXFRational{44100, 1}));
  EXPECT_EQ(m->getAudioSamplingRate(2), (MXFRational{0, 1}));
  EXPECT_EQ(m->getFixedChannelStatusData(2), outOfRange);
  EXPECT_EQ(failureOf([&] { m->getAudioSamplingRate(0xFFFFFFFF); }), "no failure");
}

TEST(MasterMetadata, ChannelBeyondTheCountIsOutOfRangeEvenWhenTheListsHoldMore) {
  auto m = distinctMaster();
  m->audioChannelCount = 1;
  ZeltaChannelStatus outOfRange{};
  outOfRange[0] = 1;
  EXPECT_EQ(m->getAudioSamplingRate(1), (MXFRational{0, 1}));
  EXPECT_EQ(m->getFixedChannelStatusData(1), outOfRange);
}

TEST(MasterMetadata, ChannelsWithoutListEntriesAnswerTheOutOfRangeValues) {
  ZeltaDefaultMetadata m;
  m.audioChannelCount = 4;
  ZeltaChannelStatus outOfRange{};
  outOfRange[0] = 1;
  EXPECT_EQ(m.getAudioSamplingRate(0), (MXFRational{0, 1}));
  EXPECT_EQ(m.getFixedChannelStatusData(3), outOfRange);
}

TEST(MasterMetadata, DurationOfAllOnesIsAnsweredAsItStands) {
  auto m = distinctMaster();
  m->duration = 0xFFFFFFFFFFFFFFFF;
  const DullMetadataFilter filter(m);
  EXPECT_EQ(m->getDuration(), 0xFFFFFFFFFFFFFFFFu);
  EXPECT_EQ(filter.getDuration(), 0xFFFFFFFFFFFFFFFFu);
}

TEST(MasterMetadata, DullFilterForwardsAllOperations) {
  const auto m = distinctMaster();
  const DullMetadataFilter f(m);
  EXPECT_EQ(f.getPrefaceVersion(), 0x0103);
  const ZeltaIdentification id = f.getIdentification();
  EXPECT_EQ(id.companyName, L"company");
  EXPECT_EQ(id.productName, L"product");
  EXPECT_EQ(id.productVersion, m->identification.productVersion);
  EXPECT_EQ(id.versionString, L"3.0.0.9");
  EXPECT_EQ(id.productUID, m->identification.productUID);
  EXPECT_EQ(f.getCreationDate(), m->creationDate);
  EXPECT_EQ(f.getModificationDate(), m->modificationDate);
  EXPECT_EQ(f.getEssenceFormat(), 5u);
  EXPECT_EQ(f.getMaterialPackageUID(), m->materialPackageUID);
  EXPECT_EQ(f.getFilePackageUID(), m->filePackageUID);
  EXPECT_NE(f.getMaterialPackageUID(), f.getFilePackageUID());
  EXPECT_EQ(f.getPackageName(), L"clip");
  EXPECT_EQ(f.getEditRate(), (MXFRational{30000, 1001}));
  EXPECT_EQ(f.getDescriptiveText(), "<xml/>");
  EXPECT_EQ(f.getBitRate(), 50000000u);
  EXPECT_TRUE(f.isProgressive());
  EXPECT_EQ(f.getDisplaySize(), ZeltaSize(1920, 1080));
  EXPECT_EQ(f.getVideoLineMap(), ZeltaLineMap(42, 7));
  EXPECT_EQ(f.getAspectRatio(), (MXFRational{16, 9}));
  EXPECT_TRUE(f.isRGB());
  EXPECT_TRUE(f.isWideRangeRGB());
  EXPECT_EQ(f.getComponentDepth(), 10u);
  EXPECT_EQ(f.getSubsampling(), ZeltaSize(2, 1));
  EXPECT_TRUE(f.isSimpleStudioProfile());
  EXPECT_TRUE(f.isSingleSequence());
  EXPECT_TRUE(f.hasConstantBFrames());
  EXPECT_TRUE(f.isLowDelay());
  EXPECT_TRUE(f.isClosedGOP());
  EXPECT_TRUE(f.isIdenticalGOP());
  EXPECT_EQ(f.getMaxGOP(), 15);
  EXPECT_EQ(f.getBPictureCount(), 2);
  EXPECT_EQ(f.getProfileAndLevel(), 0x6E29);
  EXPECT_EQ(f.getProfileConstraint(), 16);
  EXPECT_TRUE(f.isHalfSize());
  EXPECT_EQ(f.getAudioChannelCount(), 2u);
  EXPECT_EQ(f.getQuantizationBits(), 24u);
  EXPECT_EQ(f.getAudioSamplingRate(0), (MXFRational{48000, 1}));
  EXPECT_EQ(f.getAudioSamplingRate(1), (MXFRational{44100, 1}));
  EXPECT_EQ(f.getFixedChannelStatusData(0), ZeltaChannelStatus{0x05});
  EXPECT_EQ(f.getFixedChannelStatusData(1), m->fixedChannelStatusData[1]);
  EXPECT_TRUE(f.hasAncillaryData());
  EXPECT_TRUE(f.isDropFrame());
  EXPECT_EQ(f.getStartTimecode(), 108000u);
  EXPECT_EQ(f.getOrigin(), -3);
  EXPECT_EQ(f.getDuration(), 1234u);
  EXPECT_EQ(f.getIndexSID(), 2u);
  EXPECT_EQ(f.getBodySID(), 1u);
}

// A filter that changes one answer and leaves the others to its master.
class BodySIDFilter : public DullMetadataFilter {
 public:
  using DullMetadataFilter::DullMetadataFilter;
  std::uint32_t getBodySID() const override { return getMetadata().getBodySID() + 10; }
};

TEST(MasterMetadata, DerivedFilterOverridesOneOperationAndForwardsTheRest) {
  const BodySIDFilter f(distinctMaster());
  EXPECT_EQ(f.getBodySID(), 11u);
  EXPECT_EQ(f.getIndexSID(), 2u);
}

TEST(MasterMetadata, DullFilterOfNoMasterFails) {
  EXPECT_EQ(failureOf([] { DullMetadataFilter filter(nullptr); }), "assertion failure: metadata is present");
}

TEST(MasterMetadata, ToolkitVersionIsFourZeroZeroBuild74Release1) {
  const MXFProductVersion v = getZeltaToolkitVersion();
  EXPECT_EQ(v.major, 4);
  EXPECT_EQ(v.minor, 0);
  EXPECT_EQ(v.tertiary, 0);
  EXPECT_EQ(v.patch, 74);
  EXPECT_EQ(v.release, 1);
}

TEST(MasterMetadata, PlatformNamesTheToolkit) { EXPECT_EQ(getZeltaPlatform(), L"Orvane Zelta Toolkit (Linux)"); }

TEST(MasterMetadata, EssenceFormatsHaveTheirValues) {
  EXPECT_EQ(static_cast<std::uint32_t>(ZeltaEssenceFormat::D10), 0u);
  EXPECT_EQ(static_cast<std::uint32_t>(ZeltaEssenceFormat::DV), 1u);
  EXPECT_EQ(static_cast<std::uint32_t>(ZeltaEssenceFormat::MPEG), 2u);
  EXPECT_EQ(static_cast<std::uint32_t>(ZeltaEssenceFormat::Proxy), 3u);
  EXPECT_EQ(static_cast<std::uint32_t>(ZeltaEssenceFormat::Raw), 4u);
  EXPECT_EQ(static_cast<std::uint32_t>(ZeltaEssenceFormat::AVC), 5u);
}

}  // namespace
