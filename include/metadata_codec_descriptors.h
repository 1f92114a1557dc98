// Zelta: the descriptors of particular essence kinds (wave and AES3 sound,
// MPEG-2, AVC and MPEG-4 pictures, VBI and ANC data), their value types and
// the composites that bring each group into a model. Part of metadata.h,
// which includes it.
#ifndef ZELTA_INCLUDE_METADATA_CODEC_DESCRIPTORS_H
#define ZELTA_INCLUDE_METADATA_CODEC_DESCRIPTORS_H

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "metadata_descriptors.h"

// ---------------------------------------------------------------------------
// Value types

// The channel status of one AES3 channel, kept as it stands in the file:
// exactly 24 octets.
struct ZELTA_EXPORT AES3ChannelStatusData {
  std::array<std::uint8_t, 24> octets{};
  bool operator==(const AES3ChannelStatusData& o) const { return octets == o.octets; }
  bool operator!=(const AES3ChannelStatusData& o) const { return !(*this == o); }
};

// The sequence or picture parameter sets of an AVC stream. On file a uint32
// count, then each set as one length octet and its octets, so that a set
// has at most 255 octets.
struct ZELTA_EXPORT AVCParameterSetArray {
  std::vector<ByteVector> parameterSets;
  bool operator==(const AVCParameterSetArray& o) const { return parameterSets == o.parameterSets; }
  bool operator!=(const AVCParameterSetArray& o) const { return !(*this == o); }
};

// ---------------------------------------------------------------------------
// Descriptors

// A sound descriptor of wave audio: its block layout and the broadcast wave peak envelope.
class ZELTA_EXPORT WaveAudioDescriptor : public SoundDescriptor {
 public:
  WaveAudioDescriptor();
  ~WaveAudioDescriptor() override;

  static std::shared_ptr<WaveAudioDescriptor> create();

  const std::uint16_t& getBlockAlign() const { return blockAlign_; }
  void setBlockAlign(const std::uint16_t& blockAlign) { blockAlign_ = blockAlign; }

  const std::uint8_t& getSequenceOffset() const;
  void setSequenceOffset(const std::uint8_t& sequenceOffset) { sequenceOffset_ = sequenceOffset; }
  bool hasSequenceOffset() const { return sequenceOffset_.has_value(); }
  void removeSequenceOffset() { sequenceOffset_.reset(); }

  const std::uint32_t& getAverageBytesPerSecond() const { return averageBytesPerSecond_; }
  void setAverageBytesPerSecond(const std::uint32_t& averageBytesPerSecond) {
    averageBytesPerSecond_ = averageBytesPerSecond;
  }

  const KLVKey& getChannelAssignment() const;
  void setChannelAssignment(const KLVKey& channelAssignment) { channelAssignment_ = channelAssignment; }
  bool hasChannelAssignment() const { return channelAssignment_.has_value(); }
  void removeChannelAssignment() { channelAssignment_.reset(); }

  const std::uint32_t& getPeakEnvelopeVersion() const;
  void setPeakEnvelopeVersion(const std::uint32_t& peakEnvelopeVersion) { peakEnvelopeVersion_ = peakEnvelopeVersion; }
  bool hasPeakEnvelopeVersion() const { return peakEnvelopeVersion_.has_value(); }
  void removePeakEnvelopeVersion() { peakEnvelopeVersion_.reset(); }

  const std::uint32_t& getPeakEnvelopeFormat() const;
  void setPeakEnvelopeFormat(const std::uint32_t& peakEnvelopeFormat) { peakEnvelopeFormat_ = peakEnvelopeFormat; }
  bool hasPeakEnvelopeFormat() const { return peakEnvelopeFormat_.has_value(); }
  void removePeakEnvelopeFormat() { peakEnvelopeFormat_.reset(); }

