#include <memory>
#include <string>
#include <utility>

#include "kit.h"

ZeltaMasterMetadata::~ZeltaMasterMetadata() = default;

// A channel beyond the count answers the out-of-range value even when a list
// holds more entries.
bool ZeltaDefaultMetadata::hasChannel(std::uint32_t channel, std::size_t listSize) const {
  return channel < audioChannelCount && channel < listSize;
}

ZeltaDefaultMetadata::ZeltaDefaultMetadata() = default;

std::uint16_t ZeltaDefaultMetadata::getPrefaceVersion() const { return prefaceVersion; }
ZeltaIdentification ZeltaDefaultMetadata::getIdentification() const { return identification; }
MXFTimestamp ZeltaDefaultMetadata::getCreationDate() const { return creationDate; }
MXFTimestamp ZeltaDefaultMetadata::getModificationDate() const { return modificationDate; }
std::uint32_t ZeltaDefaultMetadata::getEssenceFormat() const { return essenceFormat; }
UMID ZeltaDefaultMetadata::getMaterialPackageUID() const { return materialPackageUID; }
UMID ZeltaDefaultMetadata::getFilePackageUID() const { return filePackageUID; }
std::wstring ZeltaDefaultMetadata::getPackageName() const { return packageName; }
MXFRational ZeltaDefaultMetadata::getEditRate() const { return editRate; }
std::string ZeltaDefaultMetadata::getDescriptiveText() const { return descriptiveText; }
std::uint32_t ZeltaDefaultMetadata::getBitRate() const { return bitRate; }
bool ZeltaDefaultMetadata::isProgressive() const { return progressive; }
ZeltaSize ZeltaDefaultMetadata::getDisplaySize() const { return displaySize; }
ZeltaLineMap ZeltaDefaultMetadata::getVideoLineMap() const { return videoLineMap; }
MXFRational ZeltaDefaultMetadata::getAspectRatio() const { return aspectRatio; }
bool ZeltaDefaultMetadata::isRGB() const { return rgb; }
bool ZeltaDefaultMetadata::isWideRangeRGB() const { return wideRangeRGB; }
std::uint32_t ZeltaDefaultMetadata::getComponentDepth() const { return componentDepth; }
ZeltaSize ZeltaDefaultMetadata::getSubsampling() const { return subsampling; }
bool ZeltaDefaultMetadata::isSimpleStudioProfile() const { return simpleStudioProfile; }
bool ZeltaDefaultMetadata::isSingleSequence() const { return singleSequence; }
bool ZeltaDefaultMetadata::hasConstantBFrames() const { return constantBFrames; }
bool ZeltaDefaultMetadata::isLowDelay() const { return lowDelay; }
bool ZeltaDefaultMetadata::isClosedGOP() const { return closedGOP; }
bool ZeltaDefaultMetadata::isIdenticalGOP() const { return identicalGOP; }
std::uint16_t ZeltaDefaultMetadata::getMaxGOP() const { return maxGOP; }
std::uint16_t ZeltaDefaultMetadata::getBPictureCount() const { return bPictureCount; }
std::uint16_t ZeltaDefaultMetadata::getProfileAndLevel() const { return profileAndLevel; }
std::uint8_t ZeltaDefaultMetadata::getProfileConstraint() const { return profileConstraint; }
bool ZeltaDefaultMetadata::isHalfSize() const { return halfSize; }
std::uint32_t ZeltaDefaultMetadata::getAudioChannelCount() const { return audioChannelCount; }
std::uint32_t ZeltaDefaultMetadata::getQuantizationBits() const { return quantizationBits; }
bool ZeltaDefaultMetadata::hasAncillaryData() const { return ancillaryData; }
bool ZeltaDefaultMetadata::isDropFrame() const { return dropFrame; }
std::uint64_t ZeltaDefaultMetadata::getStartTimecode() const { return startTimecode; }
std::int64_t ZeltaDefaultMetadata::getOrigin() const { return origin; }
std::uint64_t ZeltaDefaultMetadata::getDuration() const { return duration; }
std::uint32_t ZeltaDefaultMetadata::getIndexSID() const { return indexSID; }
std::uint32_t ZeltaDefaultMetadata::getBodySID() const { return bodySID; }

MXFRational ZeltaDefaultMetadata::getAudioSamplingRate(std::uint32_t channel) const {
  return hasChannel(channel, audioSamplingRates.size()) ? audioSamplingRates[channel] : MXFRational{0, 1};
}

ZeltaChannelStatus ZeltaDefaultMetadata::getFixedChannelStatusData(std::uint32_t channel) const {
  return hasChannel(channel, fixedChannelStatusData.size()) ? fixedChannelStatusData[channel]
                                                            : ZeltaDefaultChannelStatus;
}

