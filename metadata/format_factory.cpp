#include "metadata.h"

MXFFormatMetadataModelFactory::MXFFormatMetadataModelFactory()
    : factories_{std::make_shared<PrefaceFactory>(),
                 std::make_shared<IdentificationFactory>(),
                 std::make_shared<ContentStorageFactory>(),
                 std::make_shared<EssenceContainerDataFactory>(),
                 std::make_shared<NetworkLocatorFactory>(),
                 std::make_shared<TextLocatorFactory>(),
                 std::make_shared<SequenceFactory>(),
                 std::make_shared<SourceClipFactory>(),
                 std::make_shared<TimelineTrackFactory>(),
                 std::make_shared<EventTrackFactory>(),
                 std::make_shared<StaticTrackFactory>(),
                 std::make_shared<TimecodeComponentFactory>(),
                 std::make_shared<CommentMarkerFactory>(),
                 std::make_shared<DMSegmentFactory>(),
                 std::make_shared<DMSourceClipFactory>(),
                 std::make_shared<MaterialPackageFactory>(),
                 std::make_shared<SourcePackageFactory>(),
                 std::make_shared<MultipleDescriptorFactory>(),
                 std::make_shared<PictureDescriptorFactory>(),
                 std::make_shared<CDCIPictureDescriptorFactory>(),
                 std::make_shared<RGBAPictureDescriptorFactory>(),
                 std::make_shared<SoundDescriptorFactory>(),
                 std::make_shared<DataDescriptorFactory>(),
                 std::make_shared<ContainerConstraintsSubDescriptorFactory>()} {}

MXFFormatMetadataModelFactory::~MXFFormatMetadataModelFactory() = default;

const MXFMetadataModelFactory::Factories& MXFFormatMetadataModelFactory::getFactories() { return factories_; }
