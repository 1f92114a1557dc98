#include <memory>

#include "metadata.h"
#include "metadata/codec_values.h"
#include "metadata/descriptor_tables.h"

using zelta::presentValue;

MPEGVideoDescriptor::MPEGVideoDescriptor() = default;
MPEGVideoDescriptor::~MPEGVideoDescriptor() = default;
std::shared_ptr<MPEGVideoDescriptor> MPEGVideoDescriptor::create() { return std::make_shared<MPEGVideoDescriptor>(); }

const bool& MPEGVideoDescriptor::getSingleSequence() const {
  return presentValue(singleSequence_, "MPEGVideoDescriptor.singleSequence is present");
}

const bool& MPEGVideoDescriptor::getConstantBFrames() const {
  return presentValue(constantBFrames_, "MPEGVideoDescriptor.constantBFrames is present");
}

const std::uint8_t& MPEGVideoDescriptor::getCodedContentType() const {
  return presentValue(codedContentType_, "MPEGVideoDescriptor.codedContentType is present");
}

const bool& MPEGVideoDescriptor::getLowDelay() const {
  return presentValue(lowDelay_, "MPEGVideoDescriptor.lowDelay is present");
}

const bool& MPEGVideoDescriptor::getClosedGOP() const {
  return presentValue(closedGOP_, "MPEGVideoDescriptor.closedGOP is present");
}

const bool& MPEGVideoDescriptor::getIdenticalGOP() const {
  return presentValue(identicalGOP_, "MPEGVideoDescriptor.identicalGOP is present");
}

const std::uint16_t& MPEGVideoDescriptor::getMaxGOP() const {
  return presentValue(maxGOP_, "MPEGVideoDescriptor.maxGOP is present");
}

const std::uint16_t& MPEGVideoDescriptor::getBPictureCount() const {
  return presentValue(bPictureCount_, "MPEGVideoDescriptor.bPictureCount is present");
}

const std::uint32_t& MPEGVideoDescriptor::getBitRate() const {
  return presentValue(bitRate_, "MPEGVideoDescriptor.bitRate is present");
}

const std::uint8_t& MPEGVideoDescriptor::getProfileAndLevel() const {
  return presentValue(profileAndLevel_, "MPEGVideoDescriptor.profileAndLevel is present");
}

AVCVideoSubDescriptor::AVCVideoSubDescriptor() = default;
AVCVideoSubDescriptor::~AVCVideoSubDescriptor() = default;
std::shared_ptr<AVCVideoSubDescriptor> AVCVideoSubDescriptor::create() {
  return std::make_shared<AVCVideoSubDescriptor>();
}

