// The whole tree that the builder makes of one master of each format,
// asserted value by value, labels octet by octet.
#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <memory>
#include <typeinfo>
#include <vector>

#include "kit.h"
#include "support/kit_masters.h"
#include "support/kit_models.h"

using zelta_test::componentOf;
using zelta_test::fileDescriptorsOf;
using zelta_test::masterOf;
using zelta_test::MasterShape;
using zelta_test::packageOf;
using zelta_test::PictureKind;

namespace {

typedef std::array<std::uint8_t, 16> Octets;

Octets octetsOf(const KLVKey& key) {
  Octets octets{};
  for (std::size_t i = 0; i < octets.size(); ++i) octets[i] = key[i];
  return octets;
}

std::vector<Octets> octetsOf(const std::vector<KLVKey>& keys) {
  std::vector<Octets> all;
  for (const KLVKey& key : keys) all.push_back(octetsOf(key));
  return all;
}

// 06 0E 2B 34 04 01 01 vv, then the tail.
Octets label(std::uint8_t version, std::array<std::uint8_t, 8> tail) {
  return {0x06,    0x0E,    0x2B,    0x34,    0x04,    0x01,    0x01,    version,
          tail[0], tail[1], tail[2], tail[3], tail[4], tail[5], tail[6], tail[7]};
}

const Octets op1a = label(0x01, {0x0D, 0x01, 0x02, 0x01, 0x01, 0x01, 0x09, 0x00});
const Octets aes3Container = label(0x01, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x06, 0x03, 0x00});
const Octets ancContainer = label(0x09, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x0E, 0x00, 0x00});
const Octets multipleContainer = label(0x03, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x7F, 0x01, 0x00});
const Octets textScheme = label(0x0C, {0x0D, 0x01, 0x04, 0x01, 0x04, 0x01, 0x01, 0x00});
const Octets timecodeDefinition = label(0x01, {0x01, 0x03, 0x02, 0x01, 0x01, 0x00, 0x00, 0x00});
const Octets pictureDefinition = label(0x01, {0x01, 0x03, 0x02, 0x02, 0x01, 0x00, 0x00, 0x00});
const Octets soundDefinition = label(0x01, {0x01, 0x03, 0x02, 0x02, 0x02, 0x00, 0x00, 0x00});
const Octets dataDefinition = label(0x01, {0x01, 0x03, 0x02, 0x02, 0x03, 0x00, 0x00, 0x00});
const Octets descriptiveDefinition = label(0x01, {0x01, 0x03, 0x02, 0x01, 0x10, 0x00, 0x00, 0x00});
const Octets gammaBT709 = label(0x01, {0x04, 0x01, 0x01, 0x01, 0x01, 0x02, 0x00, 0x00});
const Octets payloadScheme{0x8A, 0x39, 0x08, 0x00, 0x46, 0x78, 0x03, 0x1C,
                           0x78, 0x6D, 0x4D, 0x20, 0x82, 0x80, 0x11, 0xDE};

MasterShape shapeOf(ZeltaEssenceFormat format, MXFRational rate, bool sound, bool ancillary,
                    PictureKind picture = PictureKind::plain) {
  MasterShape shape;
  shape.format = format;
  shape.editRate = rate;
  shape.version = 0x0103;
  shape.sound = sound;
  shape.ancillary = ancillary;
  shape.picture = picture;
  return shape;
}

// What the tracks of both packages hold: the essence tracks' numbers in the
// source package and their data definitions.
struct EssenceTrack {
  std::uint32_t number;
  Octets dataDefinition;
};

