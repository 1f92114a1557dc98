#include "kit/picture_labels.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <optional>

#include "kit/essence_formats.h"
#include "kit/labels.h"

namespace zelta {

namespace {

struct CodedLabel {
  std::uint16_t code;
  KLVKey label;
};

// 06 0E 2B 34 04 01 01 version 04 01 02 02 01 then three octets.
constexpr KLVKey compressionLabel(std::uint8_t version, std::uint8_t a, std::uint8_t b, std::uint8_t c) {
  return registryLabel(version, {0x04, 0x01, 0x02, 0x02, 0x01, a, b, c});
}

const std::array<CodedLabel, 5> mpegLabels{{
    {68, compressionLabel(0x03, 0x03, 0x03, 0x00)},
    {70, compressionLabel(0x08, 0x05, 0x03, 0x00)},
    {72, compressionLabel(0x03, 0x01, 0x11, 0x00)},
    {130, compressionLabel(0x03, 0x04, 0x03, 0x00)},
    {133, compressionLabel(0x03, 0x02, 0x03, 0x00)},
}};

// 06 0E 2B 34 04 01 01 03 0E 06 41 02 01 then three octets.
constexpr KLVKey halfSizeLabel(std::uint8_t a) {
  return registryLabel(0x03, {0x0E, 0x06, 0x41, 0x02, 0x01, a, 0x03, 0x01});
}

const std::array<CodedLabel, 3> halfSizeMPEGLabels{{
    {68, halfSizeLabel(0x03)},
    {70, halfSizeLabel(0x05)},
    {130, halfSizeLabel(0x04)},
}};

const std::array<CodedLabel, 6> studioLabels{{
    {225, compressionLabel(0x03, 0x20, 0x10, 0x01)},
    {226, compressionLabel(0x03, 0x20, 0x10, 0x02)},
    {227, compressionLabel(0x03, 0x20, 0x10, 0x03)},
    {228, compressionLabel(0x03, 0x20, 0x10, 0x04)},
    {235, compressionLabel(0x0B, 0x20, 0x10, 0x05)},
    {236, compressionLabel(0x0B, 0x20, 0x10, 0x06)},
}};

// 06 0E 2B 34 04 01 01 06 0E 06 04 01 02 then three octets.
constexpr KLVKey rawLabel(std::uint8_t a, std::uint8_t b, std::uint8_t c) {
  return registryLabel(0x06, {0x0E, 0x06, 0x04, 0x01, 0x02, a, b, c});
}

const std::array<CodedLabel, 10> rawLabels{{
    {785, rawLabel(0x03, 0x01, 0x01)},
    {786, rawLabel(0x03, 0x01, 0x02)},
    {801, rawLabel(0x03, 0x02, 0x01)},
    {802, rawLabel(0x03, 0x02, 0x02)},
    {817, rawLabel(0x03, 0x03, 0x01)},
    {818, rawLabel(0x03, 0x03, 0x02)},
    {833, rawLabel(0x03, 0x04, 0x01)},
    {834, rawLabel(0x03, 0x04, 0x02)},
    {1057, rawLabel(0x04, 0x02, 0x01)},
    {1073, rawLabel(0x04, 0x03, 0x01)},
}};

template <std::size_t N>
KLVKey labelOf(const std::array<CodedLabel, N>& table, std::uint16_t code) {
  const auto row = std::find_if(table.begin(), table.end(), [&](const CodedLabel& r) { return r.code == code; });
  check(row != table.end(), "recognized profileAndLevel");
  return row->label;
}

template <std::size_t N>
const CodedLabel* rowOf(const std::array<CodedLabel, N>& table, const KLVKey& label) {
  const auto row = std::find_if(table.begin(), table.end(), [&](const CodedLabel& r) { return r.label == label; });
  return row == table.end() ? nullptr : &*row;
}

constexpr std::uint8_t intraBit = 16;

// An AVC profile's two labels, by the intra bit.
struct AVCProfileLabels {
  std::uint8_t profile;
  KLVKey notIntra;
  KLVKey intra;
};

const std::array<AVCProfileLabels, 8> avcLabels{{
    {44, compressionLabel(0x0D, 0x32, 0x50, 0x01), compressionLabel(0x0D, 0x32, 0x50, 0x01)},
    {66, compressionLabel(0x0D, 0x31, 0x10, 0x01), compressionLabel(0x0D, 0x31, 0x10, 0x01)},
    {77, compressionLabel(0x0D, 0x31, 0x20, 0x01), compressionLabel(0x0D, 0x31, 0x20, 0x01)},
    {88, compressionLabel(0x0D, 0x31, 0x30, 0x01), compressionLabel(0x0D, 0x31, 0x30, 0x01)},
    {100, compressionLabel(0x0D, 0x31, 0x40, 0x01), compressionLabel(0x0D, 0x31, 0x40, 0x01)},
    {110, compressionLabel(0x0D, 0x31, 0x50, 0x01), compressionLabel(0x0A, 0x32, 0x20, 0x01)},
    {122, compressionLabel(0x0D, 0x31, 0x60, 0x01), compressionLabel(0x0A, 0x32, 0x30, 0x01)},
    {244, compressionLabel(0x0D, 0x31, 0x70, 0x01), compressionLabel(0x0D, 0x32, 0x40, 0x01)},
}};

// The intra profiles whose pictures of a known bit rate, size and rate have
// a class label of their own: 32 21 nn and 32 31 nn.
struct AVCClass {
  std::uint8_t profile;
  std::uint8_t family;
  std::uint32_t lowestBitRate;
  std::uint32_t highestBitRate;
  std::uint32_t bitRateClass;
};
const std::array<AVCClass, 2> avcClasses{{
    {110, 0x21, 45000000, 55000000, 50000000},
    {122, 0x31, 90000000, 115000000, 100000000},
}};
constexpr std::uint8_t avcClassOctet = 0x32;

// The pictures of a class, each with its last octet.
struct AVCClassRow {
  std::uint32_t displayHeight;
  MXFRational editRate;
  // 0: either, 1: progressive only, 2: fields only.
  std::uint8_t layout;
  std::uint8_t member;
};
constexpr std::uint8_t eitherLayout = 0;
constexpr std::uint8_t frameLayout = 1;
constexpr std::uint8_t fieldLayout = 2;
const std::array<AVCClassRow, 9> avcClassRows{{
    {540, {30000, 1001}, fieldLayout, 0x01},
    {540, {25, 1}, fieldLayout, 0x02},
    {1080, {24000, 1001}, frameLayout, 0x03},
    {1080, {30000, 1001}, eitherLayout, 0x03},
    {1080, {60000, 1001}, fieldLayout, 0x03},
    {1080, {25, 1}, eitherLayout, 0x04},
    {1080, {50, 1}, eitherLayout, 0x04},
    {720, {60000, 1001}, frameLayout, 0x08},
    {720, {50, 1}, frameLayout, 0x09},
}};

bool fitsLayout(std::uint8_t layout, bool progressive) {
  return layout == eitherLayout || (layout == frameLayout) == progressive;
}

std::optional<KLVKey> classLabel(std::uint8_t profile, const AVCPictureKind& kind) {
  const auto c = std::find_if(avcClasses.begin(), avcClasses.end(), [&](const AVCClass& x) {
    return x.profile == profile && kind.bitRate >= x.lowestBitRate && kind.bitRate <= x.highestBitRate;
  });
  if (c == avcClasses.end()) return std::nullopt;
  const auto row = std::find_if(avcClassRows.begin(), avcClassRows.end(), [&](const AVCClassRow& r) {
    return r.displayHeight == kind.displayHeight && isSameRate(r.editRate, kind.editRate) &&
           fitsLayout(r.layout, kind.progressive);
  });
  if (row == avcClassRows.end()) return std::nullopt;
  return compressionLabel(0x0A, avcClassOctet, c->family, row->member);
}

}  // namespace

bool isHalfSizeHeight(std::uint32_t displayHeight, bool progressive) {
  return displayHeight == (progressive ? 540u : 270u);
}

KLVKey getMPEGPictureCoding(std::uint16_t profileAndLevel, bool simpleStudio, bool halfSize) {
  if (simpleStudio) return labelOf(studioLabels, profileAndLevel);
  return halfSize ? labelOf(halfSizeMPEGLabels, profileAndLevel) : labelOf(mpegLabels, profileAndLevel);
}

bool isSimpleStudioCoding(const KLVKey& coding) { return rowOf(studioLabels, coding) != nullptr; }

KLVKey getAVCPictureCoding(std::uint8_t profile, const AVCPictureKind& kind) {
  const auto labels =
      std::find_if(avcLabels.begin(), avcLabels.end(), [&](const AVCProfileLabels& l) { return l.profile == profile; });
  check(labels != avcLabels.end(), "recognized profileAndLevel");
  if ((kind.profileConstraint & intraBit) == 0) return labels->notIntra;
  return classLabel(profile, kind).value_or(labels->intra);
}

std::optional<AVCCoding> getAVCCoding(const KLVKey& coding) {
  for (const AVCProfileLabels& labels : avcLabels) {
    // Where both columns share a label, the label says nothing of intra.
    if (coding == labels.notIntra) return AVCCoding{labels.profile, 0, 0};
    if (coding == labels.intra) return AVCCoding{labels.profile, intraBit, 0};
  }
  for (const AVCClass& c : avcClasses)
    for (const AVCClassRow& row : avcClassRows)
      if (coding == compressionLabel(0x0A, avcClassOctet, c.family, row.member))
        return AVCCoding{c.profile, intraBit, c.bitRateClass};
  return std::nullopt;
}

KLVKey getRawPictureCoding(std::uint16_t code) { return labelOf(rawLabels, code == 0 ? defaultRawCode : code); }

std::uint16_t getRawCode(const KLVKey& coding) {
  const CodedLabel* row = rowOf(rawLabels, coding);
  check(row != nullptr, "recognized profileAndLevel");
  return row->code;
}

}  // namespace zelta
