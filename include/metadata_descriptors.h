// Zelta: locators, descriptors, the composite factory of the format and the
// descriptions of properties. Part of metadata.h, which includes it.
#ifndef ZELTA_INCLUDE_METADATA_DESCRIPTORS_H
#define ZELTA_INCLUDE_METADATA_DESCRIPTORS_H

#include <cstddef>
#include <list>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <type_traits>
#include <typeinfo>
#include <variant>

#include "metadata_structural.h"

// ---------------------------------------------------------------------------
// Locators and descriptors

// Where essence outside the file is to be found.
class ZELTA_EXPORT GenericLocator : public MetadataObject {
public:
  GenericLocator();
  ~GenericLocator() override;

  static std::shared_ptr<GenericLocator> create();
};

class ZELTA_EXPORT NetworkLocator : public GenericLocator {
public:
  NetworkLocator();
  ~NetworkLocator() override;

  static std::shared_ptr<NetworkLocator> create();

  const std::wstring& getURLString() const { return urlString_; }
  void setURLString(const std::wstring& urlString) { urlString_ = urlString; }

private:
  std::wstring urlString_;
};

class ZELTA_EXPORT TextLocator : public GenericLocator {
public:
  TextLocator();
  ~TextLocator() override;

  static std::shared_ptr<TextLocator> create();

  const std::wstring& getLocatorName() const { return locatorName_; }
  void setLocatorName(const std::wstring& locatorName) { locatorName_ = locatorName; }

private:
  std::wstring locatorName_;
};

class GenericLocatorFactory : public MetadataClassFactory<GenericLocator, MetadataObjectFactory> {};
class NetworkLocatorFactory : public MetadataClassFactory<NetworkLocator, GenericLocatorFactory> {};
class TextLocatorFactory : public MetadataClassFactory<TextLocator, GenericLocatorFactory> {};

// Eight pairs of a component code and its depth in bits, kept as they stand
// in the file: exactly 16 octets.
struct ZELTA_EXPORT RGBALayout {
  struct Component {
    std::uint8_t code = 0;
    std::uint8_t depth = 0;
    bool operator==(const Component& o) const { return code == o.code && depth == o.depth; }
    bool operator!=(const Component& o) const { return !(*this == o); }
  };

  std::array<Component, 8> components{};
  bool operator==(const RGBALayout& o) const { return components == o.components; }
  bool operator!=(const RGBALayout& o) const { return !(*this == o); }
};

// A further description that hangs under a descriptor.
class ZELTA_EXPORT SubDescriptor : public MetadataObject {
public:
  SubDescriptor();
  ~SubDescriptor() override;

  static std::shared_ptr<SubDescriptor> create();
};

class ZELTA_EXPORT ContainerConstraintsSubDescriptor : public SubDescriptor {
public:
  ContainerConstraintsSubDescriptor();
  ~ContainerConstraintsSubDescriptor() override;

  static std::shared_ptr<ContainerConstraintsSubDescriptor> create();
};

// The base of the essence descriptors: locators and sub-descriptors, both
// optional vectors that the descriptor owns.
class ZELTA_EXPORT GenericDescriptor : public MetadataObject {
public:
  GenericDescriptor();
  ~GenericDescriptor() override;

  static std::shared_ptr<GenericDescriptor> create();

  std::size_t getLocatorCount() const { return locators_.size(); }
  std::shared_ptr<GenericLocator> getLocatorAt(std::size_t index);
  std::shared_ptr<const GenericLocator> getLocatorAt(std::size_t index) const;
  void addLocator(const std::shared_ptr<GenericLocator>& locator);
  void insertLocatorAt(std::size_t index, const std::shared_ptr<GenericLocator>& locator);
  void removeLocatorAt(std::size_t index);
  bool hasLocators() const { return hasLocators_; }
  // Drops the locators without releasing them.
  void removeLocators();