void expectPreface(const Preface& preface, const ZeltaMasterMetadata& master, const std::vector<Octets>& containers,
                   bool descriptive) {
  EXPECT_EQ(preface.getLastModifiedDate(), master.getModificationDate());
  EXPECT_EQ(preface.getVersion(), master.getPrefaceVersion());
  EXPECT_EQ(octetsOf(preface.getOperationalPattern()), op1a);
  EXPECT_EQ(octetsOf(preface.getEssenceContainers()), containers);
  EXPECT_EQ(octetsOf(preface.getDMSchemes()), descriptive ? std::vector<Octets>{textScheme} : std::vector<Octets>{});
  ASSERT_EQ(preface.getIdentificationCount(), 1u);
  std::shared_ptr<const Identification> identification = preface.getIdentificationAt(0);
  EXPECT_EQ(identification->getCompanyName(), L"Orvane");
  EXPECT_EQ(identification->getProductName(), L"zelta tests");
  EXPECT_EQ(identification->getProductVersion(), master.getIdentification().productVersion);
  EXPECT_EQ(identification->getVersionString(), L"1.2");
  EXPECT_EQ(identification->getProductUID(), master.getIdentification().productUID);
  EXPECT_EQ(identification->getToolkitVersion().major, 4);
  EXPECT_EQ(identification->getToolkitVersion().minor, 0);
  EXPECT_EQ(identification->getPlatform(), L"Orvane Zelta Toolkit (Linux)");
  EXPECT_EQ(identification->getModificationDate(), master.getModificationDate());
  std::shared_ptr<const ContentStorage> storage = preface.getContentStorage();
  ASSERT_EQ(storage->getPackageCount(), 2u);
  ASSERT_EQ(storage->getEssenceContainerDataCount(), 1u);
  EXPECT_EQ(storage->getEssenceContainerDataAt(0)->getLinkedPackageUID(), master.getFilePackageUID());
  EXPECT_EQ(storage->getEssenceContainerDataAt(0)->getIndexSID(), 2u);
  EXPECT_EQ(storage->getEssenceContainerDataAt(0)->getBodySID(), 1u);
}

void expectTimecodeTrack(const Track& track, std::int64_t origin, std::int64_t duration, std::int64_t start,
                         const MXFRational& rate) {
  ASSERT_EQ(typeid(track), typeid(TimelineTrack));
  const auto& timeline = dynamic_cast<const TimelineTrack&>(track);
  EXPECT_EQ(timeline.getTrackID(), 1u);
  EXPECT_EQ(timeline.getTrackNumber(), 0u);
  EXPECT_EQ(timeline.getEditRate(), rate);
  EXPECT_EQ(timeline.getOrigin(), origin);
  EXPECT_EQ(octetsOf(timeline.getSegment()->getDataDefinition()), timecodeDefinition);
  EXPECT_EQ(timeline.getSegment()->getDuration(), duration);
  std::shared_ptr<const TimecodeComponent> timecode = componentOf<TimecodeComponent>(track);
  ASSERT_NE(timecode, nullptr);
  EXPECT_EQ(octetsOf(timecode->getDataDefinition()), timecodeDefinition);
  EXPECT_EQ(timecode->getDuration(), duration);
  EXPECT_EQ(timecode->getRoundedTimecodeBase(), (rate.numerator + rate.denominator / 2) / rate.denominator);
  EXPECT_EQ(timecode->getStartTimecode(), start);
}

void expectEssenceTracks(const GenericPackage& package, const std::vector<EssenceTrack>& tracks, bool material,
                         const ZeltaMasterMetadata& master, std::int64_t duration) {
  for (std::size_t i = 0; i < tracks.size(); ++i) {
    SCOPED_TRACE(i);
    std::shared_ptr<const Track> track = package.getTrackAt(i + 1);
    ASSERT_EQ(typeid(*track), typeid(TimelineTrack));
    const auto& timeline = dynamic_cast<const TimelineTrack&>(*track);
    EXPECT_EQ(timeline.getTrackID(), i + 2);
    EXPECT_EQ(timeline.getTrackNumber(), material ? 0u : tracks[i].number);
    EXPECT_EQ(timeline.getEditRate(), master.getEditRate());
    EXPECT_EQ(timeline.getOrigin(), material ? 0 : master.getOrigin());
    EXPECT_EQ(octetsOf(timeline.getSegment()->getDataDefinition()), tracks[i].dataDefinition);
    std::shared_ptr<const SourceClip> clip = componentOf<SourceClip>(*track);
    ASSERT_NE(clip, nullptr);
    EXPECT_EQ(octetsOf(clip->getDataDefinition()), tracks[i].dataDefinition);
    EXPECT_EQ(clip->getDuration(), duration);
    EXPECT_EQ(clip->getStartPosition(), 0);
    EXPECT_EQ(clip->getSourcePackageID(), material ? master.getFilePackageUID() : UMID());
    EXPECT_EQ(clip->getSourceTrackID(), material ? i + 2 : 0u);
  }
}