const bool& AVCVideoSubDescriptor::getConstantBPicture() const {
  return presentValue(constantBPicture_, "AVCVideoSubDescriptor.constantBPicture is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getCodedContentKind() const {
  return presentValue(codedContentKind_, "AVCVideoSubDescriptor.codedContentKind is present");
}

const bool& AVCVideoSubDescriptor::getClosedGOP() const {
  return presentValue(closedGOP_, "AVCVideoSubDescriptor.closedGOP is present");
}

const bool& AVCVideoSubDescriptor::getIdenticalGOP() const {
  return presentValue(identicalGOP_, "AVCVideoSubDescriptor.identicalGOP is present");
}

const std::uint16_t& AVCVideoSubDescriptor::getMaxGOP() const {
  return presentValue(maxGOP_, "AVCVideoSubDescriptor.maxGOP is present");
}

const std::uint16_t& AVCVideoSubDescriptor::getBPictureCount() const {
  return presentValue(bPictureCount_, "AVCVideoSubDescriptor.bPictureCount is present");
}

const std::uint32_t& AVCVideoSubDescriptor::getMaximumBitRate() const {
  return presentValue(maximumBitRate_, "AVCVideoSubDescriptor.maximumBitRate is present");
}

const std::uint32_t& AVCVideoSubDescriptor::getAverageBitRate() const {
  return presentValue(averageBitRate_, "AVCVideoSubDescriptor.averageBitRate is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getProfile() const {
  return presentValue(profile_, "AVCVideoSubDescriptor.profile is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getProfileConstraint() const {
  return presentValue(profileConstraint_, "AVCVideoSubDescriptor.profileConstraint is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getLevel() const {
  return presentValue(level_, "AVCVideoSubDescriptor.level is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getDecodingDelay() const {
  return presentValue(decodingDelay_, "AVCVideoSubDescriptor.decodingDelay is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getMaximumRefFrames() const {
  return presentValue(maximumRefFrames_, "AVCVideoSubDescriptor.maximumRefFrames is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getSequenceParameterSetFlag() const {
  return presentValue(sequenceParameterSetFlag_, "AVCVideoSubDescriptor.sequenceParameterSetFlag is present");
}

const std::uint8_t& AVCVideoSubDescriptor::getPictureParameterSetFlag() const {
  return presentValue(pictureParameterSetFlag_, "AVCVideoSubDescriptor.pictureParameterSetFlag is present");
}

const AVCParameterSetArray& AVCVideoSubDescriptor::getSequenceParameterSetArray() const {
  return presentValue(sequenceParameterSetArray_, "AVCVideoSubDescriptor.sequenceParameterSetArray is present");
}

const AVCParameterSetArray& AVCVideoSubDescriptor::getPictureParameterSetArray() const {
  return presentValue(pictureParameterSetArray_, "AVCVideoSubDescriptor.pictureParameterSetArray is present");
}

MPEG4VideoSubDescriptor::MPEG4VideoSubDescriptor() = default;
MPEG4VideoSubDescriptor::~MPEG4VideoSubDescriptor() = default;
std::shared_ptr<MPEG4VideoSubDescriptor> MPEG4VideoSubDescriptor::create() {
  return std::make_shared<MPEG4VideoSubDescriptor>();
}

const bool& MPEG4VideoSubDescriptor::getSingleSequence() const {
  return presentValue(singleSequence_, "MPEG4VideoSubDescriptor.singleSequence is present");
}

const bool& MPEG4VideoSubDescriptor::getConstantBVOPs() const {
  return presentValue(constantBVOPs_, "MPEG4VideoSubDescriptor.constantBVOPs is present");
}

const std::uint8_t& MPEG4VideoSubDescriptor::getCodedContentType() const {
  return presentValue(codedContentType_, "MPEG4VideoSubDescriptor.codedContentType is present");
}

const bool& MPEG4VideoSubDescriptor::getLowDelay() const {
  return presentValue(lowDelay_, "MPEG4VideoSubDescriptor.lowDelay is present");
}

const bool& MPEG4VideoSubDescriptor::getClosedGOV() const {
  return presentValue(closedGOV_, "MPEG4VideoSubDescriptor.closedGOV is present");
}

const bool& MPEG4VideoSubDescriptor::getIdenticalGOV() const {
  return presentValue(identicalGOV_, "MPEG4VideoSubDescriptor.identicalGOV is present");
}

const std::uint16_t& MPEG4VideoSubDescriptor::getMaxGOV() const {
  return presentValue(maxGOV_, "MPEG4VideoSubDescriptor.maxGOV is present");
}

const std::uint16_t& MPEG4VideoSubDescriptor::getBVOPCount() const {
  return presentValue(bVOPCount_, "MPEG4VideoSubDescriptor.bVOPCount is present");
}

const std::uint32_t& MPEG4VideoSubDescriptor::getBitRate() const {
  return presentValue(bitRate_, "MPEG4VideoSubDescriptor.bitRate is present");
}

const std::uint8_t& MPEG4VideoSubDescriptor::getProfileAndLevel() const {
  return presentValue(profileAndLevel_, "MPEG4VideoSubDescriptor.profileAndLevel is present");
}

namespace zelta {

template <>
const PropertyTable<MPEGVideoDescriptor>& propertyTable<MPEGVideoDescriptor>() {
  typedef MPEGVideoDescriptor C;
  static const PropertyTable<C> table(
      "MPEGVideoDescriptor", formatSetKey(0x51),
      {optionalValue("MPEGVideoDescriptor.singleSequence",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x02, 0x00, 0x00}, 0x8000),
                     &C::getSingleSequence, &C::setSingleSequence, &C::hasSingleSequence),
       optionalValue("MPEGVideoDescriptor.constantBFrames",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x03, 0x00, 0x00}, 0x8001),
                     &C::getConstantBFrames, &C::setConstantBFrames, &C::hasConstantBFrames),
       optionalValue("MPEGVideoDescriptor.codedContentType",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x04, 0x00, 0x00}, 0x8002),
                     &C::getCodedContentType, &C::setCodedContentType, &C::hasCodedContentType),
       optionalValue("MPEGVideoDescriptor.lowDelay",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x05, 0x00, 0x00}, 0x8003), &C::getLowDelay,
                     &C::setLowDelay, &C::hasLowDelay),
       optionalValue("MPEGVideoDescriptor.closedGOP",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x06, 0x00, 0x00}, 0x8004),
                     &C::getClosedGOP, &C::setClosedGOP, &C::hasClosedGOP),
       optionalValue("MPEGVideoDescriptor.identicalGOP",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x07, 0x00, 0x00}, 0x8005),
                     &C::getIdenticalGOP, &C::setIdenticalGOP, &C::hasIdenticalGOP),
       optionalValue("MPEGVideoDescriptor.maxGOP",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x08, 0x00, 0x00}, 0x8006), &C::getMaxGOP,
                     &C::setMaxGOP, &C::hasMaxGOP),
       optionalValue("MPEGVideoDescriptor.bPictureCount",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x09, 0x00, 0x00}, 0x8007),
                     &C::getBPictureCount, &C::setBPictureCount, &C::hasBPictureCount),
       optionalValue("MPEGVideoDescriptor.bitRate",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x0B, 0x00, 0x00}, 0x8008), &C::getBitRate,
                     &C::setBitRate, &C::hasBitRate),
       optionalValue("MPEGVideoDescriptor.profileAndLevel",
                     formatPropertyKey(0x05, {0x04, 0x01, 0x06, 0x02, 0x01, 0x0A, 0x00, 0x00}, 0x8009),
                     &C::getProfileAndLevel, &C::setProfileAndLevel, &C::hasProfileAndLevel)});
  return table;
}