  std::size_t getGenericSubDescriptorCount() const { return genericSubDescriptors_.size(); }
  std::shared_ptr<SubDescriptor> getGenericSubDescriptorAt(std::size_t index);
  std::shared_ptr<const SubDescriptor> getGenericSubDescriptorAt(std::size_t index) const;
  void addGenericSubDescriptor(const std::shared_ptr<SubDescriptor>& subDescriptor);
  void insertGenericSubDescriptorAt(std::size_t index, const std::shared_ptr<SubDescriptor>& subDescriptor);
  void removeGenericSubDescriptorAt(std::size_t index);
  bool hasGenericSubDescriptors() const { return hasGenericSubDescriptors_; }
  // Drops the sub-descriptors without releasing them.
  void removeGenericSubDescriptors();

private:
  // An empty batch read from a file is present all the same, so that writing
  // the object again keeps it; only the class's table marks it, through
  // the library's own class that names the markers.
  friend class GenericDescriptorPresence;
  void markLocatorsPresent() { hasLocators_ = true; }
  void markGenericSubDescriptorsPresent() { hasGenericSubDescriptors_ = true; }

  std::vector<std::shared_ptr<GenericLocator>> locators_;
  bool hasLocators_ = false;
  std::vector<std::shared_ptr<SubDescriptor>> genericSubDescriptors_;
  bool hasGenericSubDescriptors_ = false;
};

class ZELTA_EXPORT FileDescriptor : public GenericDescriptor {
public:
  FileDescriptor();
  ~FileDescriptor() override;

  static std::shared_ptr<FileDescriptor> create();

  const std::uint32_t& getLinkedTrackID() const;
  void setLinkedTrackID(const std::uint32_t& linkedTrackID) { linkedTrackID_ = linkedTrackID; }
  bool hasLinkedTrackID() const { return linkedTrackID_.has_value(); }
  void removeLinkedTrackID() { linkedTrackID_.reset(); }

  const MXFRational& getSampleRate() const { return sampleRate_; }
  void setSampleRate(const MXFRational& sampleRate) { sampleRate_ = sampleRate; }

  const std::int64_t& getContainerDuration() const;
  void setContainerDuration(const std::int64_t& containerDuration) { containerDuration_ = containerDuration; }
  bool hasContainerDuration() const { return containerDuration_.has_value(); }
  void removeContainerDuration() { containerDuration_.reset(); }

  const KLVKey& getEssenceContainer() const { return essenceContainer_; }
  void setEssenceContainer(const KLVKey& essenceContainer) { essenceContainer_ = essenceContainer; }

  const MXFUID& getCodec() const;
  void setCodec(const MXFUID& codec) { codec_ = codec; }
  bool hasCodec() const { return codec_.has_value(); }
  void removeCodec() { codec_.reset(); }

private:
  std::optional<std::uint32_t> linkedTrackID_;
  MXFRational sampleRate_;
  std::optional<std::int64_t> containerDuration_;
  KLVKey essenceContainer_;
  std::optional<MXFUID> codec_;
};

class ZELTA_EXPORT PictureDescriptor : public FileDescriptor {
public:
  PictureDescriptor();
  ~PictureDescriptor() override;

  static std::shared_ptr<PictureDescriptor> create();

  const std::uint8_t& getSignalStandard() const;
  void setSignalStandard(const std::uint8_t& signalStandard) { signalStandard_ = signalStandard; }
  bool hasSignalStandard() const { return signalStandard_.has_value(); }
  void removeSignalStandard() { signalStandard_.reset(); }

  const std::uint8_t& getFrameLayout() const { return frameLayout_; }
  void setFrameLayout(const std::uint8_t& frameLayout) { frameLayout_ = frameLayout; }

  const std::uint32_t& getStoredWidth() const { return storedWidth_; }
  void setStoredWidth(const std::uint32_t& storedWidth) { storedWidth_ = storedWidth; }

  const std::uint32_t& getStoredHeight() const { return storedHeight_; }
  void setStoredHeight(const std::uint32_t& storedHeight) { storedHeight_ = storedHeight; }