  const std::uint32_t& getPointsPerPeakValue() const;
  void setPointsPerPeakValue(const std::uint32_t& pointsPerPeakValue) { pointsPerPeakValue_ = pointsPerPeakValue; }
  bool hasPointsPerPeakValue() const { return pointsPerPeakValue_.has_value(); }
  void removePointsPerPeakValue() { pointsPerPeakValue_.reset(); }

  const std::uint32_t& getPeakEnvelopeBlockSize() const;
  void setPeakEnvelopeBlockSize(const std::uint32_t& peakEnvelopeBlockSize) {
    peakEnvelopeBlockSize_ = peakEnvelopeBlockSize;
  }
  bool hasPeakEnvelopeBlockSize() const { return peakEnvelopeBlockSize_.has_value(); }
  void removePeakEnvelopeBlockSize() { peakEnvelopeBlockSize_.reset(); }

  const std::uint32_t& getPeakChannels() const;
  void setPeakChannels(const std::uint32_t& peakChannels) { peakChannels_ = peakChannels; }
  bool hasPeakChannels() const { return peakChannels_.has_value(); }
  void removePeakChannels() { peakChannels_.reset(); }

  const std::uint32_t& getPeakFrames() const;
  void setPeakFrames(const std::uint32_t& peakFrames) { peakFrames_ = peakFrames; }
  bool hasPeakFrames() const { return peakFrames_.has_value(); }
  void removePeakFrames() { peakFrames_.reset(); }

  const std::int64_t& getPeakOfPeaksPosition() const;
  void setPeakOfPeaksPosition(const std::int64_t& peakOfPeaksPosition) { peakOfPeaksPosition_ = peakOfPeaksPosition; }
  bool hasPeakOfPeaksPosition() const { return peakOfPeaksPosition_.has_value(); }
  void removePeakOfPeaksPosition() { peakOfPeaksPosition_.reset(); }

  const MXFTimestamp& getPeakEnvelopeTimestamp() const;
  void setPeakEnvelopeTimestamp(const MXFTimestamp& peakEnvelopeTimestamp) {
    peakEnvelopeTimestamp_ = peakEnvelopeTimestamp;
  }
  bool hasPeakEnvelopeTimestamp() const { return peakEnvelopeTimestamp_.has_value(); }
  void removePeakEnvelopeTimestamp() { peakEnvelopeTimestamp_.reset(); }

  const ByteVector& getPeakEnvelopeDataStream() const;
  void setPeakEnvelopeDataStream(const ByteVector& peakEnvelopeDataStream) {
    peakEnvelopeDataStream_ = peakEnvelopeDataStream;
  }
  bool hasPeakEnvelopeDataStream() const { return peakEnvelopeDataStream_.has_value(); }
  void removePeakEnvelopeDataStream() { peakEnvelopeDataStream_.reset(); }

 private:
  std::uint16_t blockAlign_ = 0;
  std::optional<std::uint8_t> sequenceOffset_;
  std::uint32_t averageBytesPerSecond_ = 0;
  std::optional<KLVKey> channelAssignment_;
  std::optional<std::uint32_t> peakEnvelopeVersion_;
  std::optional<std::uint32_t> peakEnvelopeFormat_;
  std::optional<std::uint32_t> pointsPerPeakValue_;
  std::optional<std::uint32_t> peakEnvelopeBlockSize_;
  std::optional<std::uint32_t> peakChannels_;
  std::optional<std::uint32_t> peakFrames_;
  std::optional<std::int64_t> peakOfPeaksPosition_;
  std::optional<MXFTimestamp> peakEnvelopeTimestamp_;
  std::optional<ByteVector> peakEnvelopeDataStream_;
};

// Wave audio carried as AES3: emphasis, block start and the channel status.
class ZELTA_EXPORT AES3AudioDescriptor : public WaveAudioDescriptor {
 public:
  AES3AudioDescriptor();
  ~AES3AudioDescriptor() override;

  static std::shared_ptr<AES3AudioDescriptor> create();

