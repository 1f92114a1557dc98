#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <typeinfo>
#include <vector>

#include "core/failure.h"
#include "kit.h"
#include "support/kit_masters.h"
#include "support/kit_sources.h"
#include "support/kit_models.h"

using zelta_test::componentOf;
using zelta_test::failureOf;
using zelta_test::fileDescriptorsOf;
using zelta_test::masterOf;
using zelta_test::MasterShape;
using zelta_test::packageOf;
using zelta_test::PictureKind;
using zelta_test::shapeOf;

namespace {

std::string buildFailure(const std::shared_ptr<const ZeltaMasterMetadata>& master) {
  return failureOf([&] { createZeltaMetadataModel(master); });
}

const std::type_info& pictureClassOf(const Preface& preface) { return typeid(*fileDescriptorsOf(preface).at(0)); }

std::shared_ptr<const SourceClip> firstSourceClip(const Preface& preface) {
  return componentOf<SourceClip>(*packageOf<SourcePackage>(preface)->getTrackAt(1));
}

// ---------------------------------------------------------------------------
// The two shapes of the model

TEST(ModelBuilderVersions, StudioMPEGHasAnMPEGDescriptorBelow259AndAConstrainedCDCIDescriptorFrom259) {
  auto older = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 258, false, false, PictureKind::studio));
  auto newer = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 259, false, false, PictureKind::studio));
  std::shared_ptr<Preface> a = createZeltaMetadataModel(older);
  std::shared_ptr<Preface> b = createZeltaMetadataModel(newer);
  auto olderPicture = std::dynamic_pointer_cast<const MPEGVideoDescriptor>(fileDescriptorsOf(*a).at(0));
  ASSERT_NE(olderPicture, nullptr);
  ASSERT_EQ(olderPicture->getGenericSubDescriptorCount(), 1u);
  EXPECT_EQ(typeid(*olderPicture->getGenericSubDescriptorAt(0)), typeid(MPEG4VideoSubDescriptor));
  EXPECT_EQ(pictureClassOf(*b), typeid(CDCIPictureDescriptor));
  auto newerPicture = fileDescriptorsOf(*b).at(0);
  ASSERT_EQ(newerPicture->getGenericSubDescriptorCount(), 2u);
  EXPECT_EQ(typeid(*newerPicture->getGenericSubDescriptorAt(0)), typeid(ContainerConstraintsSubDescriptor));
  EXPECT_EQ(typeid(*newerPicture->getGenericSubDescriptorAt(1)), typeid(MPEG4VideoSubDescriptor));
}

TEST(ModelBuilderVersions, StudioRGBPictureIsAnRGBADescriptorInBothShapes) {
  for (std::uint16_t version : {258, 259}) {
    auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, version, false, false, PictureKind::studioRGB));
    EXPECT_EQ(pictureClassOf(*createZeltaMetadataModel(master)), typeid(RGBAPictureDescriptor));
  }
}

TEST(ModelBuilderVersions, SoundSampleRateIsTheEditRateBelow259AndTheSamplingRateFrom259) {
  for (ZeltaEssenceFormat format : {ZeltaEssenceFormat::AVC, ZeltaEssenceFormat::MPEG, ZeltaEssenceFormat::D10}) {
    const PictureKind picture = format == ZeltaEssenceFormat::AVC ? PictureKind::reduced : PictureKind::plain;
    auto older = createZeltaMetadataModel(masterOf(shapeOf(format, {25, 1}, 258, true, false, picture)));
    auto newer = createZeltaMetadataModel(masterOf(shapeOf(format, {25, 1}, 259, true, false, picture)));
    EXPECT_EQ(fileDescriptorsOf(*older).at(1)->getSampleRate(), (MXFRational{25, 1}));
    EXPECT_EQ(fileDescriptorsOf(*newer).at(1)->getSampleRate(), (MXFRational{48000, 1}));
  }
}