  const std::int32_t& getStoredF2Offset() const;
  void setStoredF2Offset(const std::int32_t& storedF2Offset) { storedF2Offset_ = storedF2Offset; }
  bool hasStoredF2Offset() const { return storedF2Offset_.has_value(); }
  void removeStoredF2Offset() { storedF2Offset_.reset(); }

  const std::uint32_t& getSampledWidth() const;
  void setSampledWidth(const std::uint32_t& sampledWidth) { sampledWidth_ = sampledWidth; }
  bool hasSampledWidth() const { return sampledWidth_.has_value(); }
  void removeSampledWidth() { sampledWidth_.reset(); }

  const std::uint32_t& getSampledHeight() const;
  void setSampledHeight(const std::uint32_t& sampledHeight) { sampledHeight_ = sampledHeight; }
  bool hasSampledHeight() const { return sampledHeight_.has_value(); }
  void removeSampledHeight() { sampledHeight_.reset(); }

  const std::int32_t& getSampledXOffset() const;
  void setSampledXOffset(const std::int32_t& sampledXOffset) { sampledXOffset_ = sampledXOffset; }
  bool hasSampledXOffset() const { return sampledXOffset_.has_value(); }
  void removeSampledXOffset() { sampledXOffset_.reset(); }

  const std::int32_t& getSampledYOffset() const;
  void setSampledYOffset(const std::int32_t& sampledYOffset) { sampledYOffset_ = sampledYOffset; }
  bool hasSampledYOffset() const { return sampledYOffset_.has_value(); }
  void removeSampledYOffset() { sampledYOffset_.reset(); }

  const std::uint32_t& getDisplayHeight() const;
  void setDisplayHeight(const std::uint32_t& displayHeight) { displayHeight_ = displayHeight; }
  bool hasDisplayHeight() const { return displayHeight_.has_value(); }
  void removeDisplayHeight() { displayHeight_.reset(); }

  const std::uint32_t& getDisplayWidth() const;
  void setDisplayWidth(const std::uint32_t& displayWidth) { displayWidth_ = displayWidth; }
  bool hasDisplayWidth() const { return displayWidth_.has_value(); }
  void removeDisplayWidth() { displayWidth_.reset(); }

  const std::int32_t& getDisplayXOffset() const;
  void setDisplayXOffset(const std::int32_t& displayXOffset) { displayXOffset_ = displayXOffset; }
  bool hasDisplayXOffset() const { return displayXOffset_.has_value(); }
  void removeDisplayXOffset() { displayXOffset_.reset(); }

  const std::int32_t& getDisplayYOffset() const;
  void setDisplayYOffset(const std::int32_t& displayYOffset) { displayYOffset_ = displayYOffset; }
  bool hasDisplayYOffset() const { return displayYOffset_.has_value(); }
  void removeDisplayYOffset() { displayYOffset_.reset(); }

  const std::int32_t& getDisplayF2Offset() const;
  void setDisplayF2Offset(const std::int32_t& displayF2Offset) { displayF2Offset_ = displayF2Offset; }
  bool hasDisplayF2Offset() const { return displayF2Offset_.has_value(); }
  void removeDisplayF2Offset() { displayF2Offset_.reset(); }

  const MXFRational& getAspectRatio() const { return aspectRatio_; }
  void setAspectRatio(const MXFRational& aspectRatio) { aspectRatio_ = aspectRatio; }

  const std::uint8_t& getActiveFormatDescriptor() const;
  void setActiveFormatDescriptor(const std::uint8_t& activeFormatDescriptor) {
    activeFormatDescriptor_ = activeFormatDescriptor;
  }
  bool hasActiveFormatDescriptor() const { return activeFormatDescriptor_.has_value(); }
  void removeActiveFormatDescriptor() { activeFormatDescriptor_.reset(); }

  const std::vector<std::int32_t>& getVideoLineMap() const { return videoLineMap_; }
  void setVideoLineMap(const std::vector<std::int32_t>& videoLineMap) { videoLineMap_ = videoLineMap; }