void expectDescriptiveTrack(const Track& track, std::uint32_t trackID, const ZeltaMasterMetadata& master) {
  ASSERT_EQ(typeid(track), typeid(StaticTrack));
  EXPECT_EQ(track.getTrackID(), trackID);
  std::shared_ptr<const DMSegment> segment = componentOf<DMSegment>(track);
  ASSERT_NE(segment, nullptr);
  EXPECT_EQ(octetsOf(segment->getDataDefinition()), descriptiveDefinition);
  auto framework = std::dynamic_pointer_cast<const TextBasedDMFramework>(segment->getDMFramework());
  ASSERT_NE(framework, nullptr);
  auto text = std::dynamic_pointer_cast<const UTF8TextBasedSet>(framework->getTextBasedObject());
  ASSERT_NE(text, nullptr);
  EXPECT_EQ(octetsOf(text->getTextBasedMetadataPayloadSchemeID()), payloadScheme);
  EXPECT_EQ(text->getTextMIMEMediaType(), L"text/xml");
  EXPECT_EQ(text->getTextLanguageCode(), L"");
  EXPECT_EQ(text->getUTF8TextData(), master.getDescriptiveText());
}

// Both packages: the timecode track, the essence tracks and, in the
// material package, the descriptive track.
void expectPackages(const Preface& preface, const ZeltaMasterMetadata& master, const std::vector<EssenceTrack>& tracks,
                    bool descriptive) {
  std::shared_ptr<const MaterialPackage> material = packageOf<MaterialPackage>(preface);
  std::shared_ptr<const SourcePackage> source = packageOf<SourcePackage>(preface);
  ASSERT_NE(material, nullptr);
  ASSERT_NE(source, nullptr);
  EXPECT_EQ(material->getPackageUID(), master.getMaterialPackageUID());
  EXPECT_EQ(material->getPackageCreationDate(), master.getCreationDate());
  EXPECT_EQ(material->getPackageModifiedDate(), master.getModificationDate());
  EXPECT_EQ(source->getPackageUID(), master.getFilePackageUID());
  EXPECT_EQ(source->getName(), L"clip");
  ASSERT_EQ(material->getTrackCount(), 1 + tracks.size() + (descriptive ? 1 : 0));
  ASSERT_EQ(source->getTrackCount(), 1 + tracks.size());
  // Origin 3, duration 250, start timecode 90000, and the newer model.
  expectTimecodeTrack(*material->getTrackAt(0), 0, 250, 90000, master.getEditRate());
  expectTimecodeTrack(*source->getTrackAt(0), 3, 253, 89997, master.getEditRate());
  expectEssenceTracks(*material, tracks, true, master, 250);
  expectEssenceTracks(*source, tracks, false, master, 253);
  if (descriptive)
    expectDescriptiveTrack(*material->getTrackAt(tracks.size() + 1), static_cast<std::uint32_t>(tracks.size() + 2),
                           master);
}

void expectFileDescriptor(const FileDescriptor& d, std::uint32_t trackID, const MXFRational& rate,
                          const Octets& container) {
  EXPECT_EQ(d.getLinkedTrackID(), trackID);
  EXPECT_EQ(d.getSampleRate(), rate);
  EXPECT_EQ(octetsOf(d.getEssenceContainer()), container);
}

void expectAES3Sounds(const std::vector<std::shared_ptr<const FileDescriptor>>& descriptors, std::size_t first,
                      std::size_t count, std::uint32_t bits, bool avc) {
  for (std::size_t i = 0; i < count; ++i) {
    SCOPED_TRACE(i);
    auto sound = std::dynamic_pointer_cast<const AES3AudioDescriptor>(descriptors.at(first + i));
    ASSERT_NE(sound, nullptr);
    expectFileDescriptor(*sound, static_cast<std::uint32_t>(3 + i), {48000, 1}, aes3Container);
    EXPECT_EQ(sound->getAudioSamplingRate(), (MXFRational{48000, 1}));
    EXPECT_TRUE(sound->getLocked());
    EXPECT_EQ(sound->getAudioReferenceLevel(), 0);
    EXPECT_EQ(sound->getChannelCount(), 1u);
    EXPECT_EQ(sound->getQuantizationBits(), bits);
    EXPECT_EQ(sound->getBlockAlign(), (bits + 7) / 8);
    EXPECT_EQ(sound->getAverageBytesPerSecond(), 48000 * ((bits + 7) / 8));
    EXPECT_EQ(sound->getChannelStatusDataMode(), ByteVector{1});
    ASSERT_EQ(sound->getFixedChannelStatusData().size(), 1u);
    EXPECT_EQ(sound->getFixedChannelStatusData()[0].octets[0], 0x85);
    EXPECT_EQ(sound->getFixedChannelStatusData()[0].octets[1], i);
    EXPECT_EQ(sound->hasSoundEssenceCompression(), avc);
    if (avc) {
      EXPECT_EQ(octetsOf(sound->getSoundEssenceCompression()),
                label(0x0A, {0x04, 0x02, 0x02, 0x01, 0x01, 0x00, 0x00, 0x00}));
    }
  }
}

