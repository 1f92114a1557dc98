// Zelta: D-10 essence: the parameters from which its sizes and labels
// derive, and its edit units as typed events both ways.
// Part of mxf.h, which includes it.
#ifndef ZELTA_INCLUDE_MXF_D10_H
#define ZELTA_INCLUDE_MXF_D10_H

#include <cstdint>
#include <memory>
#include <optional>

#include "mxf_index.h"
#include "mxf_system.h"

inline constexpr KLVKey MXFD10PictureElementKey = KLVKey(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x05, 0x01, 0x01, 0x00});
inline constexpr KLVKey MXFD10SoundElementKey = KLVKey(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x06, 0x01, 0x10, 0x00});

// Sizes of the groups of a D-10 edit unit: each element with its key, its
// four-octet length and a fill item, rounded up to the KAG.
inline constexpr std::uint32_t MXFD10KAGSize = 512;
inline constexpr std::uint32_t MXFD10SystemItemSize = 512;

// How many samples each frame carries: eight channels of four octets after
// a four-octet element header.
class ZELTA_EXPORT MXFD10SoundParameters {
public:
  virtual ~MXFD10SoundParameters();
  virtual std::uint32_t getMaximumElementLength() const = 0;
  virtual std::uint32_t getElementLength(std::int32_t frame) const = 0;
  virtual std::uint32_t getMaximumSampleCount() const = 0;
  virtual std::uint32_t getSampleCount(std::int32_t frame) const = 0;
  virtual std::uint32_t getSequenceNumber(std::int32_t frame) const = 0;
};

// The same count for every frame; the rate must divide 48000 ("integer
// sample count per frame").
class ZELTA_EXPORT RegularSoundParameters : public MXFD10SoundParameters {
public:
  explicit RegularSoundParameters(std::uint32_t rate);

  std::uint32_t getMaximumElementLength() const override;
  std::uint32_t getElementLength(std::int32_t frame) const override;
  std::uint32_t getMaximumSampleCount() const override;
  std::uint32_t getSampleCount(std::int32_t frame) const override;
  std::uint32_t getSequenceNumber(std::int32_t frame) const override;

private:
  std::uint32_t sampleCount_;
};

// 30000/1001: a five-frame sequence of 8008 samples.
class ZELTA_EXPORT NTSCSoundParameters : public MXFD10SoundParameters {
public:
  std::uint32_t getMaximumElementLength() const override;
  std::uint32_t getElementLength(std::int32_t frame) const override;
  std::uint32_t getMaximumSampleCount() const override;
  std::uint32_t getSampleCount(std::int32_t frame) const override;
  std::uint32_t getSequenceNumber(std::int32_t frame) const override;
};

struct ZELTA_EXPORT MXFD10PictureGeometry {
  std::uint32_t storedHeight = 0;
  std::uint32_t sampledHeight = 0;
  std::uint32_t displayHeight = 0;
  std::int32_t displayYOffset = 0;
  std::int32_t videoLineMap[2] = {0, 0};
};

class ZELTA_EXPORT MXFD10Parameters {
public:
  explicit MXFD10Parameters(std::uint32_t bitRate);
  virtual ~MXFD10Parameters();

  // The extended form has 02 as its last octet.
  virtual KLVKey getEssenceContainer(bool extended) const = 0;
  virtual MXFRational getEditRate() const = 0;
  virtual const MXFD10SoundParameters& getSoundParameters() const = 0;
  virtual std::uint8_t getContentPackageRate() const = 0;
  virtual std::uint32_t getFrameSize() const = 0;
  virtual MXFD10PictureGeometry getPictureGeometry() const = 0;
  virtual KLVKey getPictureCoding() const = 0;
  virtual KLVKey getVideoSystem() const = 0;

  std::uint32_t getBitRate() const { return bitRate_; }

protected:
  // The format octet of the labels: "valid bit rate".
  std::uint8_t formatOctet(bool ntsc) const;

private:
  std::uint32_t bitRate_;
};

// 625 lines; the labels need the frame rate 25 ("valid frame rate").
class ZELTA_EXPORT RegularParameters : public MXFD10Parameters {
public:
  RegularParameters(std::uint32_t bitRate, std::uint32_t frameRate);

  KLVKey getEssenceContainer(bool extended) const override;
  MXFRational getEditRate() const override;
  const MXFD10SoundParameters& getSoundParameters() const override;
  std::uint8_t getContentPackageRate() const override;
  std::uint32_t getFrameSize() const override;
  MXFD10PictureGeometry getPictureGeometry() const override;
  KLVKey getPictureCoding() const override;
  KLVKey getVideoSystem() const override;

  std::uint32_t getFrameRate() const { return frameRate_; }

private:
  void checkFrameRate() const;

  std::uint32_t frameRate_;
  RegularSoundParameters sound_;
};

