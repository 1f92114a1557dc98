#include "kit/driver_layout.h"

#include <algorithm>
#include <array>

#include "kit/essence_formats.h"
#include "kit/model_builder.h"

namespace zelta {

namespace {

constexpr std::uint32_t keySize = 16;
constexpr std::uint32_t shortLengthSize = 4;
constexpr std::uint32_t longLengthSize = 8;
constexpr std::uint8_t longLengthForm = 0x87;
constexpr std::uint64_t fillItemHeader = keySize + shortLengthSize;

constexpr std::array<std::uint8_t, 12> elementPrefix{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02,
                                                     0x01, 0x01, 0x0D, 0x01, 0x03, 0x01};
constexpr std::array<std::uint8_t, 12> rawElementPrefix{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02,
                                                        0x01, 0x06, 0x0E, 0x06, 0x7F, 0x03};

struct RateValue {
  MXFRational rate;
  std::uint32_t value;
};

constexpr std::array<RateValue, 10> contentPackageRates{{{rate23976, 3},
                                                         {rate24, 2},
                                                         {rate25, 4},
                                                         {rate2997, 7},
                                                         {rate30, 6},
                                                         {rate4795, 9},
                                                         {rate48, 8},
                                                         {rate50, 10},
                                                         {rate5994, 13},
                                                         {rate60, 12}}};

constexpr std::array<RateValue, 8> bodyIndexByteCounts{{{rate23976, 4096},
                                                        {rate24, 4096},
                                                        {rate25, 4096},
                                                        {rate2997, 5120},
                                                        {rate30, 5120},
                                                        {rate50, 8192},
                                                        {rate5994, 9728},
                                                        {rate60, 9728}}};

template <std::size_t N>
std::uint32_t byRate(const std::array<RateValue, N>& table, const MXFRational& editRate) {
  for (const RateValue& entry : table)
    if (entry.rate.denominator != 0 && isSameRate(entry.rate, editRate)) return entry.value;
  check(false, "valid edit rate");
  return 0;
}

KLVKey elementKey(const std::array<std::uint8_t, 12>& prefix, std::uint32_t trackNumber) {
  std::array<std::uint8_t, 16> octets{};
  std::copy(prefix.begin(), prefix.end(), octets.begin());
  for (int i = 0; i < 4; ++i) octets[12 + i] = static_cast<std::uint8_t>(trackNumber >> (24 - 8 * i));
  return KLVKey(octets);
}

// Samples of a channel per edit unit, the larger count where it varies.
std::uint64_t samplesPerEditUnit(const MXFRational& soundRate, const MXFRational& editRate) {
  const std::uint64_t numerator = static_cast<std::uint64_t>(soundRate.numerator) * editRate.denominator;
  const std::uint64_t denominator = static_cast<std::uint64_t>(soundRate.denominator) * editRate.numerator;
  return (numerator + denominator - 1) / denominator;
}

std::uint64_t constantBitRateFrameSize(const ZeltaMasterMetadata& master) {
  const MXFRational rate = master.getEditRate();
  return static_cast<std::uint64_t>(master.getBitRate()) * rate.denominator / rate.numerator / 8;
}

struct RawSize {
  std::uint16_t code;
  std::uint32_t width;  // 0: any
  std::uint64_t size;
};

constexpr std::array<RawSize, 9> rawSizes{{{0, 0, 10190824},
                                           {785, 0, 20381672},
                                           {801, 0, 10190824},
                                           {802, 0, 5091304},
                                           {817, 0, 6012904},
                                           {1057, 4096, 4915176},
                                           {1057, 2048, 1228776},
                                           {1073, 4096, 2949096},
                                           {1073, 2048, 737256}}};

std::uint64_t rawPictureSize(const ZeltaMasterMetadata& master) {
  const std::uint16_t code = master.getProfileAndLevel();
  const std::uint32_t width = master.getDisplaySize().first;
  bool knownCode = false;
  for (const RawSize& entry : rawSizes) {
    if (entry.code != code) continue;
    knownCode = true;
    if (entry.width == 0 || entry.width == width) return entry.size;
  }
  check(knownCode, "supported Orvane Raw profile and level");
  check(false, "supported display width");
  return 0;
}

constexpr std::uint64_t avcPictureSize50 = 568832;
constexpr std::uint64_t avcPictureSize = 472576;
constexpr std::uint64_t rawDataSize = 11520;
constexpr std::uint64_t avcProgressiveDataRoom = 2540;
constexpr std::uint64_t avcInterlacedDataRoom = 5612;
constexpr std::uint32_t dvFrameSize625 = 144000;
constexpr std::uint32_t dvFrameSize525 = 120000;
constexpr std::uint32_t d10SoundChannels = 8;
constexpr std::uint32_t aes3SampleSize = 4;
constexpr std::uint32_t d10SoundHeaderSize = 4;
constexpr MXFRational d10SoundRate{48000, 1};

std::uint64_t pictureSize(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format) {
  const MXFRational rate = master.getEditRate();
  switch (format) {
    case ZeltaEssenceFormat::DV:
      return isSameRate(rate, rate25) ? dvFrameSize625 : dvFrameSize525;
    case ZeltaEssenceFormat::Raw:
      return rawPictureSize(master);
    case ZeltaEssenceFormat::AVC:
      return isSameRate(rate, rate25) || isSameRate(rate, rate50) ? avcPictureSize50 : avcPictureSize;
    default:
      return constantBitRateFrameSize(master);
  }
}

std::uint64_t dataSize(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format) {
  switch (format) {
    case ZeltaEssenceFormat::Raw:
      return rawDataSize;
    case ZeltaEssenceFormat::AVC:
      return (master.isProgressive() ? avcProgressiveDataRoom : avcInterlacedDataRoom) - fillItemHeader;
    default: {
      const std::uint32_t width = master.getDisplaySize().first;
      const MXFRational rate = master.getEditRate();
      const bool highRate = static_cast<std::int64_t>(rate.numerator) > 30LL * rate.denominator;
      return (highRate ? 3 : 6) * static_cast<std::uint64_t>(width == 2048 ? 1920 : width);
    }
  }
}

ElementSlot slot(const KLVKey& key, ElementSource source, ElementKind kind, std::uint64_t valueSize,
                 std::uint32_t channel = 0) {
  return ElementSlot{key, source, kind, channel, getPaddedSize(valueSize, shortLengthSize)};
}

ElementSource pictureSource(ZeltaEssenceFormat format) {
  switch (format) {
    case ZeltaEssenceFormat::Raw:
      return ElementSource::RawPicture;
    case ZeltaEssenceFormat::AVC:
      return ElementSource::AVCPicture;
    default:
      return ElementSource::MPEGPicture;
  }
}

std::uint32_t dataFlag(const ZeltaMasterMetadata& master) { return master.hasAncillaryData() ? 1 : 0; }

}  // namespace

DriverPath getDriverPath(const ZeltaMasterMetadata& master, std::uint32_t avcWrapping) {
  switch (master.getEssenceFormat()) {
    case static_cast<std::uint32_t>(ZeltaEssenceFormat::D10):
    case static_cast<std::uint32_t>(ZeltaEssenceFormat::DV):
    case static_cast<std::uint32_t>(ZeltaEssenceFormat::Raw):
      return DriverPath::ConstantRate;
    case static_cast<std::uint32_t>(ZeltaEssenceFormat::MPEG):
      return master.isSimpleStudioProfile() ? DriverPath::ConstantRate : DriverPath::VariableRate;
    case static_cast<std::uint32_t>(ZeltaEssenceFormat::AVC):
      return avcWrapping == 1 ? DriverPath::ConstantRate : DriverPath::VariableRate;
    default:
      check(false, "valid essence format");
      return DriverPath::ConstantRate;
  }
}

std::uint64_t getPaddedSize(std::uint64_t valueSize, std::uint32_t lengthSize) {
  std::uint64_t size = valueSize + keySize + lengthSize;
  if (size % driverKagSize == 0) return size;
  size += fillItemHeader;
  return (size + driverKagSize - 1) / driverKagSize * driverKagSize;
}

std::uint8_t getContentPackageRate(const MXFRational& editRate) {
  return static_cast<std::uint8_t>(byRate(contentPackageRates, editRate));
}

std::uint32_t getBodyIndexByteCount(const MXFRational& editRate) { return byRate(bodyIndexByteCounts, editRate); }

bool hasDataElement(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format) {
  return master.hasAncillaryData() && format != ZeltaEssenceFormat::D10 && format != ZeltaEssenceFormat::DV;
}

std::vector<ElementSlot> getEditUnitLayout(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format) {
  const MXFRational rate = master.getEditRate();
  const std::uint32_t channels = master.getAudioChannelCount();
  std::vector<ElementSlot> layout;
  if (format == ZeltaEssenceFormat::D10) {
    layout.push_back(slot(elementKey(elementPrefix, getPictureTrackNumber(format)), ElementSource::D10Picture,
                          ElementKind::Picture, constantBitRateFrameSize(master)));
    if (channels > 0)
      layout.push_back(slot(
          elementKey(elementPrefix, getSoundTrackNumber(format, 0, 1)), ElementSource::D10Sound, ElementKind::Sound,
          samplesPerEditUnit(d10SoundRate, rate) * d10SoundChannels * aes3SampleSize + d10SoundHeaderSize));
    return layout;
  }
  if (format == ZeltaEssenceFormat::DV) {
    layout.push_back(slot(elementKey(elementPrefix, getPictureTrackNumber(format)), ElementSource::DVElement,
                          ElementKind::Compound, pictureSize(master, format)));
  } else if (format == ZeltaEssenceFormat::Raw) {
    layout.push_back(ElementSlot{elementKey(rawElementPrefix, getPictureTrackNumber(format)), pictureSource(format),
                                 ElementKind::Picture, 0, getPaddedSize(pictureSize(master, format), longLengthSize),
                                 longLengthForm});
  } else {
    layout.push_back(slot(elementKey(elementPrefix, getPictureTrackNumber(format)), pictureSource(format),
                          ElementKind::Picture, pictureSize(master, format)));
  }
  const std::uint32_t bytesPerSample = (master.getQuantizationBits() + 7) / 8;
  for (std::uint32_t channel = 0; channel < channels; ++channel) {
    const MXFRational soundRate = getSoundRate(format, master.getAudioSamplingRate(channel));
    layout.push_back(slot(elementKey(elementPrefix, getSoundTrackNumber(format, channel, channels)),
                          ElementSource::Sound, ElementKind::Sound,
                          samplesPerEditUnit(soundRate, rate) * bytesPerSample, channel));
  }
  if (hasDataElement(master, format))
    layout.push_back(slot(elementKey(elementPrefix, getDataTrackNumber(format, channels)), ElementSource::Ancillary,
                          ElementKind::Data, dataSize(master, format)));
  return layout;
}

KLVKey getSystemItemLabel(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format) {
  const KLVKey own = getEssenceContainer(format, master.getBitRate(), master.getEditRate());
  if (format == ZeltaEssenceFormat::D10) return own;
  return master.getAudioChannelCount() > 0 || hasDataElement(master, format) ? multipleEssenceContainer : own;
}

std::uint64_t getConstantRateHeaderByteCount(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format) {
  const std::uint64_t tracks = master.getAudioChannelCount() + dataFlag(master);
  switch (format) {
    case ZeltaEssenceFormat::Raw:
      if ((master.getProfileAndLevel() & 0xF00) == 0x400) return ((tracks + 11) << 10) | 0x200;
      return (tracks + 5) << 10;
    case ZeltaEssenceFormat::MPEG:
      return ((tracks + 5) << 10) - (master.getPrefaceVersion() < newerModelVersion ? driverKagSize : 0);
    case ZeltaEssenceFormat::AVC:
      return avcHeaderByteCount;
    default:
      return d10DVHeaderByteCount;
  }
}

std::uint64_t getVariableRateHeaderByteCount(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format) {
  if (format == ZeltaEssenceFormat::AVC) return avcReservedHeaderSpace;
  const std::uint64_t tracks = master.getAudioChannelCount() + dataFlag(master);
  const std::uint64_t room =
      ((tracks + 5) << 10) - (master.getPrefaceVersion() < newerModelVersion ? driverKagSize : 0);
  return std::max(room, d10DVHeaderByteCount);
}

}  // namespace zelta