// The fields that every computed picture descriptor holds, for a 1920 wide
// picture of 10 or 8 bits, 4:2:2.
void expectHDPicture(const CDCIPictureDescriptor& d, bool progressive, std::uint32_t depth) {
  const std::uint32_t height = progressive ? 1080 : 540;
  EXPECT_EQ(d.getSignalStandard(), 4);
  EXPECT_EQ(d.getFrameLayout(), progressive ? 0 : 1);
  EXPECT_EQ(d.getStoredWidth(), 1920u);
  EXPECT_EQ(d.getStoredHeight(), progressive ? 1088u : 544u);
  EXPECT_EQ(d.hasStoredF2Offset(), !progressive);
  EXPECT_EQ(d.getSampledWidth(), 1920u);
  EXPECT_EQ(d.getSampledHeight(), height);
  EXPECT_EQ(d.getSampledXOffset(), 0);
  EXPECT_EQ(d.getSampledYOffset(), 0);
  EXPECT_EQ(d.getDisplayWidth(), 1920u);
  EXPECT_EQ(d.getDisplayHeight(), height);
  EXPECT_EQ(d.getDisplayXOffset(), 0);
  EXPECT_EQ(d.getDisplayYOffset(), 0);
  EXPECT_EQ(d.hasDisplayF2Offset(), !progressive);
  EXPECT_EQ(d.getAspectRatio(), (MXFRational{16, 9}));
  EXPECT_EQ(d.getVideoLineMap(), (progressive ? std::vector<std::int32_t>{42, 0} : std::vector<std::int32_t>{21, 584}));
  EXPECT_EQ(octetsOf(d.getCaptureGamma()), gammaBT709);
  EXPECT_EQ(d.getImageAlignmentOffset(), 0u);
  EXPECT_EQ(d.getImageStartOffset(), 0u);
  EXPECT_EQ(d.getImageEndOffset(), 0u);
  EXPECT_EQ(d.hasFieldDominance(), !progressive);
  EXPECT_EQ(d.getComponentDepth(), depth);
  EXPECT_EQ(d.getHorizontalSubsampling(), 2u);
  EXPECT_EQ(d.getVerticalSubsampling(), 1u);
  EXPECT_EQ(d.getColourSiting(), 0);
  EXPECT_FALSE(d.getReversedByteOrder());
  EXPECT_EQ(d.getPaddingBits(), 0);
  EXPECT_EQ(d.getBlackReferenceLevel(), 16u << (depth - 8));
  EXPECT_EQ(d.getWhiteReferenceLevel(), 235u << (depth - 8));
  EXPECT_EQ(d.getColourRange(), (224u << (depth - 8)) + 1);
}