  const std::uint8_t& getEmphasis() const;
  void setEmphasis(const std::uint8_t& emphasis) { emphasis_ = emphasis; }
  bool hasEmphasis() const { return emphasis_.has_value(); }
  void removeEmphasis() { emphasis_.reset(); }

  const std::uint16_t& getBlockStartOffset() const;
  void setBlockStartOffset(const std::uint16_t& blockStartOffset) { blockStartOffset_ = blockStartOffset; }
  bool hasBlockStartOffset() const { return blockStartOffset_.has_value(); }
  void removeBlockStartOffset() { blockStartOffset_.reset(); }

  const std::uint8_t& getAuxiliaryBitsMode() const;
  void setAuxiliaryBitsMode(const std::uint8_t& auxiliaryBitsMode) { auxiliaryBitsMode_ = auxiliaryBitsMode; }
  bool hasAuxiliaryBitsMode() const { return auxiliaryBitsMode_.has_value(); }
  void removeAuxiliaryBitsMode() { auxiliaryBitsMode_.reset(); }

  const ByteVector& getChannelStatusDataMode() const;
  void setChannelStatusDataMode(const ByteVector& channelStatusDataMode) {
    channelStatusDataMode_ = channelStatusDataMode;
  }
  bool hasChannelStatusDataMode() const { return channelStatusDataMode_.has_value(); }
  void removeChannelStatusDataMode() { channelStatusDataMode_.reset(); }

  const std::vector<AES3ChannelStatusData>& getFixedChannelStatusData() const;
  void setFixedChannelStatusData(const std::vector<AES3ChannelStatusData>& fixedChannelStatusData) {
    fixedChannelStatusData_ = fixedChannelStatusData;
  }
  bool hasFixedChannelStatusData() const { return fixedChannelStatusData_.has_value(); }
  void removeFixedChannelStatusData() { fixedChannelStatusData_.reset(); }

 private:
  std::optional<std::uint8_t> emphasis_;
  std::optional<std::uint16_t> blockStartOffset_;
  std::optional<std::uint8_t> auxiliaryBitsMode_;
  std::optional<ByteVector> channelStatusDataMode_;
  std::optional<std::vector<AES3ChannelStatusData>> fixedChannelStatusData_;
};

// An MPEG-2 video picture descriptor: the stream's GOP structure, profile and rate.
class ZELTA_EXPORT MPEGVideoDescriptor : public CDCIPictureDescriptor {
 public:
  MPEGVideoDescriptor();
  ~MPEGVideoDescriptor() override;

  static std::shared_ptr<MPEGVideoDescriptor> create();

  const bool& getSingleSequence() const;
  void setSingleSequence(const bool& singleSequence) { singleSequence_ = singleSequence; }
  bool hasSingleSequence() const { return singleSequence_.has_value(); }
  void removeSingleSequence() { singleSequence_.reset(); }

  const bool& getConstantBFrames() const;
  void setConstantBFrames(const bool& constantBFrames) { constantBFrames_ = constantBFrames; }
  bool hasConstantBFrames() const { return constantBFrames_.has_value(); }
  void removeConstantBFrames() { constantBFrames_.reset(); }

  const std::uint8_t& getCodedContentType() const;
  void setCodedContentType(const std::uint8_t& codedContentType) { codedContentType_ = codedContentType; }
  bool hasCodedContentType() const { return codedContentType_.has_value(); }
  void removeCodedContentType() { codedContentType_.reset(); }

  const bool& getLowDelay() const;
  void setLowDelay(const bool& lowDelay) { lowDelay_ = lowDelay; }
  bool hasLowDelay() const { return lowDelay_.has_value(); }
  void removeLowDelay() { lowDelay_.reset(); }

  const bool& getClosedGOP() const;
  void setClosedGOP(const bool& closedGOP) { closedGOP_ = closedGOP; }
  bool hasClosedGOP() const { return closedGOP_.has_value(); }
  void removeClosedGOP() { closedGOP_.reset(); }