  const std::uint8_t& getAlphaTransparency() const;
  void setAlphaTransparency(const std::uint8_t& alphaTransparency) { alphaTransparency_ = alphaTransparency; }
  bool hasAlphaTransparency() const { return alphaTransparency_.has_value(); }
  void removeAlphaTransparency() { alphaTransparency_.reset(); }

  const KLVKey& getCaptureGamma() const;
  void setCaptureGamma(const KLVKey& captureGamma) { captureGamma_ = captureGamma; }
  bool hasCaptureGamma() const { return captureGamma_.has_value(); }
  void removeCaptureGamma() { captureGamma_.reset(); }

  const std::uint32_t& getImageAlignmentOffset() const;
  void setImageAlignmentOffset(const std::uint32_t& imageAlignmentOffset) {
    imageAlignmentOffset_ = imageAlignmentOffset;
  }
  bool hasImageAlignmentOffset() const { return imageAlignmentOffset_.has_value(); }
  void removeImageAlignmentOffset() { imageAlignmentOffset_.reset(); }

  const std::uint32_t& getImageStartOffset() const;
  void setImageStartOffset(const std::uint32_t& imageStartOffset) { imageStartOffset_ = imageStartOffset; }
  bool hasImageStartOffset() const { return imageStartOffset_.has_value(); }
  void removeImageStartOffset() { imageStartOffset_.reset(); }

  const std::uint32_t& getImageEndOffset() const;
  void setImageEndOffset(const std::uint32_t& imageEndOffset) { imageEndOffset_ = imageEndOffset; }
  bool hasImageEndOffset() const { return imageEndOffset_.has_value(); }
  void removeImageEndOffset() { imageEndOffset_.reset(); }

  const std::uint8_t& getFieldDominance() const;
  void setFieldDominance(const std::uint8_t& fieldDominance) { fieldDominance_ = fieldDominance; }
  bool hasFieldDominance() const { return fieldDominance_.has_value(); }
  void removeFieldDominance() { fieldDominance_.reset(); }

  const KLVKey& getPictureEssenceCoding() const;
  void setPictureEssenceCoding(const KLVKey& pictureEssenceCoding) { pictureEssenceCoding_ = pictureEssenceCoding; }
  bool hasPictureEssenceCoding() const { return pictureEssenceCoding_.has_value(); }
  void removePictureEssenceCoding() { pictureEssenceCoding_.reset(); }

  const KLVKey& getCodingEquations() const;
  void setCodingEquations(const KLVKey& codingEquations) { codingEquations_ = codingEquations; }
  bool hasCodingEquations() const { return codingEquations_.has_value(); }
  void removeCodingEquations() { codingEquations_.reset(); }

  const KLVKey& getColourPrimaries() const;
  void setColourPrimaries(const KLVKey& colourPrimaries) { colourPrimaries_ = colourPrimaries; }
  bool hasColourPrimaries() const { return colourPrimaries_.has_value(); }
  void removeColourPrimaries() { colourPrimaries_.reset(); }

private:
  std::optional<std::uint8_t> signalStandard_;
  std::uint8_t frameLayout_ = 0;
  std::uint32_t storedWidth_ = 0;
  std::uint32_t storedHeight_ = 0;
  std::optional<std::int32_t> storedF2Offset_;
  std::optional<std::uint32_t> sampledWidth_;
  std::optional<std::uint32_t> sampledHeight_;
  std::optional<std::int32_t> sampledXOffset_;
  std::optional<std::int32_t> sampledYOffset_;
  std::optional<std::uint32_t> displayHeight_;
  std::optional<std::uint32_t> displayWidth_;
  std::optional<std::int32_t> displayXOffset_;
  std::optional<std::int32_t> displayYOffset_;
  std::optional<std::int32_t> displayF2Offset_;
  MXFRational aspectRatio_;
  std::optional<std::uint8_t> activeFormatDescriptor_;
  std::vector<std::int32_t> videoLineMap_;
  std::optional<std::uint8_t> alphaTransparency_;
  std::optional<KLVKey> captureGamma_;
  std::optional<std::uint32_t> imageAlignmentOffset_;
  std::optional<std::uint32_t> imageStartOffset_;
  std::optional<std::uint32_t> imageEndOffset_;
  std::optional<std::uint8_t> fieldDominance_;
  std::optional<KLVKey> pictureEssenceCoding_;
  std::optional<KLVKey> codingEquations_;
  std::optional<KLVKey> colourPrimaries_;
};