TEST(ModelTree, D10With625LinesAndFourChannels) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::D10, {25, 1}, true, false));
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  // 50 Mbit/s, 625 lines: kind 01, frame wrapped.
  const Octets container = label(0x01, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x01, 0x01, 0x01});
  expectPreface(*preface, *master, {container}, true);
  expectPackages(*preface, *master, {{0x05010100, pictureDefinition}, {0x06011000, soundDefinition}}, true);
  auto multiple =
      std::dynamic_pointer_cast<const MultipleDescriptor>(packageOf<SourcePackage>(*preface)->getDescriptor());
  ASSERT_NE(multiple, nullptr);
  EXPECT_EQ(multiple->getSampleRate(), (MXFRational{25, 1}));
  EXPECT_EQ(octetsOf(multiple->getEssenceContainer()), container);
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 2u);
  auto picture = std::dynamic_pointer_cast<const CDCIPictureDescriptor>(descriptors[0]);
  ASSERT_NE(picture, nullptr);
  expectFileDescriptor(*picture, 2, {25, 1}, container);
  EXPECT_EQ(picture->getStoredWidth(), 720u);
  EXPECT_EQ(picture->getStoredHeight(), 304u);
  EXPECT_EQ(picture->getDisplayHeight(), 288u);
  EXPECT_EQ(picture->getDisplayYOffset(), 16);
  EXPECT_EQ(picture->getAspectRatio(), (MXFRational{16, 9}));
  EXPECT_EQ(picture->getSignalStandard(), 1);
  EXPECT_EQ(picture->getFrameLayout(), 1);
  EXPECT_EQ(picture->getVideoLineMap(), (std::vector<std::int32_t>{7, 320}));
  EXPECT_EQ(picture->getComponentDepth(), 8u);
  EXPECT_EQ(picture->getHorizontalSubsampling(), 2u);
  EXPECT_EQ(picture->getVerticalSubsampling(), 1u);
  EXPECT_EQ(picture->getColourSiting(), 0);
  EXPECT_EQ(octetsOf(picture->getPictureEssenceCoding()),
            label(0x01, {0x04, 0x01, 0x02, 0x02, 0x01, 0x02, 0x01, 0x01}));
  auto sound = std::dynamic_pointer_cast<const SoundDescriptor>(descriptors[1]);
  ASSERT_NE(sound, nullptr);
  EXPECT_EQ(typeid(*sound), typeid(SoundDescriptor));
  expectFileDescriptor(*sound, 3, {48000, 1}, aes3Container);
  EXPECT_EQ(sound->getAudioSamplingRate(), (MXFRational{48000, 1}));
  EXPECT_TRUE(sound->getLocked());
  EXPECT_EQ(sound->getAudioReferenceLevel(), 0);
  EXPECT_EQ(sound->getChannelCount(), 4u);
  EXPECT_EQ(sound->getQuantizationBits(), 24u);
}

TEST(ModelTree, DVWith525LinesTwoChannelsAndItsDataTrack) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::DV, {30000, 1001}, true, false));
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  const Octets container = label(0x01, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x02, 0x01, 0x01});
  // The data track rides in the DV container: no label of its own.
  expectPreface(*preface, *master, {container, aes3Container, multipleContainer}, true);
  // The data track is numbered as a third sound track of three.
  expectPackages(*preface, *master,
                 {{0x18010100, pictureDefinition},
                  {0x16020300, soundDefinition},
                  {0x16020301, soundDefinition},
                  {0x16020302, dataDefinition}},
                 true);
  EXPECT_TRUE(componentOf<TimecodeComponent>(*packageOf<MaterialPackage>(*preface)->getTrackAt(0))->getDropFrame());
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 4u);
  auto picture = std::dynamic_pointer_cast<const CDCIPictureDescriptor>(descriptors[0]);
  ASSERT_NE(picture, nullptr);
  expectFileDescriptor(*picture, 2, {30000, 1001}, container);
  EXPECT_EQ(picture->getStoredHeight(), 240u);
  EXPECT_EQ(picture->getHorizontalSubsampling(), 4u);
  EXPECT_EQ(picture->getVideoLineMap(), (std::vector<std::int32_t>{23, 285}));
  expectAES3Sounds(descriptors, 1, 2, 16, false);
  auto data = std::dynamic_pointer_cast<const ANCDataDescriptor>(descriptors[3]);
  ASSERT_NE(data, nullptr);
  expectFileDescriptor(*data, 5, {30000, 1001}, ancContainer);
}

