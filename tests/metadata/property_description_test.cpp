// The names and kinds of the properties that a class factory describes,
// beside its set primer.

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "metadata.h"
#include "metadata/property_table.h"
#include "support/recording.h"

namespace {

using zelta_test::keyOf;

// The description under the key, with the check that there is one.
MXFPropertyDescription describedAs(const MetadataRootFactory& factory, const std::string& key) {
  const MXFPropertyDescriptions& descriptions = factory.getPropertyDescriptions();
  const MXFPropertyDescriptions::const_iterator found = descriptions.find(keyOf(key));
  EXPECT_NE(found, descriptions.end()) << key;
  if (found == descriptions.end()) return MXFPropertyDescription{std::string(), MXFPropertyKind::opaque};
  return found->second;
}

void expectDescription(const MetadataRootFactory& factory, const std::string& key, const std::string& name,
                       MXFPropertyKind kind) {
  const MXFPropertyDescription description = describedAs(factory, key);
  EXPECT_EQ(description.name, name);
  EXPECT_EQ(description.kind, kind) << name;
}

TEST(PropertyDescriptions, SequenceHasItsComponentsAndTheComponentsBaseProperties) {
  const SequenceFactory factory;
  EXPECT_EQ(factory.getClassName(), "Sequence");
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.06.01.01.04.06.09.00.00", "Sequence.components",
                    MXFPropertyKind::strongReferenceVector);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.04.07.01.00.00.00.00.00", "Component.dataDefinition",
                    MXFPropertyKind::key);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.07.02.02.01.01.03.00.00", "Component.duration",
                    MXFPropertyKind::int64);
}

TEST(PropertyDescriptions, InstanceAndGenerationIdentifiersAreDescribed) {
  const SequenceFactory factory;
  expectDescription(factory, "06.0E.2B.34.01.01.01.01.01.01.15.02.00.00.00.00", "MetadataRoot.instanceUID",
                    MXFPropertyKind::uid);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.05.20.07.01.08.00.00.00", "MetadataObject.generationUID",
                    MXFPropertyKind::uid);
}

TEST(PropertyDescriptions, PrefaceKindsOfReferencesAndBatches) {
  const PrefaceFactory factory;
  EXPECT_EQ(factory.getClassName(), "Preface");
  expectDescription(factory, "06.0E.2B.34.01.01.01.04.06.01.01.04.01.08.00.00", "Preface.primaryPackage",
                    MXFPropertyKind::weakReference);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.06.01.01.04.02.01.00.00", "Preface.contentStorage",
                    MXFPropertyKind::strongReference);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.06.01.01.04.06.04.00.00", "Preface.identifications",
                    MXFPropertyKind::strongReferenceVector);
  expectDescription(factory, "06.0E.2B.34.01.01.01.05.01.02.02.10.02.01.00.00", "Preface.essenceContainers",
                    MXFPropertyKind::keyBatch);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.07.02.01.10.02.04.00.00", "Preface.lastModifiedDate",
                    MXFPropertyKind::timestamp);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.03.01.02.01.05.00.00.00", "Preface.version",
                    MXFPropertyKind::uint16);
}

TEST(PropertyDescriptions, IdentificationValueKinds) {
  const IdentificationFactory factory;
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.05.20.07.01.02.01.00.00", "Identification.companyName",
                    MXFPropertyKind::wideString);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.05.20.07.01.04.00.00.00", "Identification.productVersion",
                    MXFPropertyKind::productVersion);
  expectDescription(factory, "06.0E.2B.34.01.01.01.02.05.20.07.01.07.00.00.00", "Identification.productUID",
                    MXFPropertyKind::uid);
}

TEST(PropertyDescriptions, TracksPackagesAndComponents) {
  const TimelineTrackFactory track;
  EXPECT_EQ(track.getClassName(), "TimelineTrack");
  expectDescription(track, "06.0E.2B.34.01.01.01.02.05.30.04.05.00.00.00.00", "TimelineTrack.editRate",
                    MXFPropertyKind::rational);
  expectDescription(track, "06.0E.2B.34.01.01.01.02.06.01.01.04.02.04.00.00", "Track.segment",
                    MXFPropertyKind::strongReference);
  expectDescription(track, "06.0E.2B.34.01.01.01.02.01.07.01.01.00.00.00.00", "Track.trackID",
                    MXFPropertyKind::uint32);
  const EssenceContainerDataFactory data;
  expectDescription(data, "06.0E.2B.34.01.01.01.02.06.01.01.06.01.00.00.00", "EssenceContainerData.linkedPackageUID",
                    MXFPropertyKind::umid);
  const TimecodeComponentFactory timecode;
  expectDescription(timecode, "06.0E.2B.34.01.01.01.01.04.04.01.01.05.00.00.00", "TimecodeComponent.dropFrame",
                    MXFPropertyKind::boolean);
  const DMSourceClipFactory clip;
  expectDescription(clip, "06.0E.2B.34.01.01.01.05.01.07.01.06.00.00.00.00", "DMSourceClip.targetTrackIDs",
                    MXFPropertyKind::uint32Batch);
}

