#include "kit/essence_formats.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <vector>

#include "kit/labels.h"

namespace zelta {

namespace {

const std::vector<MXFRational> standardRates{rate25, rate2997};
const std::vector<MXFRational> mpegRates{rate23976, rate24, rate25, rate2997, rate30, rate50, rate5994, rate60};
const std::vector<MXFRational> proxyRates{rate23976, rate25, rate2997};
const std::vector<MXFRational> allRates{rate23976, rate24, rate25, rate2997, rate30,
                                        rate4795,  rate48, rate50, rate5994, rate60};

constexpr std::size_t kindOctet = 14;
constexpr std::size_t wrappingOctet = 15;

// 06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 mm 01, mm by bit rate and rate.
constexpr KLVKey d10Container = registryLabel(0x01, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x01, 0x00, 0x01});
constexpr KLVKey dvContainer = registryLabel(0x01, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x02, 0x00, 0x01});
constexpr KLVKey mpegContainer = registryLabel(0x02, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x04, 0x60, 0x01});
constexpr KLVKey proxyContainer = registryLabel(0x02, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x04, 0x61, 0x07});
constexpr KLVKey rawContainer = registryLabel(0x06, {0x0E, 0x06, 0x0D, 0x03, 0x02, 0x01, 0x01, 0x00});
constexpr KLVKey avcContainer = registryLabel(0x0A, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x10, 0x60, 0x01});
// The older AVC label, accepted when reading.
constexpr KLVKey avcOlderContainer = registryLabel(0x0A, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x0F, 0x60, 0x01});

constexpr KLVKey aes3Container = registryLabel(0x01, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x06, 0x03, 0x00});
constexpr KLVKey proxySoundContainer = registryLabel(0x03, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x0A, 0x03, 0x00});

constexpr KLVKey proxyPattern = registryLabel(0x01, {0x0E, 0x06, 0x02, 0x01, 0x40, 0x01, 0x09, 0x00});
constexpr KLVKey op1aPattern = registryLabel(0x01, {0x0D, 0x01, 0x02, 0x01, 0x01, 0x01, 0x09, 0x00});

// D-10 kinds by bit rate; the 30000/1001 kind is the one after.
struct D10Kind {
  std::uint32_t bitRate;
  std::uint8_t kind;
};
constexpr std::array<D10Kind, 3> d10Kinds{{{50000000, 0x01}, {40000000, 0x03}, {30000000, 0x05}}};
constexpr std::uint8_t d10LastKind = 0x06;
constexpr std::array<std::uint8_t, 3> d10Wrappings{0x01, 0x02, 0x7F};

constexpr std::uint32_t dvBitRate = 25000000;
constexpr std::uint8_t dv525Kind = 0x01;
constexpr std::uint8_t dv625Kind = 0x02;
constexpr std::uint8_t dvLastIECKind = 0x04;
constexpr std::array<std::uint8_t, 9> dvBasedKinds{0x3F, 0x40, 0x41, 0x50, 0x51, 0x60, 0x61, 0x62, 0x63};
constexpr std::array<std::uint8_t, 2> dvBased25Kinds{0x40, 0x41};
constexpr std::array<std::uint8_t, 2> dvBased50Kinds{0x50, 0x51};
constexpr std::array<std::uint8_t, 4> dvBased100Kinds{0x60, 0x61, 0x62, 0x63};
constexpr std::uint8_t dvUndefinedKind = 0x7F;
constexpr std::array<std::uint8_t, 2> dvWrappings{0x01, 0x02};

constexpr std::uint32_t pictureD10 = 0x05010100;
constexpr std::uint32_t pictureDV = 0x18010100;
constexpr std::uint32_t pictureMPEG = 0x15010500;
constexpr std::uint32_t pictureProxy = 0x15010700;
constexpr std::uint32_t pictureRaw = 0x15017F00;
constexpr std::uint32_t soundD10 = 0x06011000;
constexpr std::uint32_t dataTrackNumber = 0x17010201;
constexpr std::uint8_t soundItem = 0x16;
constexpr std::uint8_t aes3Element = 0x03;
constexpr std::uint8_t proxySoundElement = 0x0A;

constexpr std::uint32_t proxyChannelCount = 8;
constexpr std::uint32_t proxySoundTrackCount = 4;
constexpr MXFRational defaultSoundRate{48000, 1};
constexpr MXFRational proxySoundRate{8000, 1};

template <typename Values>
bool holds(const Values& values, std::uint8_t value) {
  return std::find(values.begin(), values.end(), value) != values.end();
}