  const bool& getIdenticalGOP() const;
  void setIdenticalGOP(const bool& identicalGOP) { identicalGOP_ = identicalGOP; }
  bool hasIdenticalGOP() const { return identicalGOP_.has_value(); }
  void removeIdenticalGOP() { identicalGOP_.reset(); }

  const std::uint16_t& getMaxGOP() const;
  void setMaxGOP(const std::uint16_t& maxGOP) { maxGOP_ = maxGOP; }
  bool hasMaxGOP() const { return maxGOP_.has_value(); }
  void removeMaxGOP() { maxGOP_.reset(); }

  const std::uint16_t& getBPictureCount() const;
  void setBPictureCount(const std::uint16_t& bPictureCount) { bPictureCount_ = bPictureCount; }
  bool hasBPictureCount() const { return bPictureCount_.has_value(); }
  void removeBPictureCount() { bPictureCount_.reset(); }

  const std::uint32_t& getBitRate() const;
  void setBitRate(const std::uint32_t& bitRate) { bitRate_ = bitRate; }
  bool hasBitRate() const { return bitRate_.has_value(); }
  void removeBitRate() { bitRate_.reset(); }

  const std::uint8_t& getProfileAndLevel() const;
  void setProfileAndLevel(const std::uint8_t& profileAndLevel) { profileAndLevel_ = profileAndLevel; }
  bool hasProfileAndLevel() const { return profileAndLevel_.has_value(); }
  void removeProfileAndLevel() { profileAndLevel_.reset(); }

 private:
  std::optional<bool> singleSequence_;
  std::optional<bool> constantBFrames_;
  std::optional<std::uint8_t> codedContentType_;
  std::optional<bool> lowDelay_;
  std::optional<bool> closedGOP_;
  std::optional<bool> identicalGOP_;
  std::optional<std::uint16_t> maxGOP_;
  std::optional<std::uint16_t> bPictureCount_;
  std::optional<std::uint32_t> bitRate_;
  std::optional<std::uint8_t> profileAndLevel_;
};

// What an AVC stream declares of itself, beside the picture descriptor.
class ZELTA_EXPORT AVCVideoSubDescriptor : public SubDescriptor {
 public:
  AVCVideoSubDescriptor();
  ~AVCVideoSubDescriptor() override;

  static std::shared_ptr<AVCVideoSubDescriptor> create();

  const bool& getConstantBPicture() const;
  void setConstantBPicture(const bool& constantBPicture) { constantBPicture_ = constantBPicture; }
  bool hasConstantBPicture() const { return constantBPicture_.has_value(); }
  void removeConstantBPicture() { constantBPicture_.reset(); }

  const std::uint8_t& getCodedContentKind() const;
  void setCodedContentKind(const std::uint8_t& codedContentKind) { codedContentKind_ = codedContentKind; }
  bool hasCodedContentKind() const { return codedContentKind_.has_value(); }
  void removeCodedContentKind() { codedContentKind_.reset(); }

  const bool& getClosedGOP() const;
  void setClosedGOP(const bool& closedGOP) { closedGOP_ = closedGOP; }
  bool hasClosedGOP() const { return closedGOP_.has_value(); }
  void removeClosedGOP() { closedGOP_.reset(); }

  const bool& getIdenticalGOP() const;
  void setIdenticalGOP(const bool& identicalGOP) { identicalGOP_ = identicalGOP; }
  bool hasIdenticalGOP() const { return identicalGOP_.has_value(); }
  void removeIdenticalGOP() { identicalGOP_.reset(); }

  const std::uint16_t& getMaxGOP() const;
  void setMaxGOP(const std::uint16_t& maxGOP) { maxGOP_ = maxGOP; }
  bool hasMaxGOP() const { return maxGOP_.has_value(); }
  void removeMaxGOP() { maxGOP_.reset(); }