TEST(ModelTree, MPEGLongGOPWithSoundAndAncillaryData) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {25, 1}, true, true));
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  const Octets container = label(0x02, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x04, 0x60, 0x01});
  expectPreface(*preface, *master, {container, aes3Container, ancContainer, multipleContainer}, true);
  expectPackages(*preface, *master,
                 {{0x15010500, pictureDefinition},
                  {0x16040300, soundDefinition},
                  {0x16040301, soundDefinition},
                  {0x16040302, soundDefinition},
                  {0x16040303, soundDefinition},
                  {0x17010201, dataDefinition}},
                 true);
  auto multiple =
      std::dynamic_pointer_cast<const MultipleDescriptor>(packageOf<SourcePackage>(*preface)->getDescriptor());
  ASSERT_NE(multiple, nullptr);
  EXPECT_EQ(octetsOf(multiple->getEssenceContainer()), multipleContainer);
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 6u);
  auto picture = std::dynamic_pointer_cast<const MPEGVideoDescriptor>(descriptors[0]);
  ASSERT_NE(picture, nullptr);
  expectFileDescriptor(*picture, 2, {25, 1}, container);
  expectHDPicture(*picture, false, 8);
  // 422P@HL
  EXPECT_EQ(octetsOf(picture->getPictureEssenceCoding()),
            label(0x03, {0x04, 0x01, 0x02, 0x02, 0x01, 0x04, 0x03, 0x00}));
  EXPECT_TRUE(picture->getSingleSequence());
  EXPECT_FALSE(picture->getConstantBFrames());
  EXPECT_EQ(picture->getCodedContentType(), 2);
  EXPECT_FALSE(picture->getLowDelay());
  EXPECT_TRUE(picture->getClosedGOP());
  EXPECT_TRUE(picture->getIdenticalGOP());
  EXPECT_EQ(picture->getMaxGOP(), 12);
  EXPECT_EQ(picture->getBPictureCount(), 2);
  EXPECT_EQ(picture->getBitRate(), 50000000u);
  EXPECT_EQ(picture->getProfileAndLevel(), 130);
  EXPECT_FALSE(picture->hasContainerDuration());
  expectAES3Sounds(descriptors, 1, 4, 24, false);
  expectFileDescriptor(*descriptors[5], 7, {25, 1}, ancContainer);
}

TEST(ModelTree, MPEGStudioOfTheNewerModel) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG, {50, 1}, false, false, PictureKind::studio));
  master->profileAndLevel = 0;
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 1u);
  auto picture = std::dynamic_pointer_cast<const CDCIPictureDescriptor>(descriptors[0]);
  ASSERT_NE(picture, nullptr);
  EXPECT_EQ(typeid(*picture), typeid(CDCIPictureDescriptor));
  expectHDPicture(*picture, true, 10);
  // 1920x1080 4:2:2 at 50 frames passes the sample rate limit of level 226
  // and 227, not of 228.
  EXPECT_EQ(octetsOf(picture->getPictureEssenceCoding()),
            label(0x03, {0x04, 0x01, 0x02, 0x02, 0x01, 0x20, 0x10, 0x04}));
  ASSERT_EQ(picture->getGenericSubDescriptorCount(), 2u);
  auto mpeg4 = std::dynamic_pointer_cast<const MPEG4VideoSubDescriptor>(picture->getGenericSubDescriptorAt(1));
  ASSERT_NE(mpeg4, nullptr);
  EXPECT_EQ(mpeg4->getProfileAndLevel(), 228);
  EXPECT_EQ(mpeg4->getBitRate(), 440000000u);
  EXPECT_EQ(mpeg4->getMaxGOV(), 1);
  EXPECT_EQ(mpeg4->getBVOPCount(), 2);
  EXPECT_EQ(mpeg4->getCodedContentType(), 1);
  EXPECT_TRUE(mpeg4->getClosedGOV());
}

