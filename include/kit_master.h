// Zelta: the master metadata, the flat record of one clip from which the kit
// builds a metadata model and into which it collapses one; the kit's own
// identity. Part of kit.h, which includes it.
#ifndef ZELTA_INCLUDE_KIT_MASTER_H
#define ZELTA_INCLUDE_KIT_MASTER_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "klv_values.h"

// The picture kinds of the kit; every kit-level decision is keyed on one.
enum class ZeltaEssenceFormat : std::uint32_t { D10 = 0, DV = 1, MPEG = 2, Proxy = 3, Raw = 4, AVC = 5 };

// What a master answers for its essence format when it has none.
inline constexpr std::uint32_t ZeltaNoEssenceFormat = 0xFFFFFFFF;
// A duration that is not yet known.
inline constexpr std::uint64_t ZeltaUnknownDuration = 0xFFFFFFFFFFFFFFFF;

// AES3 channel status of one channel.
typedef std::array<std::uint8_t, 24> ZeltaChannelStatus;
// What a channel without channel status of its own answers.
inline constexpr ZeltaChannelStatus ZeltaDefaultChannelStatus{1};

typedef std::pair<std::uint32_t, std::uint32_t> ZeltaSize;
typedef std::pair<std::int32_t, std::int32_t> ZeltaLineMap;

// The product that made a file; a product version of all zeros means none.
struct ZELTA_EXPORT ZeltaIdentification {
  std::wstring companyName;
  std::wstring productName;
  MXFProductVersion productVersion;
  std::wstring versionString;
  MXFUID productUID;
};

// Everything a clip's files can vary in. Implementations answer each
// operation at any time, cheaply and always alike: the builder asks many
// times over, the driver once per edit unit.
class ZELTA_EXPORT ZeltaMasterMetadata {
 public:
  virtual ~ZeltaMasterMetadata();

  // Major byte high: 0x0102, 0x0103.
  virtual std::uint16_t getPrefaceVersion() const = 0;
  virtual ZeltaIdentification getIdentification() const = 0;
  virtual MXFTimestamp getCreationDate() const = 0;
  virtual MXFTimestamp getModificationDate() const = 0;
  // A value of ZeltaEssenceFormat.
  virtual std::uint32_t getEssenceFormat() const = 0;
  virtual UMID getMaterialPackageUID() const = 0;
  virtual UMID getFilePackageUID() const = 0;
  virtual std::wstring getPackageName() const = 0;
  virtual MXFRational getEditRate() const = 0;
  // UTF-8 XML of the text based descriptive framework.
  virtual std::string getDescriptiveText() const = 0;
  virtual std::uint32_t getBitRate() const = 0;
  virtual bool isProgressive() const = 0;
  // Width, then height; the height of one field when not progressive.
  virtual ZeltaSize getDisplaySize() const = 0;
  virtual ZeltaLineMap getVideoLineMap() const = 0;
  virtual MXFRational getAspectRatio() const = 0;
  virtual bool isRGB() const = 0;
  virtual bool isWideRangeRGB() const = 0;
  virtual std::uint32_t getComponentDepth() const = 0;
  // Horizontal, then vertical.
  virtual ZeltaSize getSubsampling() const = 0;
  virtual bool isSimpleStudioProfile() const = 0;
  virtual bool isSingleSequence() const = 0;
  virtual bool hasConstantBFrames() const = 0;
  virtual bool isLowDelay() const = 0;
  virtual bool isClosedGOP() const = 0;
  virtual bool isIdenticalGOP() const = 0;
  // 1 marks an intra-only AVC picture.
  virtual std::uint16_t getMaxGOP() const = 0;
  virtual std::uint16_t getBPictureCount() const = 0;
  // MPEG: the profile-and-level byte; AVC: profile high, level low; Raw: a
  // raw code.
  virtual std::uint16_t getProfileAndLevel() const = 0;
  // Bit value 16 marks intra.
  virtual std::uint8_t getProfileConstraint() const = 0;
  virtual bool isHalfSize() const = 0;
  virtual std::uint32_t getAudioChannelCount() const = 0;
  virtual std::uint32_t getQuantizationBits() const = 0;
  // 0/1 for a channel out of range.
  virtual MXFRational getAudioSamplingRate(std::uint32_t channel) const = 0;
  // ZeltaDefaultChannelStatus for a channel out of range.
  virtual ZeltaChannelStatus getFixedChannelStatusData(std::uint32_t channel) const = 0;
  virtual bool hasAncillaryData() const = 0;
  virtual bool isDropFrame() const = 0;
  // A frame count.
  virtual std::uint64_t getStartTimecode() const = 0;
  virtual std::int64_t getOrigin() const = 0;
  // ZeltaUnknownDuration while unknown.
  virtual std::uint64_t getDuration() const = 0;
  virtual std::uint32_t getIndexSID() const = 0;
  virtual std::uint32_t getBodySID() const = 0;
};