template <>
const PropertyTable<AVCVideoSubDescriptor>& propertyTable<AVCVideoSubDescriptor>() {
  typedef AVCVideoSubDescriptor C;
  static const PropertyTable<C> table(
      "AVCVideoSubDescriptor", formatSetKey(0x6E),
      {optionalValue("AVCVideoSubDescriptor.constantBPicture",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x03, 0x00, 0x00}, 0x8001),
                     &C::getConstantBPicture, &C::setConstantBPicture, &C::hasConstantBPicture),
       optionalValue("AVCVideoSubDescriptor.codedContentKind",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x04, 0x00, 0x00}, 0x8002),
                     &C::getCodedContentKind, &C::setCodedContentKind, &C::hasCodedContentKind),
       optionalValue("AVCVideoSubDescriptor.closedGOP",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x06, 0x00, 0x00}, 0x8004),
                     &C::getClosedGOP, &C::setClosedGOP, &C::hasClosedGOP),
       optionalValue("AVCVideoSubDescriptor.identicalGOP",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x07, 0x00, 0x00}, 0x8005),
                     &C::getIdenticalGOP, &C::setIdenticalGOP, &C::hasIdenticalGOP),
       optionalValue("AVCVideoSubDescriptor.maxGOP",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x08, 0x00, 0x00}, 0x8006), &C::getMaxGOP,
                     &C::setMaxGOP, &C::hasMaxGOP),
       optionalValue("AVCVideoSubDescriptor.bPictureCount",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x09, 0x00, 0x00}, 0x8007),
                     &C::getBPictureCount, &C::setBPictureCount, &C::hasBPictureCount),
       optionalValue("AVCVideoSubDescriptor.maximumBitRate",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x0B, 0x00, 0x00}, 0x8008),
                     &C::getMaximumBitRate, &C::setMaximumBitRate, &C::hasMaximumBitRate),
       optionalValue("AVCVideoSubDescriptor.averageBitRate",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x14, 0x00, 0x00}, 0x8012),
                     &C::getAverageBitRate, &C::setAverageBitRate, &C::hasAverageBitRate),
       optionalValue("AVCVideoSubDescriptor.profile",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x0A, 0x00, 0x00}, 0x8009), &C::getProfile,
                     &C::setProfile, &C::hasProfile),
       optionalValue("AVCVideoSubDescriptor.profileConstraint",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x0C, 0x00, 0x00}, 0x800A),
                     &C::getProfileConstraint, &C::setProfileConstraint, &C::hasProfileConstraint),
       optionalValue("AVCVideoSubDescriptor.level",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x0D, 0x00, 0x00}, 0x800B), &C::getLevel,
                     &C::setLevel, &C::hasLevel),
       optionalValue("AVCVideoSubDescriptor.decodingDelay",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x0E, 0x00, 0x00}, 0x800C),
                     &C::getDecodingDelay, &C::setDecodingDelay, &C::hasDecodingDelay),
       optionalValue("AVCVideoSubDescriptor.maximumRefFrames",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x0F, 0x00, 0x00}, 0x800D),
                     &C::getMaximumRefFrames, &C::setMaximumRefFrames, &C::hasMaximumRefFrames),
       optionalValue("AVCVideoSubDescriptor.sequenceParameterSetFlag",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x10, 0x00, 0x00}, 0x800E),
                     &C::getSequenceParameterSetFlag, &C::setSequenceParameterSetFlag, &C::hasSequenceParameterSetFlag),
       optionalValue("AVCVideoSubDescriptor.pictureParameterSetFlag",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x11, 0x00, 0x00}, 0x800F),
                     &C::getPictureParameterSetFlag, &C::setPictureParameterSetFlag, &C::hasPictureParameterSetFlag),
       optionalValue("AVCVideoSubDescriptor.sequenceParameterSetArray",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x12, 0x00, 0x00}, 0x8010),
                     &C::getSequenceParameterSetArray, &C::setSequenceParameterSetArray,
                     &C::hasSequenceParameterSetArray),
       optionalValue("AVCVideoSubDescriptor.pictureParameterSetArray",
                     formatPropertyKey(0x0E, {0x04, 0x01, 0x06, 0x06, 0x01, 0x13, 0x00, 0x00}, 0x8011),
                     &C::getPictureParameterSetArray, &C::setPictureParameterSetArray,
                     &C::hasPictureParameterSetArray)});
  return table;
}

