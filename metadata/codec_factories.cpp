#include <memory>

#include "metadata.h"

MXFAES3MetadataModelFactory::MXFAES3MetadataModelFactory()
    : factories_{std::make_shared<WaveAudioDescriptorFactory>(), std::make_shared<AES3AudioDescriptorFactory>()} {}

MXFAES3MetadataModelFactory::~MXFAES3MetadataModelFactory() = default;

const MXFMetadataModelFactory::Factories& MXFAES3MetadataModelFactory::getFactories() { return factories_; }

MXFMPEGMetadataModelFactory::MXFMPEGMetadataModelFactory()
    : factories_{std::make_shared<MPEGVideoDescriptorFactory>(), std::make_shared<MPEG4VideoSubDescriptorFactory>(),
                 std::make_shared<AVCVideoSubDescriptorFactory>()} {}

MXFMPEGMetadataModelFactory::~MXFMPEGMetadataModelFactory() = default;

const MXFMetadataModelFactory::Factories& MXFMPEGMetadataModelFactory::getFactories() { return factories_; }

MXFVBIANCMetadataModelFactory::MXFVBIANCMetadataModelFactory()
    : factories_{std::make_shared<VBIDataDescriptorFactory>(), std::make_shared<ANCDataDescriptorFactory>()} {}

MXFVBIANCMetadataModelFactory::~MXFVBIANCMetadataModelFactory() = default;

const MXFMetadataModelFactory::Factories& MXFVBIANCMetadataModelFactory::getFactories() { return factories_; }