TEST(ModelBuilderVersions, SourcePackageCountsFromTheOriginFrom259) {
  // Origin 3, duration 250, start timecode 90000.
  for (ZeltaEssenceFormat format : {ZeltaEssenceFormat::AVC, ZeltaEssenceFormat::MPEG}) {
    const PictureKind picture = format == ZeltaEssenceFormat::AVC ? PictureKind::fullSize : PictureKind::studio;
    auto older = createZeltaMetadataModel(masterOf(shapeOf(format, {25, 1}, 258, true, false, picture)));
    auto newer = createZeltaMetadataModel(masterOf(shapeOf(format, {25, 1}, 259, true, false, picture)));
    EXPECT_EQ(firstSourceClip(*older)->getDuration(), 250);
    EXPECT_EQ(firstSourceClip(*newer)->getDuration(), 253);
    auto olderTimecode = componentOf<TimecodeComponent>(*packageOf<SourcePackage>(*older)->getTrackAt(0));
    auto newerTimecode = componentOf<TimecodeComponent>(*packageOf<SourcePackage>(*newer)->getTrackAt(0));
    EXPECT_EQ(olderTimecode->getStartTimecode(), 90000);
    EXPECT_EQ(newerTimecode->getStartTimecode(), 89997);
    EXPECT_EQ(olderTimecode->getDuration(), 250);
    EXPECT_EQ(newerTimecode->getDuration(), 253);
    // The material package is the same in both.
    EXPECT_EQ(componentOf<SourceClip>(*packageOf<MaterialPackage>(*newer)->getTrackAt(1))->getDuration(), 250);
  }
}

TEST(ModelBuilderVersions, VersionZeroTakesTheOlderShape) {
  auto zero = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 0, true, false, PictureKind::studio));
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(zero);
  EXPECT_EQ(preface->getVersion(), 0);
  EXPECT_EQ(pictureClassOf(*preface), typeid(MPEGVideoDescriptor));
  EXPECT_EQ(fileDescriptorsOf(*preface).at(1)->getSampleRate(), (MXFRational{25, 1}));
  EXPECT_EQ(firstSourceClip(*preface)->getDuration(), 250);
}

// ---------------------------------------------------------------------------
// Sound and data

TEST(ModelBuilderEssences, ClipWithoutSoundOrDataHasOneContainerLabelAndThePictureDescriptorAlone) {
  for (ZeltaEssenceFormat format :
       {ZeltaEssenceFormat::D10, ZeltaEssenceFormat::MPEG, ZeltaEssenceFormat::Raw, ZeltaEssenceFormat::AVC}) {
    const PictureKind picture = format == ZeltaEssenceFormat::AVC ? PictureKind::fullSize : PictureKind::plain;
    std::shared_ptr<Preface> preface =
        createZeltaMetadataModel(masterOf(shapeOf(format, {25, 1}, 259, false, false, picture)));
    EXPECT_EQ(preface->getEssenceContainers().size(), 1u);
    auto descriptor = packageOf<SourcePackage>(*preface)->getDescriptor();
    EXPECT_NE(std::dynamic_pointer_cast<const PictureDescriptor>(descriptor), nullptr);
    EXPECT_EQ(std::dynamic_pointer_cast<const MultipleDescriptor>(descriptor), nullptr);
    // Timecode, picture and the descriptive track.
    EXPECT_EQ(packageOf<MaterialPackage>(*preface)->getTrackCount(), 3u);
  }
}

TEST(ModelBuilderEssences, D10WithSoundHasOneSoundTrackWhateverItsChannelCount) {
  for (std::uint32_t channels : {4u, 8u}) {
    auto master = masterOf(shapeOf(ZeltaEssenceFormat::D10, {25, 1}, 259));
    master->audioChannelCount = channels;
    master->audioSamplingRates.assign(channels, {48000, 1});
    std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
    // Timecode, picture, sound, descriptive.
    ASSERT_EQ(packageOf<SourcePackage>(*preface)->getTrackCount(), 3u);
    EXPECT_EQ(packageOf<MaterialPackage>(*preface)->getTrackCount(), 4u);
    auto sound = std::dynamic_pointer_cast<const SoundDescriptor>(fileDescriptorsOf(*preface).at(1));
    ASSERT_NE(sound, nullptr);
    EXPECT_EQ(sound->getChannelCount(), channels);
    EXPECT_EQ(fileDescriptorsOf(*preface).size(), 2u);
  }
}