// Colour difference component pictures.
class ZELTA_EXPORT CDCIPictureDescriptor : public PictureDescriptor {
public:
  CDCIPictureDescriptor();
  ~CDCIPictureDescriptor() override;

  static std::shared_ptr<CDCIPictureDescriptor> create();

  const std::uint32_t& getComponentDepth() const { return componentDepth_; }
  void setComponentDepth(const std::uint32_t& componentDepth) { componentDepth_ = componentDepth; }

  const std::uint32_t& getHorizontalSubsampling() const { return horizontalSubsampling_; }
  void setHorizontalSubsampling(const std::uint32_t& horizontalSubsampling) {
    horizontalSubsampling_ = horizontalSubsampling;
  }

  const std::uint32_t& getVerticalSubsampling() const;
  void setVerticalSubsampling(const std::uint32_t& verticalSubsampling) { verticalSubsampling_ = verticalSubsampling; }
  bool hasVerticalSubsampling() const { return verticalSubsampling_.has_value(); }
  void removeVerticalSubsampling() { verticalSubsampling_.reset(); }

  const std::uint8_t& getColourSiting() const;
  void setColourSiting(const std::uint8_t& colourSiting) { colourSiting_ = colourSiting; }
  bool hasColourSiting() const { return colourSiting_.has_value(); }
  void removeColourSiting() { colourSiting_.reset(); }

  const bool& getReversedByteOrder() const;
  void setReversedByteOrder(const bool& reversedByteOrder) { reversedByteOrder_ = reversedByteOrder; }
  bool hasReversedByteOrder() const { return reversedByteOrder_.has_value(); }
  void removeReversedByteOrder() { reversedByteOrder_.reset(); }

  const std::int16_t& getPaddingBits() const;
  void setPaddingBits(const std::int16_t& paddingBits) { paddingBits_ = paddingBits; }
  bool hasPaddingBits() const { return paddingBits_.has_value(); }
  void removePaddingBits() { paddingBits_.reset(); }

  const std::uint32_t& getAlphaSamplingDepth() const;
  void setAlphaSamplingDepth(const std::uint32_t& alphaSamplingDepth) { alphaSamplingDepth_ = alphaSamplingDepth; }
  bool hasAlphaSamplingDepth() const { return alphaSamplingDepth_.has_value(); }
  void removeAlphaSamplingDepth() { alphaSamplingDepth_.reset(); }

  const std::uint32_t& getBlackReferenceLevel() const;
  void setBlackReferenceLevel(const std::uint32_t& blackReferenceLevel) { blackReferenceLevel_ = blackReferenceLevel; }
  bool hasBlackReferenceLevel() const { return blackReferenceLevel_.has_value(); }
  void removeBlackReferenceLevel() { blackReferenceLevel_.reset(); }

  const std::uint32_t& getWhiteReferenceLevel() const;
  void setWhiteReferenceLevel(const std::uint32_t& whiteReferenceLevel) { whiteReferenceLevel_ = whiteReferenceLevel; }
  bool hasWhiteReferenceLevel() const { return whiteReferenceLevel_.has_value(); }
  void removeWhiteReferenceLevel() { whiteReferenceLevel_.reset(); }