// Equal but for the version octet, which must be set, and the kind and
// wrapping octets that the family varies.
bool isOfFamily(const KLVKey& label, const KLVKey& family) {
  auto variable = [](KLVKey key) {
    key[kindOctet] = 0;
    key[wrappingOctet] = 0;
    return key;
  };
  return label[labelVersionOctet] != 0 && variable(label) == variable(family);
}

KLVKey withKind(KLVKey label, std::uint8_t kind) {
  label[kindOctet] = kind;
  return label;
}

}  // namespace

const KLVKey ancillaryDataContainer = registryLabel(0x09, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x0E, 0x00, 0x00});
const KLVKey multipleEssenceContainer = registryLabel(0x03, {0x0D, 0x01, 0x03, 0x01, 0x02, 0x7F, 0x01, 0x00});

bool isSameRate(const MXFRational& a, const MXFRational& b) {
  if (a.denominator == 0 || b.denominator == 0) return false;
  return static_cast<std::int64_t>(a.numerator) * b.denominator ==
         static_cast<std::int64_t>(b.numerator) * a.denominator;
}

ZeltaEssenceFormat toEssenceFormat(std::uint32_t value) {
  check(value <= static_cast<std::uint32_t>(ZeltaEssenceFormat::AVC), "supported essence format");
  return static_cast<ZeltaEssenceFormat>(value);
}

const std::vector<MXFRational>& getEditRates(ZeltaEssenceFormat format) {
  switch (format) {
    case ZeltaEssenceFormat::D10:
    case ZeltaEssenceFormat::DV:
      return standardRates;
    case ZeltaEssenceFormat::MPEG:
    case ZeltaEssenceFormat::AVC:
      return mpegRates;
    case ZeltaEssenceFormat::Proxy:
      return proxyRates;
    case ZeltaEssenceFormat::Raw:
      return allRates;
  }
  check(false, "valid essence format");
  return allRates;
}

void checkEditRate(ZeltaEssenceFormat format, const MXFRational& editRate) {
  const std::vector<MXFRational>& rates = getEditRates(format);
  check(std::any_of(rates.begin(), rates.end(), [&](const MXFRational& r) { return isSameRate(r, editRate); }),
        "valid edit rate");
}

KLVKey getEssenceContainer(ZeltaEssenceFormat format, std::uint32_t bitRate, const MXFRational& editRate) {
  checkEditRate(format, editRate);
  const bool is625 = isSameRate(editRate, rate25);
  switch (format) {
    case ZeltaEssenceFormat::D10: {
      const auto kind =
          std::find_if(d10Kinds.begin(), d10Kinds.end(), [&](const D10Kind& k) { return k.bitRate == bitRate; });
      check(kind != d10Kinds.end(), "valid bit rate");
      return withKind(d10Container, static_cast<std::uint8_t>(kind->kind + (is625 ? 0 : 1)));
    }
    case ZeltaEssenceFormat::DV:
      check(bitRate == dvBitRate, "valid bit rate");
      return withKind(dvContainer, is625 ? dv625Kind : dv525Kind);
    case ZeltaEssenceFormat::MPEG:
      return mpegContainer;
    case ZeltaEssenceFormat::Proxy:
      return proxyContainer;
    case ZeltaEssenceFormat::Raw:
      return rawContainer;
    case ZeltaEssenceFormat::AVC:
      return avcContainer;
  }
  check(false, "valid essence format");
  return KLVKey();
}

std::vector<KLVKey> getEssenceContainers(ZeltaEssenceFormat format, std::uint32_t bitRate, const MXFRational& editRate,
                                         bool hasSound, bool hasData) {
  std::vector<KLVKey> labels{getEssenceContainer(format, bitRate, editRate)};
  if (hasSound && format != ZeltaEssenceFormat::D10) labels.push_back(getSoundContainer(format));
  // DV's data track is part of the DV container, as the reader's rules
  // expect.
  if (hasData && format != ZeltaEssenceFormat::DV) labels.push_back(ancillaryDataContainer);
  if (labels.size() >= 2) labels.push_back(multipleEssenceContainer);
  return labels;
}

KLVKey getSoundContainer(ZeltaEssenceFormat format) {
  return format == ZeltaEssenceFormat::Proxy ? proxySoundContainer : aes3Container;
}

KLVKey getOperationalPattern(ZeltaEssenceFormat format) {
  return format == ZeltaEssenceFormat::Proxy ? proxyPattern : op1aPattern;
}