TEST(ModelBuilderEssences, ProxyWithSevenChannelsFailsValidChannelCount) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::Proxy, {25, 1}, 259));
  master->audioChannelCount = 7;
  EXPECT_EQ(buildFailure(master), "assertion failure: valid channelCount");
}

TEST(ModelBuilderEssences, DVHasADataTrackWithoutAncillaryData) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::DV, {25, 1}, 259, false));
  ASSERT_FALSE(master->hasAncillaryData());
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  auto material = packageOf<MaterialPackage>(*preface);
  ASSERT_EQ(material->getTrackCount(), 4u);
  EXPECT_EQ(componentOf<SourceClip>(*material->getTrackAt(2))->getDataDefinition(),
            KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01, 0x01, 0x03, 0x02, 0x02,
                                                0x03, 0x00, 0x00, 0x00}));
  EXPECT_EQ(typeid(*fileDescriptorsOf(*preface).at(1)), typeid(ANCDataDescriptor));
}

TEST(ModelBuilderEssences, EmptyPackageNameLeavesTheSourcePackageNameless) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 259));
  master->packageName.clear();
  EXPECT_FALSE(packageOf<SourcePackage>(*createZeltaMetadataModel(master))->hasName());
  master->packageName = L"clip";
  EXPECT_EQ(packageOf<SourcePackage>(*createZeltaMetadataModel(master))->getName(), L"clip");
}

TEST(ModelBuilderEssences, ReducedAVCHasNoDescriptiveTrackAndNoScheme) {
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(
      masterOf(shapeOf(ZeltaEssenceFormat::AVC, {25, 1}, 259, false, false, PictureKind::reduced)));
  auto material = packageOf<MaterialPackage>(*preface);
  ASSERT_EQ(material->getTrackCount(), 2u);
  EXPECT_EQ(typeid(*material->getTrackAt(1)), typeid(TimelineTrack));
  EXPECT_TRUE(preface->getDMSchemes().empty());
}

// ---------------------------------------------------------------------------
// Instance UIDs

TEST(ModelBuilderIdentifiers, EveryObjectTakesAFreshInstanceUIDFromTheGenerator) {
  auto generator = std::make_shared<zelta_test::CountingGenerator>();
  std::shared_ptr<Preface> preface =
      createZeltaMetadataModel(masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 259)), generator);
  EXPECT_EQ(preface->getInstanceUID()[15], 1);
  EXPECT_GT(generator->count, 40);
  // The Identification's generation UID is one more.
  EXPECT_NE(preface->getIdentificationAt(0)->getThisGenerationUID(), preface->getIdentificationAt(0)->getInstanceUID());
}

TEST(ModelBuilderIdentifiers, TheDefaultGeneratorGivesDistinctUIDs) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::D10, {25, 1}, 259));
  EXPECT_NE(createZeltaMetadataModel(master)->getInstanceUID(), createZeltaMetadataModel(master)->getInstanceUID());
}

// ---------------------------------------------------------------------------
// Failures, each in the place where the master breaks a rule

TEST(ModelBuilderFailures, EntryChecksInOrder) {
  auto generator = std::make_shared<ZeltaDefaultUIDGenerator>();
  EXPECT_EQ(failureOf([&] { createZeltaMetadataModel(nullptr, generator); }), "assertion failure: metadata is present");
  EXPECT_EQ(failureOf([&] { createZeltaMetadataModel(nullptr, nullptr); }), "assertion failure: metadata is present");
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::D10, {25, 1}, 259));
  EXPECT_EQ(failureOf([&] { createZeltaMetadataModel(master, nullptr); }),
            "assertion failure: instanceUID generator is present");
  master->essenceFormat = 6;
  master->editRate = {7, 1};
  EXPECT_EQ(buildFailure(master), "assertion failure: supported essence format");
  master->essenceFormat = ZeltaNoEssenceFormat;
  EXPECT_EQ(buildFailure(master), "assertion failure: supported essence format");
  master->essenceFormat = static_cast<std::uint32_t>(ZeltaEssenceFormat::D10);
  master->bitRate = 45000000;
  EXPECT_EQ(buildFailure(master), "assertion failure: valid edit rate");
  master->editRate = {25, 1};
  EXPECT_EQ(buildFailure(master), "assertion failure: valid bit rate");
}