  const std::uint32_t& getColourRange() const;
  void setColourRange(const std::uint32_t& colourRange) { colourRange_ = colourRange; }
  bool hasColourRange() const { return colourRange_.has_value(); }
  void removeColourRange() { colourRange_.reset(); }

private:
  std::uint32_t componentDepth_ = 0;
  std::uint32_t horizontalSubsampling_ = 0;
  std::optional<std::uint32_t> verticalSubsampling_;
  std::optional<std::uint8_t> colourSiting_;
  std::optional<bool> reversedByteOrder_;
  std::optional<std::int16_t> paddingBits_;
  std::optional<std::uint32_t> alphaSamplingDepth_;
  std::optional<std::uint32_t> blackReferenceLevel_;
  std::optional<std::uint32_t> whiteReferenceLevel_;
  std::optional<std::uint32_t> colourRange_;
};

// Component pictures, red, green, blue and alpha.
class ZELTA_EXPORT RGBAPictureDescriptor : public PictureDescriptor {
public:
  RGBAPictureDescriptor();
  ~RGBAPictureDescriptor() override;

  static std::shared_ptr<RGBAPictureDescriptor> create();

  const std::uint32_t& getComponentMaxReferenceLevel() const;
  void setComponentMaxReferenceLevel(const std::uint32_t& level) { componentMaxReferenceLevel_ = level; }
  bool hasComponentMaxReferenceLevel() const { return componentMaxReferenceLevel_.has_value(); }
  void removeComponentMaxReferenceLevel() { componentMaxReferenceLevel_.reset(); }

  const std::uint32_t& getComponentMinReferenceLevel() const;
  void setComponentMinReferenceLevel(const std::uint32_t& level) { componentMinReferenceLevel_ = level; }
  bool hasComponentMinReferenceLevel() const { return componentMinReferenceLevel_.has_value(); }
  void removeComponentMinReferenceLevel() { componentMinReferenceLevel_.reset(); }

  const std::uint32_t& getAlphaMaxReferenceLevel() const;
  void setAlphaMaxReferenceLevel(const std::uint32_t& level) { alphaMaxReferenceLevel_ = level; }
  bool hasAlphaMaxReferenceLevel() const { return alphaMaxReferenceLevel_.has_value(); }
  void removeAlphaMaxReferenceLevel() { alphaMaxReferenceLevel_.reset(); }

  const std::uint32_t& getAlphaMinReferenceLevel() const;
  void setAlphaMinReferenceLevel(const std::uint32_t& level) { alphaMinReferenceLevel_ = level; }
  bool hasAlphaMinReferenceLevel() const { return alphaMinReferenceLevel_.has_value(); }
  void removeAlphaMinReferenceLevel() { alphaMinReferenceLevel_.reset(); }

  const std::uint8_t& getScanningDirection() const;
  void setScanningDirection(const std::uint8_t& scanningDirection) { scanningDirection_ = scanningDirection; }
  bool hasScanningDirection() const { return scanningDirection_.has_value(); }
  void removeScanningDirection() { scanningDirection_.reset(); }

  const RGBALayout& getPixelLayout() const { return pixelLayout_; }
  void setPixelLayout(const RGBALayout& pixelLayout) { pixelLayout_ = pixelLayout; }

  const ByteVector& getPalette() const;
  void setPalette(const ByteVector& palette) { palette_ = palette; }
  bool hasPalette() const { return palette_.has_value(); }
  void removePalette() { palette_.reset(); }

  const RGBALayout& getPaletteLayout() const;
  void setPaletteLayout(const RGBALayout& paletteLayout) { paletteLayout_ = paletteLayout; }
  bool hasPaletteLayout() const { return paletteLayout_.has_value(); }
  void removePaletteLayout() { paletteLayout_.reset(); }

private:
  std::optional<std::uint32_t> componentMaxReferenceLevel_;
  std::optional<std::uint32_t> componentMinReferenceLevel_;
  std::optional<std::uint32_t> alphaMaxReferenceLevel_;
  std::optional<std::uint32_t> alphaMinReferenceLevel_;
  std::optional<std::uint8_t> scanningDirection_;
  RGBALayout pixelLayout_;
  std::optional<ByteVector> palette_;
  std::optional<RGBALayout> paletteLayout_;
};