  const std::uint16_t& getBPictureCount() const;
  void setBPictureCount(const std::uint16_t& bPictureCount) { bPictureCount_ = bPictureCount; }
  bool hasBPictureCount() const { return bPictureCount_.has_value(); }
  void removeBPictureCount() { bPictureCount_.reset(); }

  const std::uint32_t& getMaximumBitRate() const;
  void setMaximumBitRate(const std::uint32_t& maximumBitRate) { maximumBitRate_ = maximumBitRate; }
  bool hasMaximumBitRate() const { return maximumBitRate_.has_value(); }
  void removeMaximumBitRate() { maximumBitRate_.reset(); }

  const std::uint32_t& getAverageBitRate() const;
  void setAverageBitRate(const std::uint32_t& averageBitRate) { averageBitRate_ = averageBitRate; }
  bool hasAverageBitRate() const { return averageBitRate_.has_value(); }
  void removeAverageBitRate() { averageBitRate_.reset(); }

  const std::uint8_t& getProfile() const;
  void setProfile(const std::uint8_t& profile) { profile_ = profile; }
  bool hasProfile() const { return profile_.has_value(); }
  void removeProfile() { profile_.reset(); }

  const std::uint8_t& getProfileConstraint() const;
  void setProfileConstraint(const std::uint8_t& profileConstraint) { profileConstraint_ = profileConstraint; }
  bool hasProfileConstraint() const { return profileConstraint_.has_value(); }
  void removeProfileConstraint() { profileConstraint_.reset(); }

  const std::uint8_t& getLevel() const;
  void setLevel(const std::uint8_t& level) { level_ = level; }
  bool hasLevel() const { return level_.has_value(); }
  void removeLevel() { level_.reset(); }

  const std::uint8_t& getDecodingDelay() const;
  void setDecodingDelay(const std::uint8_t& decodingDelay) { decodingDelay_ = decodingDelay; }
  bool hasDecodingDelay() const { return decodingDelay_.has_value(); }
  void removeDecodingDelay() { decodingDelay_.reset(); }

  const std::uint8_t& getMaximumRefFrames() const;
  void setMaximumRefFrames(const std::uint8_t& maximumRefFrames) { maximumRefFrames_ = maximumRefFrames; }
  bool hasMaximumRefFrames() const { return maximumRefFrames_.has_value(); }
  void removeMaximumRefFrames() { maximumRefFrames_.reset(); }

  const std::uint8_t& getSequenceParameterSetFlag() const;
  void setSequenceParameterSetFlag(const std::uint8_t& sequenceParameterSetFlag) {
    sequenceParameterSetFlag_ = sequenceParameterSetFlag;
  }
  bool hasSequenceParameterSetFlag() const { return sequenceParameterSetFlag_.has_value(); }
  void removeSequenceParameterSetFlag() { sequenceParameterSetFlag_.reset(); }

  const std::uint8_t& getPictureParameterSetFlag() const;
  void setPictureParameterSetFlag(const std::uint8_t& pictureParameterSetFlag) {
    pictureParameterSetFlag_ = pictureParameterSetFlag;
  }
  bool hasPictureParameterSetFlag() const { return pictureParameterSetFlag_.has_value(); }
  void removePictureParameterSetFlag() { pictureParameterSetFlag_.reset(); }

  const AVCParameterSetArray& getSequenceParameterSetArray() const;
  void setSequenceParameterSetArray(const AVCParameterSetArray& sequenceParameterSetArray) {
    sequenceParameterSetArray_ = sequenceParameterSetArray;
  }
  bool hasSequenceParameterSetArray() const { return sequenceParameterSetArray_.has_value(); }
  void removeSequenceParameterSetArray() { sequenceParameterSetArray_.reset(); }

