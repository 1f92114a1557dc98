// Master extraction: the builder's inverse over its whole domain, the
// edge cases, and every condition broken in one place of a built model.
#include <gtest/gtest.h>

#include <chrono>
#include <ctime>
#include <memory>
#include <string>
#include <vector>

#include "core/failure.h"
#include "kit.h"
#include "support/kit_masters.h"
#include "support/kit_masters_compare.h"
#include "support/kit_models.h"

using zelta_test::componentOf;
using zelta_test::describe;
using zelta_test::failureOf;
using zelta_test::fileDescriptorsOf;
using zelta_test::masterDifferences;
using zelta_test::masterDomain;
using zelta_test::masterOf;
using zelta_test::MasterShape;
using zelta_test::PictureKind;

namespace {

MasterShape shapeOf(ZeltaEssenceFormat format, bool sound = true, PictureKind picture = PictureKind::plain) {
  MasterShape shape;
  shape.format = format;
  shape.editRate = {25, 1};
  shape.version = 0x0103;
  shape.sound = sound;
  shape.picture = picture;
  return shape;
}

std::shared_ptr<Preface> modelOf(ZeltaEssenceFormat format, bool sound = true,
                                 PictureKind picture = PictureKind::plain) {
  return createZeltaMetadataModel(masterOf(shapeOf(format, sound, picture)));
}

std::string extractionFailure(const std::shared_ptr<const Preface>& preface) {
  return failureOf([&] { createZeltaMasterMetadata(preface); });
}

std::shared_ptr<ContentStorage> storageOf(Preface& preface) { return preface.getContentStorage(); }

template <typename Package>
std::shared_ptr<Package> packageOf(Preface& preface) {
  return std::const_pointer_cast<Package>(zelta_test::packageOf<Package>(preface));
}

std::shared_ptr<Sequence> sequenceOf(Track& track) { return std::dynamic_pointer_cast<Sequence>(track.getSegment()); }

std::shared_ptr<MultipleDescriptor> multipleOf(Preface& preface) {
  return std::dynamic_pointer_cast<MultipleDescriptor>(packageOf<SourcePackage>(preface)->getDescriptor());
}

std::shared_ptr<FileDescriptor> descriptorAt(Preface& preface, std::size_t index) {
  return multipleOf(preface)->getSubDescriptorAt(index);
}

// ---------------------------------------------------------------------------
// The inverse of the builder

TEST(MasterExtraction, GivesBackEveryValueOfEveryMasterOfTheBuildersDomain) {
  for (const MasterShape& shape : masterDomain()) {
    SCOPED_TRACE(describe(shape));
    const std::shared_ptr<ZeltaDefaultMetadata> master = masterOf(shape);
    std::shared_ptr<ZeltaMasterMetadata> extracted;
    ASSERT_NO_THROW(extracted = createZeltaMasterMetadata(createZeltaMetadataModel(master)));
    EXPECT_EQ(masterDifferences(*master, *extracted), std::vector<std::string>{});
  }
}

TEST(MasterExtraction, DatesThatWereZeroReturnAsTheTimeOfBuilding) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::MPEG));
  master->creationDate = MXFTimestamp();
  master->modificationDate = MXFTimestamp();
  const std::time_t before = std::time(nullptr);
  std::shared_ptr<ZeltaMasterMetadata> extracted = createZeltaMasterMetadata(createZeltaMetadataModel(master));
  const std::time_t after = std::time(nullptr);
  for (const MXFTimestamp& date : {extracted->getCreationDate(), extracted->getModificationDate()}) {
    std::tm parts{};
    parts.tm_year = date.year - 1900;
    parts.tm_mon = date.month - 1;
    parts.tm_mday = date.day;
    parts.tm_hour = date.hour;
    parts.tm_min = date.minute;
    parts.tm_sec = date.second;
    const std::time_t when = timegm(&parts);
    EXPECT_GE(when, before);
    EXPECT_LE(when, after);
  }
  // Everything else is the master's.
  std::vector<std::string> differences = masterDifferences(*master, *extracted);
  ASSERT_EQ(differences.size(), 2u);
  EXPECT_EQ(differences[0].substr(0, 13), "creationDate:");
  EXPECT_EQ(differences[1].substr(0, 17), "modificationDate:");
}