// 525 lines at 30000/1001.
class ZELTA_EXPORT NTSCParameters : public MXFD10Parameters {
public:
  explicit NTSCParameters(std::uint32_t bitRate);

  KLVKey getEssenceContainer(bool extended) const override;
  MXFRational getEditRate() const override;
  const MXFD10SoundParameters& getSoundParameters() const override;
  std::uint8_t getContentPackageRate() const override;
  std::uint32_t getFrameSize() const override;
  MXFD10PictureGeometry getPictureGeometry() const override;
  KLVKey getPictureCoding() const override;
  KLVKey getVideoSystem() const override;

private:
  NTSCSoundParameters sound_;
};

// The parameters of a D-10 essence container label, plain or extended
// ("valid D-10 essenceContainer").
ZELTA_EXPORT std::unique_ptr<MXFD10Parameters> createMXFD10Parameters(const KLVKey& essenceContainer);

// Padded sizes of the groups of an edit unit.
ZELTA_EXPORT std::uint32_t getMXFD10PictureGroupSize(const MXFD10Parameters& parameters);
ZELTA_EXPORT std::uint32_t getMXFD10SoundGroupSize(const MXFD10Parameters& parameters);
ZELTA_EXPORT std::uint32_t getMXFD10EditUnitSize(const MXFD10Parameters& parameters);

// The constant-rate index segment of a D-10 stream.
ZELTA_EXPORT MXFIndexTableSegment createMXFD10IndexSegment(const MXFD10Parameters& parameters,
                                                           std::uint32_t indexSID, std::uint32_t bodySID);

// What the system item of each edit unit says; a stamp whose first octet
// is 0 is absent.
struct ZELTA_EXPORT MXFD10SystemInformation {
  std::uint16_t continuityCount = 0;
  KLVKey essenceContainer;
  MXFSDTICPTimeStamp creationStamp{};
  MXFSDTICPTimeStamp userStamp{};
};

// The package metadata set: a UMID (tag 0x83, 32 or 64 octets) and KLV
// metadata (tag 0x88).
inline constexpr std::uint16_t MXFD10UMIDTag = 0x83;
inline constexpr std::uint16_t MXFD10KLVMetadataTag = 0x88;

struct ZELTA_EXPORT MXFD10PackageMetadata {
  std::optional<UMID> umid;
  std::optional<ByteVector> klvMetadata;
};

ZELTA_EXPORT MXFGCLocalItems codeMXFD10PackageMetadata(const MXFD10PackageMetadata& metadata);
// Other tags are ignored and the last item of a tag wins; a UMID of another
// size fails "valid size".
ZELTA_EXPORT MXFD10PackageMetadata parseMXFD10PackageMetadata(const MXFGCLocalItems& items);

class ZELTA_EXPORT MXFD10EssenceHandler {
public:
  virtual ~MXFD10EssenceHandler();
  virtual void startD10() = 0;
  virtual void endD10() = 0;
  virtual void d10System(const MXFD10SystemInformation& system, const MXFGCLocalItems& packageMetadata) = 0;
  virtual void d10Picture(const std::uint8_t* data, std::uint64_t length) = 0;
  virtual void d10Sound(const std::uint8_t* data, std::uint64_t length) = 0;
};

// Writes D-10 edit units on a KLV handler: d10System, d10Picture and
// d10Sound in this order make one edit unit. The parameters come from the
// first d10System's label ("parameters are present").
class ZELTA_EXPORT MXFD10EssenceCoder : public MXFD10EssenceHandler {
public:
  explicit MXFD10EssenceCoder(KLVHandler* handler);
  ~MXFD10EssenceCoder() override;
  MXFD10EssenceCoder(const MXFD10EssenceCoder&) = delete;
  MXFD10EssenceCoder& operator=(const MXFD10EssenceCoder&) = delete;

  void startD10() override;
  void endD10() override;
  void d10System(const MXFD10SystemInformation& system, const MXFGCLocalItems& packageMetadata) override;
  void d10Picture(const std::uint8_t* data, std::uint64_t length) override;
  void d10Sound(const std::uint8_t* data, std::uint64_t length) override;

  // Where the next octet goes in what the coder wrote.
  Locator* getLocator();

private:
  class Impl;
  std::unique_ptr<Impl> impl_;
};

// Reads the KLV stream of a D-10 essence container into D-10 events.
class ZELTA_EXPORT MXFD10EssenceParser : public KLVForwarder {
public:
  explicit MXFD10EssenceParser(MXFD10EssenceHandler* handler);
  ~MXFD10EssenceParser() override;
  MXFD10EssenceParser(const MXFD10EssenceParser&) = delete;
  MXFD10EssenceParser& operator=(const MXFD10EssenceParser&) = delete;

  KLVHandler* getHandler() override;
  virtual void setErrorHandler(ErrorHandler* errorHandler);

private:
  class Impl;
  std::unique_ptr<Impl> impl_;
};

#endif