TEST(ModelTree, ProxyWithItsFourStereoTracks) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::Proxy, {25, 1}, true, false));
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  const Octets container = label(0x02, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x04, 0x61, 0x07});
  const Octets soundContainer = label(0x03, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x0A, 0x03, 0x00});
  EXPECT_EQ(octetsOf(preface->getOperationalPattern()), label(0x01, {0x0E, 0x06, 0x02, 0x01, 0x40, 0x01, 0x09, 0x00}));
  EXPECT_EQ(octetsOf(preface->getEssenceContainers()),
            (std::vector<Octets>{container, soundContainer, multipleContainer}));
  auto material = packageOf<MaterialPackage>(*preface);
  auto source = packageOf<SourcePackage>(*preface);
  ASSERT_EQ(source->getTrackCount(), 6u);
  EXPECT_EQ(source->getTrackAt(1)->getTrackNumber(), 0x15010700u);
  for (std::uint32_t i = 0; i < 4; ++i) EXPECT_EQ(source->getTrackAt(2 + i)->getTrackNumber(), 0x16040A00u + i);
  EXPECT_EQ(material->getTrackCount(), 7u);
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 5u);
  auto picture = std::dynamic_pointer_cast<const CDCIPictureDescriptor>(descriptors[0]);
  ASSERT_NE(picture, nullptr);
  expectFileDescriptor(*picture, 2, {25, 1}, container);
  EXPECT_EQ(picture->getFrameLayout(), 1);
  EXPECT_EQ(picture->getStoredWidth(), 352u);
  EXPECT_EQ(picture->getStoredHeight(), 288u);
  EXPECT_EQ(picture->getVideoLineMap(), (std::vector<std::int32_t>{23, 336}));
  EXPECT_EQ(octetsOf(picture->getPictureEssenceCoding()),
            label(0x03, {0x04, 0x01, 0x02, 0x02, 0x01, 0x20, 0x02, 0x04}));
  EXPECT_EQ(picture->getComponentDepth(), 8u);
  EXPECT_EQ(picture->getHorizontalSubsampling(), 2u);
  const KLVKey infoKey(label(0x01, {0x0E, 0x06, 0x06, 0x02, 0x02, 0x01, 0x00, 0x00}));
  EXPECT_EQ(picture->getDarkProperty(infoKey), (ByteVector{0x00, 0x00, 0x01, 0x04, 0x00, 0x00, 0x01, 0x20, 0x05, 0x10,
                                                           0x40, 0x06, 0x68, 0x58, 0x21, 0x20, 0xA3, 0x1F}));
  for (std::size_t i = 1; i <= 4; ++i) {
    auto sound = std::dynamic_pointer_cast<const SoundDescriptor>(descriptors[i]);
    ASSERT_NE(sound, nullptr);
    expectFileDescriptor(*sound, static_cast<std::uint32_t>(2 + i), {8000, 1}, soundContainer);
    EXPECT_EQ(sound->getChannelCount(), 2u);
    EXPECT_EQ(sound->getQuantizationBits(), 8u);
    EXPECT_EQ(octetsOf(sound->getSoundEssenceCompression()),
              label(0x03, {0x04, 0x02, 0x02, 0x02, 0x03, 0x01, 0x01, 0x00}));
  }
}

TEST(ModelTree, RawOfTheDefaultSizeAndCode) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::Raw, {24, 1}, false, true));
  master->displaySize = {0, 0};
  master->profileAndLevel = 0;
  master->aspectRatio = {0, 0};
  master->videoLineMap = {0, 0};
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  const Octets container = label(0x06, {0x0E, 0x06, 0x0D, 0x03, 0x02, 0x01, 0x01, 0x00});
  expectPreface(*preface, *master, {container, ancContainer, multipleContainer}, true);
  expectPackages(*preface, *master, {{0x15017F00, pictureDefinition}, {0x17010201, dataDefinition}}, true);
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 2u);
  ASSERT_EQ(typeid(*descriptors[0]), typeid(PictureDescriptor));
  auto picture = std::dynamic_pointer_cast<const PictureDescriptor>(descriptors[0]);
  expectFileDescriptor(*picture, 2, {24, 1}, container);
  EXPECT_EQ(picture->getFrameLayout(), 0);
  // Code 801 stores 4096x2160 in 4160x2204.
  EXPECT_EQ(picture->getStoredWidth(), 4160u);
  EXPECT_EQ(picture->getStoredHeight(), 2204u);
  EXPECT_EQ(picture->getSampledWidth(), 4160u);
  EXPECT_EQ(picture->getSampledHeight(), 2204u);
  EXPECT_EQ(picture->getDisplayWidth(), 4096u);
  EXPECT_EQ(picture->getDisplayHeight(), 2160u);
  EXPECT_EQ(picture->getDisplayXOffset(), 32);
  EXPECT_EQ(picture->getDisplayYOffset(), 22);
  EXPECT_EQ(picture->getVideoLineMap(), (std::vector<std::int32_t>{42, 0}));
  EXPECT_EQ(picture->getAspectRatio(), (MXFRational{256, 135}));
  EXPECT_EQ(octetsOf(picture->getPictureEssenceCoding()),
            label(0x06, {0x0E, 0x06, 0x04, 0x01, 0x02, 0x03, 0x02, 0x01}));
}

