#include <memory>

#include "metadata.h"
#include "metadata/codec_values.h"
#include "metadata/descriptor_tables.h"

using zelta::presentValue;

WaveAudioDescriptor::WaveAudioDescriptor() = default;
WaveAudioDescriptor::~WaveAudioDescriptor() = default;
std::shared_ptr<WaveAudioDescriptor> WaveAudioDescriptor::create() { return std::make_shared<WaveAudioDescriptor>(); }

const std::uint8_t& WaveAudioDescriptor::getSequenceOffset() const {
  return presentValue(sequenceOffset_, "WaveAudioDescriptor.sequenceOffset is present");
}

const KLVKey& WaveAudioDescriptor::getChannelAssignment() const {
  return presentValue(channelAssignment_, "WaveAudioDescriptor.channelAssignment is present");
}

const std::uint32_t& WaveAudioDescriptor::getPeakEnvelopeVersion() const {
  return presentValue(peakEnvelopeVersion_, "WaveAudioDescriptor.peakEnvelopeVersion is present");
}

const std::uint32_t& WaveAudioDescriptor::getPeakEnvelopeFormat() const {
  return presentValue(peakEnvelopeFormat_, "WaveAudioDescriptor.peakEnvelopeFormat is present");
}

const std::uint32_t& WaveAudioDescriptor::getPointsPerPeakValue() const {
  return presentValue(pointsPerPeakValue_, "WaveAudioDescriptor.pointsPerPeakValue is present");
}

const std::uint32_t& WaveAudioDescriptor::getPeakEnvelopeBlockSize() const {
  return presentValue(peakEnvelopeBlockSize_, "WaveAudioDescriptor.peakEnvelopeBlockSize is present");
}

const std::uint32_t& WaveAudioDescriptor::getPeakChannels() const {
  return presentValue(peakChannels_, "WaveAudioDescriptor.peakChannels is present");
}

const std::uint32_t& WaveAudioDescriptor::getPeakFrames() const {
  return presentValue(peakFrames_, "WaveAudioDescriptor.peakFrames is present");
}

const std::int64_t& WaveAudioDescriptor::getPeakOfPeaksPosition() const {
  return presentValue(peakOfPeaksPosition_, "WaveAudioDescriptor.peakOfPeaksPosition is present");
}

const MXFTimestamp& WaveAudioDescriptor::getPeakEnvelopeTimestamp() const {
  return presentValue(peakEnvelopeTimestamp_, "WaveAudioDescriptor.peakEnvelopeTimestamp is present");
}

const ByteVector& WaveAudioDescriptor::getPeakEnvelopeDataStream() const {
  return presentValue(peakEnvelopeDataStream_, "WaveAudioDescriptor.peakEnvelopeDataStream is present");
}

AES3AudioDescriptor::AES3AudioDescriptor() = default;
AES3AudioDescriptor::~AES3AudioDescriptor() = default;
std::shared_ptr<AES3AudioDescriptor> AES3AudioDescriptor::create() { return std::make_shared<AES3AudioDescriptor>(); }

const std::uint8_t& AES3AudioDescriptor::getEmphasis() const {
  return presentValue(emphasis_, "AES3AudioDescriptor.emphasis is present");
}

const std::uint16_t& AES3AudioDescriptor::getBlockStartOffset() const {
  return presentValue(blockStartOffset_, "AES3AudioDescriptor.blockStartOffset is present");
}

const std::uint8_t& AES3AudioDescriptor::getAuxiliaryBitsMode() const {
  return presentValue(auxiliaryBitsMode_, "AES3AudioDescriptor.auxiliaryBitsMode is present");
}

const ByteVector& AES3AudioDescriptor::getChannelStatusDataMode() const {
  return presentValue(channelStatusDataMode_, "AES3AudioDescriptor.channelStatusDataMode is present");
}

const std::vector<AES3ChannelStatusData>& AES3AudioDescriptor::getFixedChannelStatusData() const {
  return presentValue(fixedChannelStatusData_, "AES3AudioDescriptor.fixedChannelStatusData is present");
}

