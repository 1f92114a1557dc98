#include <memory>

#include "kit.h"

ZeltaMetadataFactory::ZeltaMetadataFactory()
    : factories_{std::make_shared<MXFFormatMetadataModelFactory>(), std::make_shared<MXFAES3MetadataModelFactory>(),
                 std::make_shared<MXFMPEGMetadataModelFactory>(), std::make_shared<MXFVBIANCMetadataModelFactory>(),
                 std::make_shared<MXFTextBasedDMModelFactory>()} {}

ZeltaMetadataFactory::~ZeltaMetadataFactory() = default;

const MXFMetadataModelFactory::Factories& ZeltaMetadataFactory::getFactories() { return factories_; }

std::shared_ptr<MXFMetadataModelFactory> createZeltaDefaultMetadataFactory() {
  return std::make_shared<ZeltaMetadataFactory>();
}
