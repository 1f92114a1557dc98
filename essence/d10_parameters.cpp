#include "mxf.h"

namespace {

constexpr std::uint32_t sampleRate = 48000;
// Eight channels of four octets each, after a four-octet element header.
constexpr std::uint32_t octetsPerSample = 32;
constexpr std::uint32_t soundElementHeader = 4;
// One key, one four-octet length, twice: the element's and its fill item's.
constexpr std::uint32_t groupOverhead = 2 * (16 + 1 + 4);

constexpr std::uint32_t ntscSequence[5] = {1602, 1601, 1602, 1601, 1602};

// Octet 15 of the D-10 container label selects the format by bit rate and
// line count; octet 16 is 01 plain or 02 extended.
constexpr std::array<std::uint8_t, 16> containerLabel{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01,
                                                      0x0D, 0x01, 0x03, 0x01, 0x02, 0x01, 0x00, 0x01};
constexpr std::array<std::uint8_t, 16> pictureCodingLabel{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01,
                                                          0x04, 0x01, 0x02, 0x02, 0x01, 0x02, 0x01, 0x00};
constexpr KLVKey regularVideoSystem{std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01,
                                                                 0x04, 0x01, 0x01, 0x01, 0x01, 0x01, 0x00, 0x00}};
constexpr KLVKey ntscVideoSystem{std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x01, 0x04,
                                                              0x01, 0x01, 0x01, 0x01, 0x02, 0x00, 0x00}};

struct BitRateFormat {
  std::uint32_t bitRate;
  std::uint8_t regularFormat;  // the 525-line format is the next one
};
constexpr BitRateFormat bitRateFormats[] = {{50000000, 0x01}, {40000000, 0x03}, {30000000, 0x05}};

struct PackageRate {
  std::uint32_t frameRate;
  std::uint8_t rate;
};
constexpr PackageRate packageRates[] = {{24, 2},  {25, 4},  {30, 6},  {48, 8},   {50, 10},  {60, 12},
                                        {72, 14}, {75, 16}, {90, 18}, {96, 20}, {100, 22}, {120, 24}};
// 30000/1001 is 30 with the 1000/1001 bit set.
constexpr std::uint8_t ntscPackageRate = 6 + 1;

constexpr std::uint32_t roundUpToKAG(std::uint32_t size) {
  return (size + MXFD10KAGSize - 1) / MXFD10KAGSize * MXFD10KAGSize;
}

// The frame's place in a five-frame sequence; frame 0 starts one, and frames
// before it count backwards through the same sequence.
std::uint32_t sequenceIndex(std::int32_t frame) {
  const std::int32_t index = frame % 5;
  return static_cast<std::uint32_t>(index < 0 ? index + 5 : index);
}

KLVKey withFormat(std::array<std::uint8_t, 16> octets, std::uint8_t format, std::uint8_t last) {
  octets[14] = format;
  octets[15] = last;
  return KLVKey(octets);
}

}  // namespace

// ---------------------------------------------------------------------------
// Sound

MXFD10SoundParameters::~MXFD10SoundParameters() = default;

RegularSoundParameters::RegularSoundParameters(std::uint32_t rate) : sampleCount_(0) {
  check(rate != 0 && sampleRate % rate == 0, "integer sample count per frame");
  sampleCount_ = sampleRate / rate;
}

std::uint32_t RegularSoundParameters::getMaximumElementLength() const {
  return sampleCount_ * octetsPerSample + soundElementHeader;
}

std::uint32_t RegularSoundParameters::getElementLength(std::int32_t) const { return getMaximumElementLength(); }

std::uint32_t RegularSoundParameters::getMaximumSampleCount() const { return sampleCount_; }

std::uint32_t RegularSoundParameters::getSampleCount(std::int32_t) const { return sampleCount_; }

std::uint32_t RegularSoundParameters::getSequenceNumber(std::int32_t) const { return 0; }

std::uint32_t NTSCSoundParameters::getMaximumElementLength() const {
  return getMaximumSampleCount() * octetsPerSample + soundElementHeader;
}

std::uint32_t NTSCSoundParameters::getElementLength(std::int32_t frame) const {
  return getSampleCount(frame) * octetsPerSample + soundElementHeader;
}

std::uint32_t NTSCSoundParameters::getMaximumSampleCount() const { return ntscSequence[0]; }

std::uint32_t NTSCSoundParameters::getSampleCount(std::int32_t frame) const {
  return ntscSequence[sequenceIndex(frame)];
}

std::uint32_t NTSCSoundParameters::getSequenceNumber(std::int32_t frame) const { return sequenceIndex(frame) + 1; }

// ---------------------------------------------------------------------------
// Picture and container

MXFD10Parameters::MXFD10Parameters(std::uint32_t bitRate) : bitRate_(bitRate) {}

MXFD10Parameters::~MXFD10Parameters() = default;

std::uint8_t MXFD10Parameters::formatOctet(bool ntsc) const {
  for (const BitRateFormat& format : bitRateFormats)
    if (format.bitRate == bitRate_) return static_cast<std::uint8_t>(format.regularFormat + (ntsc ? 1 : 0));
  throw util::assertion_failure("valid bit rate");
}