std::uint32_t getSoundTrackCount(ZeltaEssenceFormat format, std::uint32_t channelCount) {
  switch (format) {
    case ZeltaEssenceFormat::D10:
      return 1;
    case ZeltaEssenceFormat::DV:
    case ZeltaEssenceFormat::MPEG:
    case ZeltaEssenceFormat::Raw:
    case ZeltaEssenceFormat::AVC:
      return channelCount;
    case ZeltaEssenceFormat::Proxy:
      check(channelCount == proxyChannelCount, "valid channelCount");
      return proxySoundTrackCount;
  }
  check(false, "valid essence format");
  return 0;
}

MXFRational getSoundRate(ZeltaEssenceFormat format, const MXFRational& rate) {
  if (rate.numerator != 0 && rate.denominator != 0) return rate;
  return format == ZeltaEssenceFormat::Proxy ? proxySoundRate : defaultSoundRate;
}

bool hasDataTrack(ZeltaEssenceFormat format, bool hasAncillaryData) {
  switch (format) {
    case ZeltaEssenceFormat::DV:
      return true;
    case ZeltaEssenceFormat::MPEG:
    case ZeltaEssenceFormat::Raw:
    case ZeltaEssenceFormat::AVC:
      return hasAncillaryData;
    default:
      return false;
  }
}

std::uint32_t getPictureTrackNumber(ZeltaEssenceFormat format) {
  switch (format) {
    case ZeltaEssenceFormat::D10:
      return pictureD10;
    case ZeltaEssenceFormat::DV:
      return pictureDV;
    case ZeltaEssenceFormat::MPEG:
    case ZeltaEssenceFormat::AVC:
      return pictureMPEG;
    case ZeltaEssenceFormat::Proxy:
      return pictureProxy;
    case ZeltaEssenceFormat::Raw:
      return pictureRaw;
  }
  check(false, "valid essence format");
  return 0;
}

std::uint32_t getSoundTrackNumber(ZeltaEssenceFormat format, std::uint32_t index, std::uint32_t trackCount) {
  if (format == ZeltaEssenceFormat::D10) return soundD10;
  const std::uint8_t element = format == ZeltaEssenceFormat::Proxy ? proxySoundElement : aes3Element;
  return (static_cast<std::uint32_t>(soundItem) << 24) | ((trackCount & 0xFF) << 16) |
         (static_cast<std::uint32_t>(element) << 8) | (index & 0xFF);
}

std::uint32_t getDataTrackNumber(ZeltaEssenceFormat format, std::uint32_t soundTrackCount) {
  if (format == ZeltaEssenceFormat::DV) return getSoundTrackNumber(format, soundTrackCount, soundTrackCount);
  return dataTrackNumber;
}

bool isD10Container(const KLVKey& label) {
  return isOfFamily(label, d10Container) && label[kindOctet] >= 1 && label[kindOctet] <= d10LastKind &&
         holds(d10Wrappings, label[wrappingOctet]);
}

bool isDVContainer(const KLVKey& label) {
  const std::uint8_t kind = label[kindOctet];
  const bool knownKind = (kind >= 1 && kind <= dvLastIECKind) || holds(dvBasedKinds, kind) || kind == dvUndefinedKind;
  return isOfFamily(label, dvContainer) && knownKind && holds(dvWrappings, label[wrappingOctet]);
}

std::uint32_t getD10BitRate(const KLVKey& label) {
  check(isD10Container(label), "recognized essence container");
  return d10Kinds[(label[kindOctet] - 1) / 2].bitRate;
}

std::uint32_t getDVBitRate(const KLVKey& label) {
  const std::uint8_t kind = label[kindOctet];
  if ((kind >= 1 && kind <= dvLastIECKind) || holds(dvBased25Kinds, kind)) return dvBitRate;
  if (holds(dvBased50Kinds, kind)) return 2 * dvBitRate;
  check(holds(dvBased100Kinds, kind), "defined DV bit rate");
  return 4 * dvBitRate;
}

std::optional<ZeltaEssenceFormat> findEssenceFormat(const KLVKey& container) {
  if (isD10Container(container)) return ZeltaEssenceFormat::D10;
  if (isDVContainer(container)) return ZeltaEssenceFormat::DV;
  if (container == mpegContainer) return ZeltaEssenceFormat::MPEG;
  if (container == proxyContainer) return ZeltaEssenceFormat::Proxy;
  if (container == rawContainer) return ZeltaEssenceFormat::Raw;
  if (container == avcContainer || container == avcOlderContainer) return ZeltaEssenceFormat::AVC;
  return std::nullopt;
}

ZeltaEssenceFormat getEssenceFormat(const KLVKey& container) {
  const std::optional<ZeltaEssenceFormat> format = findEssenceFormat(container);
  check(format.has_value(), "recognized essence container");
  return *format;
}

}  // namespace zelta