class ZELTA_EXPORT SoundDescriptor : public FileDescriptor {
public:
  // The audio sampling rate starts at 0/1.
  SoundDescriptor();
  ~SoundDescriptor() override;

  static std::shared_ptr<SoundDescriptor> create();

  const MXFRational& getAudioSamplingRate() const { return audioSamplingRate_; }
  void setAudioSamplingRate(const MXFRational& audioSamplingRate) { audioSamplingRate_ = audioSamplingRate; }

  const bool& getLocked() const { return locked_; }
  void setLocked(const bool& locked) { locked_ = locked; }

  const std::int8_t& getAudioReferenceLevel() const;
  void setAudioReferenceLevel(const std::int8_t& audioReferenceLevel) { audioReferenceLevel_ = audioReferenceLevel; }
  bool hasAudioReferenceLevel() const { return audioReferenceLevel_.has_value(); }
  void removeAudioReferenceLevel() { audioReferenceLevel_.reset(); }

  const std::uint8_t& getElectroSpatialFormulation() const;
  void setElectroSpatialFormulation(const std::uint8_t& formulation) { electroSpatialFormulation_ = formulation; }
  bool hasElectroSpatialFormulation() const { return electroSpatialFormulation_.has_value(); }
  void removeElectroSpatialFormulation() { electroSpatialFormulation_.reset(); }

  const std::uint32_t& getChannelCount() const { return channelCount_; }
  void setChannelCount(const std::uint32_t& channelCount) { channelCount_ = channelCount; }

  const std::uint32_t& getQuantizationBits() const { return quantizationBits_; }
  void setQuantizationBits(const std::uint32_t& quantizationBits) { quantizationBits_ = quantizationBits; }

  const std::int8_t& getDialNorm() const;
  void setDialNorm(const std::int8_t& dialNorm) { dialNorm_ = dialNorm; }
  bool hasDialNorm() const { return dialNorm_.has_value(); }
  void removeDialNorm() { dialNorm_.reset(); }

  const KLVKey& getSoundEssenceCompression() const;
  void setSoundEssenceCompression(const KLVKey& compression) { soundEssenceCompression_ = compression; }
  bool hasSoundEssenceCompression() const { return soundEssenceCompression_.has_value(); }
  void removeSoundEssenceCompression() { soundEssenceCompression_.reset(); }

private:
  MXFRational audioSamplingRate_;
  bool locked_ = false;
  std::optional<std::int8_t> audioReferenceLevel_;
  std::optional<std::uint8_t> electroSpatialFormulation_;
  std::uint32_t channelCount_ = 0;
  std::uint32_t quantizationBits_ = 0;
  std::optional<std::int8_t> dialNorm_;
  std::optional<KLVKey> soundEssenceCompression_;
};

class ZELTA_EXPORT DataDescriptor : public FileDescriptor {
public:
  DataDescriptor();
  ~DataDescriptor() override;

  static std::shared_ptr<DataDescriptor> create();

  const KLVKey& getDataEssenceCoding() const;
  void setDataEssenceCoding(const KLVKey& dataEssenceCoding) { dataEssenceCoding_ = dataEssenceCoding; }
  bool hasDataEssenceCoding() const { return dataEssenceCoding_.has_value(); }
  void removeDataEssenceCoding() { dataEssenceCoding_.reset(); }

private:
  std::optional<KLVKey> dataEssenceCoding_;
};

// The descriptor of a container that interleaves several essences: one
// file descriptor for each.
class ZELTA_EXPORT MultipleDescriptor : public FileDescriptor {
public:
  MultipleDescriptor();
  ~MultipleDescriptor() override;

  static std::shared_ptr<MultipleDescriptor> create();