// ---------------------------------------------------------------------------
// Edge cases

TEST(MasterExtraction, TwoIdentificationsGiveTheLast) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
  auto later = Identification::create();
  later->setCompanyName(L"later company");
  later->setProductName(L"later product");
  later->setVersionString(L"9");
  preface->addIdentification(later);
  const ZeltaIdentification identification = createZeltaMasterMetadata(preface)->getIdentification();
  EXPECT_EQ(identification.companyName, L"later company");
  EXPECT_EQ(identification.productName, L"later product");
  EXPECT_EQ(identification.versionString, L"9");
  EXPECT_EQ(identification.productVersion, MXFProductVersion());
}

TEST(MasterExtraction, WithoutEssenceContainerDataTheStreamIdentifiersStayZeroAndTheFirstSourcePackageIsTaken) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
  std::shared_ptr<ContentStorage> storage = storageOf(*preface);
  storage->removeEssenceContainerData();
  ASSERT_FALSE(storage->hasEssenceContainerData());
  auto second = SourcePackage::create();
  second->setPackageUID(UMID::createNew(0x0F));
  storage->addPackage(second);
  std::shared_ptr<ZeltaMasterMetadata> extracted = createZeltaMasterMetadata(preface);
  EXPECT_EQ(extracted->getIndexSID(), 0u);
  EXPECT_EQ(extracted->getBodySID(), 0u);
  EXPECT_EQ(extracted->getFilePackageUID(), packageOf<SourcePackage>(*preface)->getPackageUID());
  EXPECT_EQ(extracted->getPackageName(), L"clip");
}

TEST(MasterExtraction, TheSourcePackageIsTheOneThatTheEssenceContainerDataNames) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
  std::shared_ptr<ContentStorage> storage = storageOf(*preface);
  auto first = SourcePackage::create();
  first->setPackageUID(UMID::createNew(0x0F));
  first->setName(L"other");
  storage->insertPackageAt(0, first);
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getPackageName(), L"clip");
}

TEST(MasterExtraction, DurationOfAllOnesYieldsAllOnes) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::D10));
  master->duration = ZeltaUnknownDuration;
  EXPECT_EQ(createZeltaMasterMetadata(createZeltaMetadataModel(master))->getDuration(), ZeltaUnknownDuration);
}

TEST(MasterExtraction, MissingDisplayWidthTakesTheSampledWidth) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
  auto picture = std::dynamic_pointer_cast<PictureDescriptor>(descriptorAt(*preface, 0));
  picture->removeDisplayWidth();
  picture->setSampledWidth(1440);
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getDisplaySize(), ZeltaSize(1440, 540));
  picture->removeSampledWidth();
  picture->removeDisplayHeight();
  picture->removeSampledHeight();
  // Stored last: 1920 wide, 544 lines a field.
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getDisplaySize(), ZeltaSize(1920, 544));
}

TEST(MasterExtraction, UTF16TextOfTheKitsSchemeIsConvertedToUTF8) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
  auto material = packageOf<MaterialPackage>(*preface);
  auto segment =
      std::const_pointer_cast<DMSegment>(componentOf<DMSegment>(*material->getTrackAt(material->getTrackCount() - 1)));
  auto framework = std::dynamic_pointer_cast<TextBasedDMFramework>(segment->getDMFramework());
  auto text = UTF16TextBasedSet::create();
  text->setTextBasedMetadataPayloadSchemeID(std::dynamic_pointer_cast<UTF8TextBasedSet>(framework->getTextBasedObject())
                                                ->getTextBasedMetadataPayloadSchemeID());
  text->setUTF16TextData(L"<clip name=\"caf\u00e9 \U0001F3AC\"/>");
  framework->setTextBasedObject(text);
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getDescriptiveText(), "<clip name=\"caf\xC3\xA9 \xF0\x9F\x8E\xAC\"/>");
  // Another scheme's text is not the kit's.
  text->setTextBasedMetadataPayloadSchemeID(KLVKey());
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getDescriptiveText(), "");
}