RegularParameters::RegularParameters(std::uint32_t bitRate, std::uint32_t frameRate)
    : MXFD10Parameters(bitRate), frameRate_(frameRate), sound_(frameRate) {}

void RegularParameters::checkFrameRate() const { check(frameRate_ == 25, "valid frame rate"); }

KLVKey RegularParameters::getEssenceContainer(bool extended) const {
  checkFrameRate();
  return withFormat(containerLabel, formatOctet(false), extended ? 0x02 : 0x01);
}

MXFRational RegularParameters::getEditRate() const {
  return MXFRational{static_cast<std::int32_t>(frameRate_), 1};
}

const MXFD10SoundParameters& RegularParameters::getSoundParameters() const { return sound_; }

std::uint8_t RegularParameters::getContentPackageRate() const {
  for (const PackageRate& entry : packageRates)
    if (entry.frameRate == frameRate_) return entry.rate;
  throw util::assertion_failure("valid frame rate");
}

std::uint32_t RegularParameters::getFrameSize() const { return getBitRate() / frameRate_ / 8; }

MXFD10PictureGeometry RegularParameters::getPictureGeometry() const {
  checkFrameRate();
  return MXFD10PictureGeometry{304, 304, 288, 16, {7, 320}};
}

KLVKey RegularParameters::getPictureCoding() const {
  checkFrameRate();
  return withFormat(pictureCodingLabel, 0x01, formatOctet(false));
}

KLVKey RegularParameters::getVideoSystem() const {
  checkFrameRate();
  return regularVideoSystem;
}

NTSCParameters::NTSCParameters(std::uint32_t bitRate) : MXFD10Parameters(bitRate) {}

KLVKey NTSCParameters::getEssenceContainer(bool extended) const {
  return withFormat(containerLabel, formatOctet(true), extended ? 0x02 : 0x01);
}

MXFRational NTSCParameters::getEditRate() const { return MXFRational{30000, 1001}; }

const MXFD10SoundParameters& NTSCParameters::getSoundParameters() const { return sound_; }

std::uint8_t NTSCParameters::getContentPackageRate() const { return ntscPackageRate; }

// The product needs more than 32 bits; the size is what is left of it.
std::uint32_t NTSCParameters::getFrameSize() const {
  return static_cast<std::uint32_t>(std::uint64_t(getBitRate()) * 1001 / 30000) >> 3;
}

MXFD10PictureGeometry NTSCParameters::getPictureGeometry() const {
  return MXFD10PictureGeometry{256, 256, 243, 13, {7, 270}};
}

KLVKey NTSCParameters::getPictureCoding() const { return withFormat(pictureCodingLabel, 0x01, formatOctet(true)); }

KLVKey NTSCParameters::getVideoSystem() const { return ntscVideoSystem; }

std::unique_ptr<MXFD10Parameters> createMXFD10Parameters(const KLVKey& essenceContainer) {
  const std::uint8_t* octets = essenceContainer.data();
  for (std::size_t i = 0; i < 14; ++i)
    check(i == 7 || octets[i] == containerLabel[i], "valid D-10 essenceContainer");
  const std::uint8_t format = octets[14];
  for (const BitRateFormat& entry : bitRateFormats) {
    if (format == entry.regularFormat) return std::make_unique<RegularParameters>(entry.bitRate, 25);
    if (format == entry.regularFormat + 1) return std::make_unique<NTSCParameters>(entry.bitRate);
  }
  throw util::assertion_failure("valid D-10 essenceContainer");
}

// ---------------------------------------------------------------------------
// Layout

std::uint32_t getMXFD10PictureGroupSize(const MXFD10Parameters& parameters) {
  return roundUpToKAG(parameters.getFrameSize() + groupOverhead);
}

std::uint32_t getMXFD10SoundGroupSize(const MXFD10Parameters& parameters) {
  return roundUpToKAG(parameters.getSoundParameters().getMaximumElementLength() + groupOverhead);
}

std::uint32_t getMXFD10EditUnitSize(const MXFD10Parameters& parameters) {
  return MXFD10SystemItemSize + getMXFD10PictureGroupSize(parameters) + getMXFD10SoundGroupSize(parameters);
}

MXFIndexTableSegment createMXFD10IndexSegment(const MXFD10Parameters& parameters, std::uint32_t indexSID,
                                              std::uint32_t bodySID) {
  MXFIndexTableSegment segment;
  segment.indexEditRate = parameters.getEditRate();
  segment.editUnitByteCount = getMXFD10EditUnitSize(parameters);
  segment.indexSID = indexSID;
  segment.bodySID = bodySID;
  segment.deltaEntryArray = {MXFDeltaEntry{0, 0, 0}, MXFDeltaEntry{0, 0, MXFD10SystemItemSize},
                             MXFDeltaEntry{0, 0, MXFD10SystemItemSize + getMXFD10PictureGroupSize(parameters)}};
  return segment;
}