TEST(PropertyDescriptions, ClassWithoutPropertiesOfItsOwnHasItsName) {
  EXPECT_EQ(MaterialPackageFactory().getClassName(), "MaterialPackage");
  EXPECT_EQ(StaticTrackFactory().getClassName(), "StaticTrack");
  EXPECT_EQ(MetadataObjectFactory().getClassName(), "MetadataObject");
}

TEST(PropertyDescriptions, DescriptorValueKinds) {
  const CDCIPictureDescriptorFactory cdci;
  expectDescription(cdci, "06.0E.2B.34.01.01.01.01.04.01.05.02.02.00.00.00", "PictureDescriptor.storedWidth",
                    MXFPropertyKind::uint32);
  expectDescription(cdci, "06.0E.2B.34.01.01.01.01.04.01.03.01.04.00.00.00", "PictureDescriptor.frameLayout",
                    MXFPropertyKind::uint8);
  expectDescription(cdci, "06.0E.2B.34.01.01.01.05.04.01.03.02.08.00.00.00", "PictureDescriptor.storedF2Offset",
                    MXFPropertyKind::int32);
  expectDescription(cdci, "06.0E.2B.34.01.01.01.02.04.01.03.02.05.00.00.00", "PictureDescriptor.videoLineMap",
                    MXFPropertyKind::int32Batch);
  expectDescription(cdci, "06.0E.2B.34.01.01.01.02.04.18.01.04.00.00.00.00", "CDCIPictureDescriptor.paddingBits",
                    MXFPropertyKind::int16);
  expectDescription(cdci, "06.0E.2B.34.01.01.01.09.06.01.01.04.06.10.00.00",
                    "GenericDescriptor.genericSubDescriptors", MXFPropertyKind::strongReferenceVector);
  const RGBAPictureDescriptorFactory rgba;
  expectDescription(rgba, "06.0E.2B.34.01.01.01.02.04.01.05.03.06.00.00.00", "RGBAPictureDescriptor.pixelLayout",
                    MXFPropertyKind::rgbaLayout);
  expectDescription(rgba, "06.0E.2B.34.01.01.01.02.04.01.05.03.08.00.00.00", "RGBAPictureDescriptor.palette",
                    MXFPropertyKind::bytes);
  const SoundDescriptorFactory sound;
  expectDescription(sound, "06.0E.2B.34.01.01.01.01.04.02.01.01.03.00.00.00", "SoundDescriptor.audioReferenceLevel",
                    MXFPropertyKind::int8);
  expectDescription(sound, "06.0E.2B.34.01.01.01.04.04.02.03.01.04.00.00.00", "SoundDescriptor.locked",
                    MXFPropertyKind::boolean);
}

TEST(PropertyDescriptions, ValueTypeWithoutAKindOfItsOwnIsOpaque) {
  EXPECT_EQ(zelta::PropertyKindOf<Decimal16>::value, MXFPropertyKind::opaque);
  EXPECT_EQ(zelta::PropertyKindOf<std::vector<MXFUID>>::value, MXFPropertyKind::opaque);
  EXPECT_EQ(zelta::PropertyKindOf<std::uint64_t>::value, MXFPropertyKind::uint64);
}

// Every class of the format describes exactly the keys of its set primer,
// each with a kind of its own.
TEST(PropertyDescriptions, EveryFormatClassDescribesItsWholeSetPrimer) {
  MXFFormatMetadataModelFactory composite;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : composite.getFactories()) {
    const MetadataRootFactory* single = dynamic_cast<const MetadataRootFactory*>(factory.get());
    ASSERT_NE(single, nullptr);
    SCOPED_TRACE(single->getClassName());
    const MXFPropertyDescriptions& descriptions = single->getPropertyDescriptions();
    EXPECT_EQ(descriptions.size(), single->getSetPrimer().size());
    for (const MXFKeyToTagMap::value_type& entry : single->getSetPrimer()) {
      const MXFPropertyDescriptions::const_iterator found = descriptions.find(entry.first);
      ASSERT_NE(found, descriptions.end());
      EXPECT_NE(found->second.kind, MXFPropertyKind::opaque) << found->second.name;
    }
  }
}

}  // namespace