TEST(MasterExtraction, AncillaryDescriptorSetsAncillaryData) {
  auto master = masterOf(shapeOf(ZeltaEssenceFormat::Raw, false));
  master->ancillaryData = true;
  EXPECT_TRUE(createZeltaMasterMetadata(createZeltaMetadataModel(master))->hasAncillaryData());
}

TEST(MasterExtraction, ModelWithoutDescriptorEndsAfterTheSourcePackage) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
  packageOf<SourcePackage>(*preface)->setDescriptor(nullptr);
  std::shared_ptr<ZeltaMasterMetadata> extracted = createZeltaMasterMetadata(preface);
  EXPECT_EQ(extracted->getEssenceFormat(), ZeltaNoEssenceFormat);
  EXPECT_EQ(extracted->getOrigin(), 3);
  EXPECT_EQ(extracted->getDuration(), 250u);
}

// ---------------------------------------------------------------------------
// Every condition, each broken in one place

TEST(MasterExtractionFailures, TheStructure) {
  EXPECT_EQ(extractionFailure(nullptr), "assertion failure: model starts with Preface");
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    preface->removeIdentificationAt(0);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has Identifications");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    preface->addIdentification(nullptr);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has an Identification");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    preface->setContentStorage(nullptr);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has a ContentStorage");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    storageOf(*preface)->removeEssenceContainerDataAt(0);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has valid EssenceContainerData");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    storageOf(*preface)->removePackageAt(0);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has a MaterialPackage");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    storageOf(*preface)->getEssenceContainerDataAt(0)->setLinkedPackageUID(UMID::createNew(0x0F));
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has a SourcePackage");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    auto source = packageOf<SourcePackage>(*preface);
    while (source->getTrackCount() > 0) source->removeTrackAt(0);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: SourcePackage has a TimelineTrack");
  }
}

TEST(MasterExtractionFailures, TheTimecodeTrack) {
  auto broken = [](auto breakIt) {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    breakIt(*packageOf<MaterialPackage>(*preface)->getTrackAt(0));
    return extractionFailure(preface);
  };
  EXPECT_EQ(broken([](Track& t) { t.setSegment(nullptr); }), "assertion failure: TimelineTrack has Segment");
  EXPECT_EQ(broken([](Track& t) { t.getSegment()->removeDuration(); }),
            "assertion failure: TIMECODE Track Segment has duration");
  EXPECT_EQ(broken([](Track& t) {
              auto timecode = TimecodeComponent::create();
              timecode->setDataDefinition(t.getSegment()->getDataDefinition());
              timecode->setDuration(250);
              t.setSegment(timecode);
            }),
            "assertion failure: TIMECODE Track Segment is a Sequence");
  EXPECT_EQ(broken([](Track& t) { sequenceOf(t)->addComponent(TimecodeComponent::create()); }),
            "assertion failure: TIMECODE Track Sequence has 1 Component");
  EXPECT_EQ(broken([](Track& t) {
              auto clip = SourceClip::create();
              sequenceOf(t)->removeComponentAt(0);
              sequenceOf(t)->addComponent(clip);
            }),
            "assertion failure: TIMECODE Track has a TimecodeComponent");
  EXPECT_EQ(broken([](Track& t) { t.getSegment()->setDataDefinition(KLVKey()); }),
            "assertion failure: MaterialPackage has a TIMECODE Track");
}