// The plain master: one public field per operation, filled by the code that
// collapses a model. It starts with no essence format, an unknown duration
// and everything else zero or empty.
class ZELTA_EXPORT ZeltaDefaultMetadata : public ZeltaMasterMetadata {
 public:
  ZeltaDefaultMetadata();

  std::uint16_t getPrefaceVersion() const override;
  ZeltaIdentification getIdentification() const override;
  MXFTimestamp getCreationDate() const override;
  MXFTimestamp getModificationDate() const override;
  std::uint32_t getEssenceFormat() const override;
  UMID getMaterialPackageUID() const override;
  UMID getFilePackageUID() const override;
  std::wstring getPackageName() const override;
  MXFRational getEditRate() const override;
  std::string getDescriptiveText() const override;
  std::uint32_t getBitRate() const override;
  bool isProgressive() const override;
  ZeltaSize getDisplaySize() const override;
  ZeltaLineMap getVideoLineMap() const override;
  MXFRational getAspectRatio() const override;
  bool isRGB() const override;
  bool isWideRangeRGB() const override;
  std::uint32_t getComponentDepth() const override;
  ZeltaSize getSubsampling() const override;
  bool isSimpleStudioProfile() const override;
  bool isSingleSequence() const override;
  bool hasConstantBFrames() const override;
  bool isLowDelay() const override;
  bool isClosedGOP() const override;
  bool isIdenticalGOP() const override;
  std::uint16_t getMaxGOP() const override;
  std::uint16_t getBPictureCount() const override;
  std::uint16_t getProfileAndLevel() const override;
  std::uint8_t getProfileConstraint() const override;
  bool isHalfSize() const override;
  std::uint32_t getAudioChannelCount() const override;
  std::uint32_t getQuantizationBits() const override;
  MXFRational getAudioSamplingRate(std::uint32_t channel) const override;
  ZeltaChannelStatus getFixedChannelStatusData(std::uint32_t channel) const override;
  bool hasAncillaryData() const override;
  bool isDropFrame() const override;
  std::uint64_t getStartTimecode() const override;
  std::int64_t getOrigin() const override;
  std::uint64_t getDuration() const override;
  std::uint32_t getIndexSID() const override;
  std::uint32_t getBodySID() const override;