  const AVCParameterSetArray& getPictureParameterSetArray() const;
  void setPictureParameterSetArray(const AVCParameterSetArray& pictureParameterSetArray) {
    pictureParameterSetArray_ = pictureParameterSetArray;
  }
  bool hasPictureParameterSetArray() const { return pictureParameterSetArray_.has_value(); }
  void removePictureParameterSetArray() { pictureParameterSetArray_.reset(); }

 private:
  std::optional<bool> constantBPicture_;
  std::optional<std::uint8_t> codedContentKind_;
  std::optional<bool> closedGOP_;
  std::optional<bool> identicalGOP_;
  std::optional<std::uint16_t> maxGOP_;
  std::optional<std::uint16_t> bPictureCount_;
  std::optional<std::uint32_t> maximumBitRate_;
  std::optional<std::uint32_t> averageBitRate_;
  std::optional<std::uint8_t> profile_;
  std::optional<std::uint8_t> profileConstraint_;
  std::optional<std::uint8_t> level_;
  std::optional<std::uint8_t> decodingDelay_;
  std::optional<std::uint8_t> maximumRefFrames_;
  std::optional<std::uint8_t> sequenceParameterSetFlag_;
  std::optional<std::uint8_t> pictureParameterSetFlag_;
  std::optional<AVCParameterSetArray> sequenceParameterSetArray_;
  std::optional<AVCParameterSetArray> pictureParameterSetArray_;
};

// What an MPEG-4 visual stream declares of itself, beside the picture descriptor.
class ZELTA_EXPORT MPEG4VideoSubDescriptor : public SubDescriptor {
 public:
  MPEG4VideoSubDescriptor();
  ~MPEG4VideoSubDescriptor() override;

  static std::shared_ptr<MPEG4VideoSubDescriptor> create();

  const bool& getSingleSequence() const;
  void setSingleSequence(const bool& singleSequence) { singleSequence_ = singleSequence; }
  bool hasSingleSequence() const { return singleSequence_.has_value(); }
  void removeSingleSequence() { singleSequence_.reset(); }

  const bool& getConstantBVOPs() const;
  void setConstantBVOPs(const bool& constantBVOPs) { constantBVOPs_ = constantBVOPs; }
  bool hasConstantBVOPs() const { return constantBVOPs_.has_value(); }
  void removeConstantBVOPs() { constantBVOPs_.reset(); }

  const std::uint8_t& getCodedContentType() const;
  void setCodedContentType(const std::uint8_t& codedContentType) { codedContentType_ = codedContentType; }
  bool hasCodedContentType() const { return codedContentType_.has_value(); }
  void removeCodedContentType() { codedContentType_.reset(); }

  const bool& getLowDelay() const;
  void setLowDelay(const bool& lowDelay) { lowDelay_ = lowDelay; }
  bool hasLowDelay() const { return lowDelay_.has_value(); }
  void removeLowDelay() { lowDelay_.reset(); }

  const bool& getClosedGOV() const;
  void setClosedGOV(const bool& closedGOV) { closedGOV_ = closedGOV; }
  bool hasClosedGOV() const { return closedGOV_.has_value(); }
  void removeClosedGOV() { closedGOV_.reset(); }

  const bool& getIdenticalGOV() const;
  void setIdenticalGOV(const bool& identicalGOV) { identicalGOV_ = identicalGOV; }
  bool hasIdenticalGOV() const { return identicalGOV_.has_value(); }
  void removeIdenticalGOV() { identicalGOV_.reset(); }

  const std::uint16_t& getMaxGOV() const;
  void setMaxGOV(const std::uint16_t& maxGOV) { maxGOV_ = maxGOV; }
  bool hasMaxGOV() const { return maxGOV_.has_value(); }
  void removeMaxGOV() { maxGOV_.reset(); }

  const std::uint16_t& getBVOPCount() const;
  void setBVOPCount(const std::uint16_t& bVOPCount) { bVOPCount_ = bVOPCount; }
  bool hasBVOPCount() const { return bVOPCount_.has_value(); }
  void removeBVOPCount() { bVOPCount_.reset(); }

