#include <memory>

#include "metadata.h"
#include "metadata/descriptor_tables.h"

using zelta::presentValue;

SoundDescriptor::SoundDescriptor() : audioSamplingRate_{0, 1} {}
SoundDescriptor::~SoundDescriptor() = default;
std::shared_ptr<SoundDescriptor> SoundDescriptor::create() { return std::make_shared<SoundDescriptor>(); }

const std::int8_t& SoundDescriptor::getAudioReferenceLevel() const {
  return presentValue(audioReferenceLevel_, "SoundDescriptor.audioReferenceLevel is present");
}

const std::uint8_t& SoundDescriptor::getElectroSpatialFormulation() const {
  return presentValue(electroSpatialFormulation_, "SoundDescriptor.electroSpatialFormulation is present");
}

const std::int8_t& SoundDescriptor::getDialNorm() const {
  return presentValue(dialNorm_, "SoundDescriptor.dialNorm is present");
}

const KLVKey& SoundDescriptor::getSoundEssenceCompression() const {
  return presentValue(soundEssenceCompression_, "SoundDescriptor.soundEssenceCompression is present");
}

DataDescriptor::DataDescriptor() = default;
DataDescriptor::~DataDescriptor() = default;
std::shared_ptr<DataDescriptor> DataDescriptor::create() { return std::make_shared<DataDescriptor>(); }

const KLVKey& DataDescriptor::getDataEssenceCoding() const {
  return presentValue(dataEssenceCoding_, "DataDescriptor.dataEssenceCoding is present");
}

namespace zelta {

template <>
const PropertyTable<SoundDescriptor>& propertyTable<SoundDescriptor>() {
  typedef SoundDescriptor C;
  static const PropertyTable<C> table(
      "SoundDescriptor", formatSetKey(0x42),
      {requiredValue("SoundDescriptor.audioSamplingRate", 0x3D03, &C::getAudioSamplingRate, &C::setAudioSamplingRate),
       requiredValue("SoundDescriptor.locked", 0x3D02, &C::getLocked, &C::setLocked),
       optionalValue("SoundDescriptor.audioReferenceLevel", 0x3D04, &C::getAudioReferenceLevel,
                     &C::setAudioReferenceLevel, &C::hasAudioReferenceLevel),
       optionalValue("SoundDescriptor.electroSpatialFormulation", 0x3D05, &C::getElectroSpatialFormulation,
                     &C::setElectroSpatialFormulation, &C::hasElectroSpatialFormulation),
       requiredValue("SoundDescriptor.channelCount", 0x3D07, &C::getChannelCount, &C::setChannelCount),
       requiredValue("SoundDescriptor.quantizationBits", 0x3D01, &C::getQuantizationBits, &C::setQuantizationBits),
       optionalValue("SoundDescriptor.dialNorm", 0x3D0C, &C::getDialNorm, &C::setDialNorm, &C::hasDialNorm),
       optionalValue("SoundDescriptor.soundEssenceCompression", 0x3D06, &C::getSoundEssenceCompression,
                     &C::setSoundEssenceCompression, &C::hasSoundEssenceCompression)});
  return table;
}

template <>
const PropertyTable<DataDescriptor>& propertyTable<DataDescriptor>() {
  typedef DataDescriptor C;
  static const PropertyTable<C> table(
      "DataDescriptor", formatSetKey(0x43),
      {optionalValue("DataDescriptor.dataEssenceCoding", 0x3E01, &C::getDataEssenceCoding, &C::setDataEssenceCoding,
                     &C::hasDataEssenceCoding)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<SoundDescriptor, FileDescriptorFactory>;
template class MetadataClassFactory<DataDescriptor, FileDescriptorFactory>;