TEST(ModelTree, AVCOfTheFullSize) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::AVC, {25, 1}, true, false, PictureKind::fullSize));
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  const Octets container = label(0x0A, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x10, 0x60, 0x01});
  expectPreface(*preface, *master, {container, aes3Container, multipleContainer}, true);
  expectPackages(*preface, *master,
                 {{0x15010500, pictureDefinition},
                  {0x16040300, soundDefinition},
                  {0x16040301, soundDefinition},
                  {0x16040302, soundDefinition},
                  {0x16040303, soundDefinition}},
                 true);
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 5u);
  auto picture = std::dynamic_pointer_cast<const MPEGVideoDescriptor>(descriptors[0]);
  ASSERT_NE(picture, nullptr);
  expectFileDescriptor(*picture, 2, {25, 1}, container);
  expectHDPicture(*picture, false, 10);
  EXPECT_EQ(picture->getContainerDuration(), 253);
  EXPECT_FALSE(picture->hasBitRate());
  EXPECT_FALSE(picture->hasProfileAndLevel());
  EXPECT_EQ(picture->getGenericSubDescriptorCount(), 0u);
  // High 4:2:2 intra at 100 Mbit/s, fields of 540 lines at 25/1: class 32 31 02.
  EXPECT_EQ(octetsOf(picture->getPictureEssenceCoding()),
            label(0x0A, {0x04, 0x01, 0x02, 0x02, 0x01, 0x32, 0x31, 0x02}));
  expectAES3Sounds(descriptors, 1, 4, 24, true);
}

TEST(ModelTree, AVCOfAReducedSize) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::AVC, {50, 1}, false, false, PictureKind::reduced));
  std::shared_ptr<Preface> preface = createZeltaMetadataModel(master);
  const Octets container = label(0x0A, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x10, 0x60, 0x01});
  expectPreface(*preface, *master, {container}, false);
  expectPackages(*preface, *master, {{0x15010500, pictureDefinition}}, false);
  const auto descriptors = fileDescriptorsOf(*preface);
  ASSERT_EQ(descriptors.size(), 1u);
  ASSERT_EQ(typeid(*descriptors[0]), typeid(CDCIPictureDescriptor));
  auto picture = std::dynamic_pointer_cast<const CDCIPictureDescriptor>(descriptors[0]);
  expectFileDescriptor(*picture, 2, {50, 1}, container);
  EXPECT_EQ(picture->getStoredWidth(), 1280u);
  EXPECT_EQ(picture->getStoredHeight(), 720u);
  EXPECT_EQ(picture->getSignalStandard(), 5);
  EXPECT_EQ(picture->getVideoLineMap(), (std::vector<std::int32_t>{26, 0}));
  EXPECT_EQ(picture->getContainerDuration(), 253);
  // High 10, not intra.
  EXPECT_EQ(octetsOf(picture->getPictureEssenceCoding()),
            label(0x0D, {0x04, 0x01, 0x02, 0x02, 0x01, 0x31, 0x50, 0x01}));
  ASSERT_EQ(picture->getGenericSubDescriptorCount(), 2u);
  EXPECT_EQ(typeid(*picture->getGenericSubDescriptorAt(0)), typeid(ContainerConstraintsSubDescriptor));
  auto avc = std::dynamic_pointer_cast<const AVCVideoSubDescriptor>(picture->getGenericSubDescriptorAt(1));
  ASSERT_NE(avc, nullptr);
  EXPECT_FALSE(avc->getConstantBPicture());
  EXPECT_EQ(avc->getCodedContentKind(), 1);
  EXPECT_TRUE(avc->getClosedGOP());
  EXPECT_FALSE(avc->getIdenticalGOP());
  EXPECT_EQ(avc->getMaxGOP(), 15);
  EXPECT_EQ(avc->getBPictureCount(), 2);
  EXPECT_EQ(avc->getMaximumBitRate(), 35000000u);
  EXPECT_EQ(avc->getProfile(), 110);
  EXPECT_EQ(avc->getProfileConstraint(), 0);
  EXPECT_EQ(avc->getLevel(), 40);
  EXPECT_EQ(avc->getDecodingDelay(), 1);
  EXPECT_EQ(avc->getMaximumRefFrames(), 2);
  EXPECT_EQ(avc->getSequenceParameterSetFlag(), 24);
  EXPECT_EQ(avc->getPictureParameterSetFlag(), 24);
}

}  // namespace