namespace zelta {

template <>
const PropertyTable<WaveAudioDescriptor>& propertyTable<WaveAudioDescriptor>() {
  typedef WaveAudioDescriptor C;
  static const PropertyTable<C> table(
      "WaveAudioDescriptor", formatSetKey(0x48),
      {requiredValue("WaveAudioDescriptor.blockAlign",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x03, 0x02, 0x01, 0x00, 0x00, 0x00}, 0x3D0A),
                     &C::getBlockAlign, &C::setBlockAlign),
       optionalValue("WaveAudioDescriptor.sequenceOffset",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x03, 0x02, 0x02, 0x00, 0x00, 0x00}, 0x3D0B),
                     &C::getSequenceOffset, &C::setSequenceOffset, &C::hasSequenceOffset),
       requiredValue("WaveAudioDescriptor.averageBytesPerSecond",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x03, 0x03, 0x05, 0x00, 0x00, 0x00}, 0x3D09),
                     &C::getAverageBytesPerSecond, &C::setAverageBytesPerSecond),
       optionalValue("WaveAudioDescriptor.channelAssignment",
                     formatPropertyKey(0x07, {0x04, 0x02, 0x01, 0x01, 0x05, 0x00, 0x00, 0x00}, 0x3D32),
                     &C::getChannelAssignment, &C::setChannelAssignment, &C::hasChannelAssignment),
       optionalValue("WaveAudioDescriptor.peakEnvelopeVersion",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x06, 0x00, 0x00, 0x00}, 0x3D29),
                     &C::getPeakEnvelopeVersion, &C::setPeakEnvelopeVersion, &C::hasPeakEnvelopeVersion),
       optionalValue("WaveAudioDescriptor.peakEnvelopeFormat",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x07, 0x00, 0x00, 0x00}, 0x3D2A),
                     &C::getPeakEnvelopeFormat, &C::setPeakEnvelopeFormat, &C::hasPeakEnvelopeFormat),
       optionalValue("WaveAudioDescriptor.pointsPerPeakValue",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x08, 0x00, 0x00, 0x00}, 0x3D2B),
                     &C::getPointsPerPeakValue, &C::setPointsPerPeakValue, &C::hasPointsPerPeakValue),
       optionalValue("WaveAudioDescriptor.peakEnvelopeBlockSize",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x09, 0x00, 0x00, 0x00}, 0x3D2C),
                     &C::getPeakEnvelopeBlockSize, &C::setPeakEnvelopeBlockSize, &C::hasPeakEnvelopeBlockSize),
       optionalValue("WaveAudioDescriptor.peakChannels",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x0A, 0x00, 0x00, 0x00}, 0x3D2D),
                     &C::getPeakChannels, &C::setPeakChannels, &C::hasPeakChannels),
       optionalValue("WaveAudioDescriptor.peakFrames",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x0B, 0x00, 0x00, 0x00}, 0x3D2E),
                     &C::getPeakFrames, &C::setPeakFrames, &C::hasPeakFrames),
       optionalValue("WaveAudioDescriptor.peakOfPeaksPosition",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x0C, 0x00, 0x00, 0x00}, 0x3D2F),
                     &C::getPeakOfPeaksPosition, &C::setPeakOfPeaksPosition, &C::hasPeakOfPeaksPosition),
       optionalValue("WaveAudioDescriptor.peakEnvelopeTimestamp",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x0D, 0x00, 0x00, 0x00}, 0x3D30),
                     &C::getPeakEnvelopeTimestamp, &C::setPeakEnvelopeTimestamp, &C::hasPeakEnvelopeTimestamp),
       optionalValue("WaveAudioDescriptor.peakEnvelopeDataStream",
                     formatPropertyKey(0x08, {0x04, 0x02, 0x03, 0x01, 0x0E, 0x00, 0x00, 0x00}, 0x3D31),
                     &C::getPeakEnvelopeDataStream, &C::setPeakEnvelopeDataStream, &C::hasPeakEnvelopeDataStream)});
  return table;
}

template <>
const PropertyTable<AES3AudioDescriptor>& propertyTable<AES3AudioDescriptor>() {
  typedef AES3AudioDescriptor C;
  static const PropertyTable<C> table(
      "AES3AudioDescriptor", formatSetKey(0x47),
      {optionalValue("AES3AudioDescriptor.emphasis",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x05, 0x01, 0x06, 0x00, 0x00, 0x00}, 0x3D0D), &C::getEmphasis,
                     &C::setEmphasis, &C::hasEmphasis),
       optionalValue("AES3AudioDescriptor.blockStartOffset",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x03, 0x02, 0x03, 0x00, 0x00, 0x00}, 0x3D0F),
                     &C::getBlockStartOffset, &C::setBlockStartOffset, &C::hasBlockStartOffset),
       optionalValue("AES3AudioDescriptor.auxiliaryBitsMode",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x05, 0x01, 0x01, 0x00, 0x00, 0x00}, 0x3D08),
                     &C::getAuxiliaryBitsMode, &C::setAuxiliaryBitsMode, &C::hasAuxiliaryBitsMode),
       optionalValue("AES3AudioDescriptor.channelStatusDataMode",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x05, 0x01, 0x02, 0x00, 0x00, 0x00}, 0x3D10),
                     &C::getChannelStatusDataMode, &C::setChannelStatusDataMode, &C::hasChannelStatusDataMode),
       optionalValue("AES3AudioDescriptor.fixedChannelStatusData",
                     formatPropertyKey(0x05, {0x04, 0x02, 0x05, 0x01, 0x03, 0x00, 0x00, 0x00}, 0x3D11),
                     &C::getFixedChannelStatusData, &C::setFixedChannelStatusData, &C::hasFixedChannelStatusData)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<WaveAudioDescriptor, SoundDescriptorFactory>;
template class MetadataClassFactory<AES3AudioDescriptor, WaveAudioDescriptorFactory>;