TEST(ModelBuilderFailures, EditRateOutsideTheFormatsList) {
  EXPECT_EQ(buildFailure(masterOf(shapeOf(ZeltaEssenceFormat::DV, {24, 1}, 259))),
            "assertion failure: valid edit rate");
  EXPECT_EQ(buildFailure(masterOf(shapeOf(ZeltaEssenceFormat::Proxy, {50, 1}, 259))),
            "assertion failure: valid edit rate");
  EXPECT_EQ(buildFailure(masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 0}, 259))),
            "assertion failure: valid edit rate");
}

TEST(ModelBuilderFailures, DVBitRateOtherThan25Million) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::DV, {25, 1}, 259));
  master->bitRate = 50000000;
  EXPECT_EQ(buildFailure(master), "assertion failure: valid bit rate");
}

TEST(ModelBuilderFailures, D10SoundOfOtherThanFourOrEightChannels) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::D10, {25, 1}, 259));
  master->audioChannelCount = 2;
  EXPECT_EQ(buildFailure(master), "assertion failure: valid audioChannels count");
}

TEST(ModelBuilderFailures, FrameLayoutOfProxyAndRaw) {
  auto proxy = masterOf(shapeOf(ZeltaEssenceFormat::Proxy, {25, 1}, 259));
  proxy->progressive = true;
  EXPECT_EQ(buildFailure(proxy), "assertion failure: valid frame layout");
  auto raw = masterOf(shapeOf(ZeltaEssenceFormat::Raw, {25, 1}, 259));
  raw->progressive = false;
  EXPECT_EQ(buildFailure(raw), "assertion failure: valid frame layout");
}

TEST(ModelBuilderFailures, ProxyRateAndAspectRatioOfNoDecoderInformation) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::Proxy, {24000, 1001}, 259));
  master->aspectRatio = {4, 3};
  EXPECT_EQ(buildFailure(master), "assertion failure: valid combination of editRate and aspectRatio");
}

TEST(ModelBuilderFailures, MPEGProfileAndLevelBeyondOneOctet) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 259));
  master->profileAndLevel = 0x182;
  EXPECT_EQ(buildFailure(master), "assertion failure: valid profile and level");
}

TEST(ModelBuilderFailures, UnknownProfileAndLevel) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 259));
  master->profileAndLevel = 99;
  EXPECT_EQ(buildFailure(master), "assertion failure: recognized profileAndLevel");
  master->displaySize = {0, 0};
  EXPECT_EQ(buildFailure(master), "assertion failure: recognized profileAndLevel");
  auto avc = masterOf(shapeOf(ZeltaEssenceFormat::AVC, {25, 1}, 259, false, false, PictureKind::reduced));
  avc->profileAndLevel = (67 << 8) | 40;
  avc->subsampling = {0, 0};
  EXPECT_EQ(buildFailure(avc), "assertion failure: recognized profileAndLevel");
  auto raw = masterOf(shapeOf(ZeltaEssenceFormat::Raw, {25, 1}, 259));
  raw->profileAndLevel = 800;
  EXPECT_EQ(buildFailure(raw), "assertion failure: recognized profileAndLevel");
}

TEST(ModelBuilderFailures, DisplaySizeOfNoStoredForm) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 259));
  master->displaySize = {1920, 500};
  EXPECT_EQ(buildFailure(master), "assertion failure: recognized displayHeight");
  auto raw = masterOf(shapeOf(ZeltaEssenceFormat::Raw, {25, 1}, 259));
  raw->displaySize = {1000, 2160};
  EXPECT_EQ(buildFailure(raw), "assertion failure: recognized displayWidth");
  raw->displaySize = {4096, 1000};
  EXPECT_EQ(buildFailure(raw), "assertion failure: recognized displayHeight");
}

TEST(ModelBuilderFailures, ComponentDepthBelowEightBits) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, 259));
  master->componentDepth = 6;
  EXPECT_EQ(buildFailure(master), "assertion failure: recognized componentDepth");
}

}  // namespace