TEST(MasterExtractionFailures, TheDescriptiveTrack) {
  auto broken = [](auto breakIt) {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    auto material = packageOf<MaterialPackage>(*preface);
    breakIt(*material->getTrackAt(material->getTrackCount() - 1));
    return extractionFailure(preface);
  };
  EXPECT_EQ(broken([](Track& t) { t.setSegment(nullptr); }), "assertion failure: StaticTrack has Segment");
  EXPECT_EQ(broken([](Track& t) {
              auto segment = DMSegment::create();
              segment->setDataDefinition(t.getSegment()->getDataDefinition());
              t.setSegment(segment);
            }),
            "assertion failure: Descriptive Metadata Track Segment is a Sequence");
  EXPECT_EQ(broken([](Track& t) { sequenceOf(t)->addComponent(DMSegment::create()); }),
            "assertion failure: Descriptive Metadata Track Sequence has 1 Component");
  EXPECT_EQ(broken([](Track& t) {
              sequenceOf(t)->removeComponentAt(0);
              sequenceOf(t)->addComponent(SourceClip::create());
            }),
            "assertion failure: Descriptive Metadata Track has a DMSegment");
  EXPECT_EQ(broken([](Track& t) {
              std::dynamic_pointer_cast<DMSegment>(sequenceOf(t)->getComponentAt(0))
                  ->setDMFramework(DescriptiveMetadataFramework::create());
            }),
            "assertion failure: MaterialPackage has a Descriptive Metadata Track");
}

TEST(MasterExtractionFailures, ThePicture) {
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    multipleOf(*preface)->removeSubDescriptorAt(0);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has a PictureDescriptor");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    descriptorAt(*preface, 0)->setEssenceContainer(KLVKey());
    EXPECT_EQ(extractionFailure(preface), "assertion failure: recognized essence container");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    auto plain = PictureDescriptor::create();
    plain->setEssenceContainer(descriptorAt(*preface, 0)->getEssenceContainer());
    multipleOf(*preface)->removeSubDescriptorAt(0);
    multipleOf(*preface)->insertSubDescriptorAt(0, plain);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: model has appropriate PictureDescriptor");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::Proxy);
    descriptorAt(*preface, 0)
        ->removeDarkProperty(KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01, 0x0E,
                                                                 0x06, 0x06, 0x02, 0x02, 0x01, 0x00, 0x00}));
    EXPECT_EQ(extractionFailure(preface), "assertion failure: PictureDescriptor has decoderSpecificInfo");
  }
  for (ZeltaEssenceFormat format : {ZeltaEssenceFormat::MPEG, ZeltaEssenceFormat::Raw}) {
    std::shared_ptr<Preface> preface = modelOf(format);
    std::dynamic_pointer_cast<PictureDescriptor>(descriptorAt(*preface, 0))->removePictureEssenceCoding();
    EXPECT_EQ(extractionFailure(preface), "assertion failure: PictureDescriptor has pictureEssenceCoding");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::Raw);
    std::dynamic_pointer_cast<PictureDescriptor>(descriptorAt(*preface, 0))->setPictureEssenceCoding(KLVKey());
    EXPECT_EQ(extractionFailure(preface), "assertion failure: recognized profileAndLevel");
  }
  {
    // A studio picture of the newer model: a CDCI descriptor whose MPEG-4
    // sub-descriptor is gone.
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG, false, PictureKind::studio);
    auto picture = std::dynamic_pointer_cast<PictureDescriptor>(packageOf<SourcePackage>(*preface)->getDescriptor());
    picture->removeGenericSubDescriptorAt(1);
    EXPECT_EQ(extractionFailure(preface),
              "assertion failure: model has a MPEGVideoDescriptor or a MPEG4VideoSubDescriptor");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::AVC, false, PictureKind::reduced);
    auto picture = std::dynamic_pointer_cast<PictureDescriptor>(packageOf<SourcePackage>(*preface)->getDescriptor());
    picture->removeGenericSubDescriptorAt(1);
    EXPECT_EQ(extractionFailure(preface),
              "assertion failure: model has a MPEGVideoDescriptor or a AVCVideoSubDescriptor");
  }
  {
    // DV kind 0x3F is a DV-based kind of no defined bit rate.
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::DV);
    KLVKey container = descriptorAt(*preface, 0)->getEssenceContainer();
    container[14] = 0x3F;
    descriptorAt(*preface, 0)->setEssenceContainer(container);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: defined DV bit rate");
  }
}