  const std::uint32_t& getBitRate() const;
  void setBitRate(const std::uint32_t& bitRate) { bitRate_ = bitRate; }
  bool hasBitRate() const { return bitRate_.has_value(); }
  void removeBitRate() { bitRate_.reset(); }

  const std::uint8_t& getProfileAndLevel() const;
  void setProfileAndLevel(const std::uint8_t& profileAndLevel) { profileAndLevel_ = profileAndLevel; }
  bool hasProfileAndLevel() const { return profileAndLevel_.has_value(); }
  void removeProfileAndLevel() { profileAndLevel_.reset(); }

 private:
  std::optional<bool> singleSequence_;
  std::optional<bool> constantBVOPs_;
  std::optional<std::uint8_t> codedContentType_;
  std::optional<bool> lowDelay_;
  std::optional<bool> closedGOV_;
  std::optional<bool> identicalGOV_;
  std::optional<std::uint16_t> maxGOV_;
  std::optional<std::uint16_t> bVOPCount_;
  std::optional<std::uint32_t> bitRate_;
  std::optional<std::uint8_t> profileAndLevel_;
};

// A data descriptor of vertical blanking lines.
class ZELTA_EXPORT VBIDataDescriptor : public DataDescriptor {
 public:
  VBIDataDescriptor();
  ~VBIDataDescriptor() override;

  static std::shared_ptr<VBIDataDescriptor> create();
};

// A data descriptor of ancillary data packets.
class ZELTA_EXPORT ANCDataDescriptor : public DataDescriptor {
 public:
  ANCDataDescriptor();
  ~ANCDataDescriptor() override;

  static std::shared_ptr<ANCDataDescriptor> create();
};

class WaveAudioDescriptorFactory : public MetadataClassFactory<WaveAudioDescriptor, SoundDescriptorFactory> {};
class AES3AudioDescriptorFactory : public MetadataClassFactory<AES3AudioDescriptor, WaveAudioDescriptorFactory> {};
class MPEGVideoDescriptorFactory : public MetadataClassFactory<MPEGVideoDescriptor, CDCIPictureDescriptorFactory> {};
class AVCVideoSubDescriptorFactory : public MetadataClassFactory<AVCVideoSubDescriptor, SubDescriptorFactory> {};
class MPEG4VideoSubDescriptorFactory : public MetadataClassFactory<MPEG4VideoSubDescriptor, SubDescriptorFactory> {};
class VBIDataDescriptorFactory : public MetadataClassFactory<VBIDataDescriptor, DataDescriptorFactory> {};
class ANCDataDescriptorFactory : public MetadataClassFactory<ANCDataDescriptor, DataDescriptorFactory> {};

// ---------------------------------------------------------------------------
// The composites of the codec descriptors. Each stands beside the format's
// composite; a model that holds these descriptors needs both.

// Wave and AES3 sound descriptors.
class ZELTA_EXPORT MXFAES3MetadataModelFactory : public MXFMetadataModelFactory {
 public:
  MXFAES3MetadataModelFactory();
  ~MXFAES3MetadataModelFactory() override;

  const Factories& getFactories() override;

 private:
  Factories factories_;
};

// The MPEG-2 picture descriptor and the MPEG-4 and AVC sub-descriptors.
class ZELTA_EXPORT MXFMPEGMetadataModelFactory : public MXFMetadataModelFactory {
 public:
  MXFMPEGMetadataModelFactory();
  ~MXFMPEGMetadataModelFactory() override;

  const Factories& getFactories() override;

 private:
  Factories factories_;
};

// VBI and ANC data descriptors.
class ZELTA_EXPORT MXFVBIANCMetadataModelFactory : public MXFMetadataModelFactory {
 public:
  MXFVBIANCMetadataModelFactory();
  ~MXFVBIANCMetadataModelFactory() override;

  const Factories& getFactories() override;

 private:
  Factories factories_;
};

#endif