DullMetadataFilter::DullMetadataFilter(std::shared_ptr<const ZeltaMasterMetadata> metadata)
    : metadata_(std::move(metadata)) {
  check(metadata_ != nullptr, "metadata is present");
}

std::uint16_t DullMetadataFilter::getPrefaceVersion() const { return metadata_->getPrefaceVersion(); }
ZeltaIdentification DullMetadataFilter::getIdentification() const { return metadata_->getIdentification(); }
MXFTimestamp DullMetadataFilter::getCreationDate() const { return metadata_->getCreationDate(); }
MXFTimestamp DullMetadataFilter::getModificationDate() const { return metadata_->getModificationDate(); }
std::uint32_t DullMetadataFilter::getEssenceFormat() const { return metadata_->getEssenceFormat(); }
UMID DullMetadataFilter::getMaterialPackageUID() const { return metadata_->getMaterialPackageUID(); }
UMID DullMetadataFilter::getFilePackageUID() const { return metadata_->getFilePackageUID(); }
std::wstring DullMetadataFilter::getPackageName() const { return metadata_->getPackageName(); }
MXFRational DullMetadataFilter::getEditRate() const { return metadata_->getEditRate(); }
std::string DullMetadataFilter::getDescriptiveText() const { return metadata_->getDescriptiveText(); }
std::uint32_t DullMetadataFilter::getBitRate() const { return metadata_->getBitRate(); }
bool DullMetadataFilter::isProgressive() const { return metadata_->isProgressive(); }
ZeltaSize DullMetadataFilter::getDisplaySize() const { return metadata_->getDisplaySize(); }
ZeltaLineMap DullMetadataFilter::getVideoLineMap() const { return metadata_->getVideoLineMap(); }
MXFRational DullMetadataFilter::getAspectRatio() const { return metadata_->getAspectRatio(); }
bool DullMetadataFilter::isRGB() const { return metadata_->isRGB(); }
bool DullMetadataFilter::isWideRangeRGB() const { return metadata_->isWideRangeRGB(); }
std::uint32_t DullMetadataFilter::getComponentDepth() const { return metadata_->getComponentDepth(); }
ZeltaSize DullMetadataFilter::getSubsampling() const { return metadata_->getSubsampling(); }
bool DullMetadataFilter::isSimpleStudioProfile() const { return metadata_->isSimpleStudioProfile(); }
bool DullMetadataFilter::isSingleSequence() const { return metadata_->isSingleSequence(); }
bool DullMetadataFilter::hasConstantBFrames() const { return metadata_->hasConstantBFrames(); }
bool DullMetadataFilter::isLowDelay() const { return metadata_->isLowDelay(); }
bool DullMetadataFilter::isClosedGOP() const { return metadata_->isClosedGOP(); }
bool DullMetadataFilter::isIdenticalGOP() const { return metadata_->isIdenticalGOP(); }
std::uint16_t DullMetadataFilter::getMaxGOP() const { return metadata_->getMaxGOP(); }
std::uint16_t DullMetadataFilter::getBPictureCount() const { return metadata_->getBPictureCount(); }
std::uint16_t DullMetadataFilter::getProfileAndLevel() const { return metadata_->getProfileAndLevel(); }
std::uint8_t DullMetadataFilter::getProfileConstraint() const { return metadata_->getProfileConstraint(); }
bool DullMetadataFilter::isHalfSize() const { return metadata_->isHalfSize(); }
std::uint32_t DullMetadataFilter::getAudioChannelCount() const { return metadata_->getAudioChannelCount(); }
std::uint32_t DullMetadataFilter::getQuantizationBits() const { return metadata_->getQuantizationBits(); }
MXFRational DullMetadataFilter::getAudioSamplingRate(std::uint32_t channel) const {
  return metadata_->getAudioSamplingRate(channel);
}
ZeltaChannelStatus DullMetadataFilter::getFixedChannelStatusData(std::uint32_t channel) const {
  return metadata_->getFixedChannelStatusData(channel);
}
bool DullMetadataFilter::hasAncillaryData() const { return metadata_->hasAncillaryData(); }
bool DullMetadataFilter::isDropFrame() const { return metadata_->isDropFrame(); }
std::uint64_t DullMetadataFilter::getStartTimecode() const { return metadata_->getStartTimecode(); }
std::int64_t DullMetadataFilter::getOrigin() const { return metadata_->getOrigin(); }
std::uint64_t DullMetadataFilter::getDuration() const { return metadata_->getDuration(); }
std::uint32_t DullMetadataFilter::getIndexSID() const { return metadata_->getIndexSID(); }
std::uint32_t DullMetadataFilter::getBodySID() const { return metadata_->getBodySID(); }