  std::size_t getSubDescriptorCount() const { return subDescriptors_.size(); }
  std::shared_ptr<FileDescriptor> getSubDescriptorAt(std::size_t index);
  std::shared_ptr<const FileDescriptor> getSubDescriptorAt(std::size_t index) const;
  void addSubDescriptor(const std::shared_ptr<FileDescriptor>& subDescriptor);
  void insertSubDescriptorAt(std::size_t index, const std::shared_ptr<FileDescriptor>& subDescriptor);
  void removeSubDescriptorAt(std::size_t index);

private:
  std::vector<std::shared_ptr<FileDescriptor>> subDescriptors_;
};

class SubDescriptorFactory : public MetadataClassFactory<SubDescriptor, MetadataObjectFactory> {};
class ContainerConstraintsSubDescriptorFactory
    : public MetadataClassFactory<ContainerConstraintsSubDescriptor, SubDescriptorFactory> {};
class GenericDescriptorFactory : public MetadataClassFactory<GenericDescriptor, MetadataObjectFactory> {};
class FileDescriptorFactory : public MetadataClassFactory<FileDescriptor, GenericDescriptorFactory> {};
class PictureDescriptorFactory : public MetadataClassFactory<PictureDescriptor, FileDescriptorFactory> {};
class CDCIPictureDescriptorFactory : public MetadataClassFactory<CDCIPictureDescriptor, PictureDescriptorFactory> {};
class RGBAPictureDescriptorFactory : public MetadataClassFactory<RGBAPictureDescriptor, PictureDescriptorFactory> {};
class SoundDescriptorFactory : public MetadataClassFactory<SoundDescriptor, FileDescriptorFactory> {};
class DataDescriptorFactory : public MetadataClassFactory<DataDescriptor, FileDescriptorFactory> {};
class MultipleDescriptorFactory : public MetadataClassFactory<MultipleDescriptor, FileDescriptorFactory> {};

// Complete picture descriptors from an essence container label, every
// value the label implies filled in. A DV label names a kind (octet 14) and
// a wrapping (octet 15); the Preface version decides the colour siting of
// 625-line pictures. A D-10 label names a kind (octet 14) and a wrapping
// (octet 15). Both fail on a label that they can't describe.
ZELTA_EXPORT std::shared_ptr<CDCIPictureDescriptor> createDVPictureDescriptor(const KLVKey& essenceContainer,
                                                                 std::uint16_t prefaceVersion);
ZELTA_EXPORT std::shared_ptr<CDCIPictureDescriptor> createD10PictureDescriptor(const KLVKey& essenceContainer);

// ---------------------------------------------------------------------------
// The composite of the format's classes

// Every class of the format that a file may hold as a set, in search order:
// the structural classes, the locators and the descriptors. Sets of other
// classes are dark to it.
class ZELTA_EXPORT MXFFormatMetadataModelFactory : public MXFMetadataModelFactory {
public:
  MXFFormatMetadataModelFactory();
  ~MXFFormatMetadataModelFactory() override;

  const Factories& getFactories() override;

private:
  Factories factories_;
};

// ---------------------------------------------------------------------------
// Property descriptions
//
// How a client that holds only a factory can show an object: the factory's
// code gives each property's octets under its key, and the description of
// the key says what the octets hold.

// The value types of the class tables. A batch is a counted vector; opaque
// is a value type without a kind of its own, shown by its octets.
enum class MXFPropertyKind {
  uint8,
  uint16,
  uint32,
  uint64,
  int8,
  int16,
  int32,
  int64,
  boolean,
  rational,
  timestamp,
  productVersion,
  key,
  uid,
  umid,
  wideString,
  narrowString,  // octets as they stand
  bytes,
  uint32Batch,
  int32Batch,
  keyBatch,
  rgbaLayout,
  strongReference,
  weakReference,
  strongReferenceVector,
  opaque
};

struct ZELTA_EXPORT MXFPropertyDescription {
  std::string name;  // class, point, property: "Track.trackID"
  MXFPropertyKind kind;
};

#endif