TEST(MasterExtractionFailures, TheSound) {
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::D10);
    auto second = SoundDescriptor::create();
    multipleOf(*preface)->addSubDescriptor(second);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: SoundDescriptor not already found");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    std::dynamic_pointer_cast<SoundDescriptor>(descriptorAt(*preface, 2))->setChannelCount(2);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: AES3AudioDescriptor has 1 channel");
  }
  {
    // A wave descriptor is no AES3 descriptor, whatever its channels.
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    auto wave = WaveAudioDescriptor::create();
    wave->setChannelCount(1);
    multipleOf(*preface)->addSubDescriptor(wave);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: AES3AudioDescriptor has 1 channel");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    std::dynamic_pointer_cast<SoundDescriptor>(descriptorAt(*preface, 3))->setQuantizationBits(16);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: SoundDescriptor has consistent quantizationBits");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
    auto sound = std::dynamic_pointer_cast<AES3AudioDescriptor>(descriptorAt(*preface, 1));
    sound->setFixedChannelStatusData({AES3ChannelStatusData(), AES3ChannelStatusData()});
    EXPECT_EQ(extractionFailure(preface),
              "assertion failure: AES3AudioDescriptor has consistent fixedChannelStatusData");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::Proxy);
    std::dynamic_pointer_cast<SoundDescriptor>(descriptorAt(*preface, 1))->setChannelCount(1);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: SoundDescriptor has 2 channels");
  }
  {
    std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::Proxy);
    std::dynamic_pointer_cast<SoundDescriptor>(descriptorAt(*preface, 4))->setQuantizationBits(16);
    EXPECT_EQ(extractionFailure(preface), "assertion failure: SoundDescriptor has consistent quantizationBits");
  }
}

TEST(MasterExtraction, AES3DescriptorWithoutChannelStatusGivesTheDefault) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG);
  std::dynamic_pointer_cast<AES3AudioDescriptor>(descriptorAt(*preface, 1))->removeFixedChannelStatusData();
  ZeltaChannelStatus expected{};
  expected[0] = 1;
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getFixedChannelStatusData(0), expected);
}

TEST(MasterExtraction, RGBADepthFromTheHighestCodeValueWhenTheLayoutDoesNotSayIt) {
  std::shared_ptr<Preface> preface = modelOf(ZeltaEssenceFormat::MPEG, false, PictureKind::studioRGB);
  auto picture = std::dynamic_pointer_cast<RGBAPictureDescriptor>(packageOf<SourcePackage>(*preface)->getDescriptor());
  ASSERT_NE(picture, nullptr);
  RGBALayout layout = picture->getPixelLayout();
  layout.components[2].depth = 8;
  picture->setPixelLayout(layout);
  picture->setComponentMaxReferenceLevel(3760);
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getComponentDepth(), 12u);
  picture->setComponentMaxReferenceLevel(1023);
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getComponentDepth(), 10u);
  picture->setComponentMaxReferenceLevel(255);
  EXPECT_EQ(createZeltaMasterMetadata(preface)->getComponentDepth(), 0u);
  // Wide range component codes.
  layout.components = {};
  layout.components[0] = {217, 12};
  layout.components[1] = {218, 12};
  layout.components[2] = {216, 12};
  picture->setPixelLayout(layout);
  std::shared_ptr<ZeltaMasterMetadata> wide = createZeltaMasterMetadata(preface);
  EXPECT_TRUE(wide->isWideRangeRGB());
  EXPECT_FALSE(wide->isRGB());
  EXPECT_EQ(wide->getComponentDepth(), 12u);
}

}  // namespace