  std::uint16_t prefaceVersion = 0;
  ZeltaIdentification identification;
  MXFTimestamp creationDate;
  MXFTimestamp modificationDate;
  std::uint32_t essenceFormat = ZeltaNoEssenceFormat;
  UMID materialPackageUID;
  UMID filePackageUID;
  std::wstring packageName;
  MXFRational editRate;
  std::string descriptiveText;
  std::uint32_t bitRate = 0;
  bool progressive = false;
  ZeltaSize displaySize;
  ZeltaLineMap videoLineMap;
  MXFRational aspectRatio;
  bool rgb = false;
  bool wideRangeRGB = false;
  std::uint32_t componentDepth = 0;
  ZeltaSize subsampling;
  bool simpleStudioProfile = false;
  bool singleSequence = false;
  bool constantBFrames = false;
  bool lowDelay = false;
  bool closedGOP = false;
  bool identicalGOP = false;
  std::uint16_t maxGOP = 0;
  std::uint16_t bPictureCount = 0;
  std::uint16_t profileAndLevel = 0;
  std::uint8_t profileConstraint = 0;
  bool halfSize = false;
  std::uint32_t audioChannelCount = 0;
  std::uint32_t quantizationBits = 0;
  // One entry per channel.
  std::vector<MXFRational> audioSamplingRates;
  std::vector<ZeltaChannelStatus> fixedChannelStatusData;
  bool ancillaryData = false;
  bool dropFrame = false;
  std::uint64_t startTimecode = 0;
  std::int64_t origin = 0;
  std::uint64_t duration = ZeltaUnknownDuration;
  std::uint32_t indexSID = 0;
  std::uint32_t bodySID = 0;

 private:
  bool hasChannel(std::uint32_t channel, std::size_t listSize) const;
};

// Forwards every operation to the master it holds; a filter overrides only
// what it changes.
class ZELTA_EXPORT DullMetadataFilter : public ZeltaMasterMetadata {
 public:
  explicit DullMetadataFilter(std::shared_ptr<const ZeltaMasterMetadata> metadata);

  std::uint16_t getPrefaceVersion() const override;
  ZeltaIdentification getIdentification() const override;
  MXFTimestamp getCreationDate() const override;
  MXFTimestamp getModificationDate() const override;
  std::uint32_t getEssenceFormat() const override;
  UMID getMaterialPackageUID() const override;
  UMID getFilePackageUID() const override;
  std::wstring getPackageName() const override;
  MXFRational getEditRate() const override;
  std::string getDescriptiveText() const override;
  std::uint32_t getBitRate() const override;
  bool isProgressive() const override;
  ZeltaSize getDisplaySize() const override;
  ZeltaLineMap getVideoLineMap() const override;
  MXFRational getAspectRatio() const override;
  bool isRGB() const override;
  bool isWideRangeRGB() const override;
  std::uint32_t getComponentDepth() const override;
  ZeltaSize getSubsampling() const override;
  bool isSimpleStudioProfile() const override;
  bool isSingleSequence() const override;
  bool hasConstantBFrames() const override;
  bool isLowDelay() const override;
  bool isClosedGOP() const override;
  bool isIdenticalGOP() const override;
  std::uint16_t getMaxGOP() const override;
  std::uint16_t getBPictureCount() const override;
  std::uint16_t getProfileAndLevel() const override;
  std::uint8_t getProfileConstraint() const override;
  bool isHalfSize() const override;
  std::uint32_t getAudioChannelCount() const override;
  std::uint32_t getQuantizationBits() const override;
  MXFRational getAudioSamplingRate(std::uint32_t channel) const override;
  ZeltaChannelStatus getFixedChannelStatusData(std::uint32_t channel) const override;
  bool hasAncillaryData() const override;
  bool isDropFrame() const override;
  std::uint64_t getStartTimecode() const override;
  std::int64_t getOrigin() const override;
  std::uint64_t getDuration() const override;
  std::uint32_t getIndexSID() const override;
  std::uint32_t getBodySID() const override;

 protected:
  const ZeltaMasterMetadata& getMetadata() const { return *metadata_; }

 private:
  std::shared_ptr<const ZeltaMasterMetadata> metadata_;
};

// 4.0.0 build 74, release type 1.
ZELTA_EXPORT MXFProductVersion getZeltaToolkitVersion();
// "Orvane Zelta Toolkit (Linux)".
ZELTA_EXPORT std::wstring getZeltaPlatform();

#endif