template <>
const PropertyTable<MPEG4VideoSubDescriptor>& propertyTable<MPEG4VideoSubDescriptor>() {
  typedef MPEG4VideoSubDescriptor C;
  static const PropertyTable<C> table(
      "MPEG4VideoSubDescriptor", formatSetKey(0x68),
      {optionalValue("MPEG4VideoSubDescriptor.singleSequence",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x02, 0x00, 0x00}, 0x8000),
                     &C::getSingleSequence, &C::setSingleSequence, &C::hasSingleSequence),
       optionalValue("MPEG4VideoSubDescriptor.constantBVOPs",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x03, 0x00, 0x00}, 0x8001),
                     &C::getConstantBVOPs, &C::setConstantBVOPs, &C::hasConstantBVOPs),
       optionalValue("MPEG4VideoSubDescriptor.codedContentType",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x04, 0x00, 0x00}, 0x8002),
                     &C::getCodedContentType, &C::setCodedContentType, &C::hasCodedContentType),
       optionalValue("MPEG4VideoSubDescriptor.lowDelay",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x05, 0x00, 0x00}, 0x8003), &C::getLowDelay,
                     &C::setLowDelay, &C::hasLowDelay),
       optionalValue("MPEG4VideoSubDescriptor.closedGOV",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x06, 0x00, 0x00}, 0x8004),
                     &C::getClosedGOV, &C::setClosedGOV, &C::hasClosedGOV),
       optionalValue("MPEG4VideoSubDescriptor.identicalGOV",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x07, 0x00, 0x00}, 0x8005),
                     &C::getIdenticalGOV, &C::setIdenticalGOV, &C::hasIdenticalGOV),
       optionalValue("MPEG4VideoSubDescriptor.maxGOV",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x08, 0x00, 0x00}, 0x8006), &C::getMaxGOV,
                     &C::setMaxGOV, &C::hasMaxGOV),
       optionalValue("MPEG4VideoSubDescriptor.bVOPCount",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x09, 0x00, 0x00}, 0x8007),
                     &C::getBVOPCount, &C::setBVOPCount, &C::hasBVOPCount),
       optionalValue("MPEG4VideoSubDescriptor.bitRate",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x0B, 0x00, 0x00}, 0x8008), &C::getBitRate,
                     &C::setBitRate, &C::hasBitRate),
       optionalValue("MPEG4VideoSubDescriptor.profileAndLevel",
                     formatPropertyKey(0x0D, {0x04, 0x01, 0x06, 0x02, 0x02, 0x0A, 0x00, 0x00}, 0x8009),
                     &C::getProfileAndLevel, &C::setProfileAndLevel, &C::hasProfileAndLevel)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<MPEGVideoDescriptor, CDCIPictureDescriptorFactory>;
template class MetadataClassFactory<AVCVideoSubDescriptor, SubDescriptorFactory>;
template class MetadataClassFactory<MPEG4VideoSubDescriptor, SubDescriptorFactory>;
