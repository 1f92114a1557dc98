// The layout that the driver gives a file: which elements an edit unit
// holds, in which order and under which keys, how much room each takes, and
// the byte counts that the partition packs promise.
#ifndef ZELTA_KIT_DRIVER_LAYOUT_H
#define ZELTA_KIT_DRIVER_LAYOUT_H

#include <cstdint>
#include <vector>

#include "kit.h"

namespace zelta {

// Every element and the system item start on this grid.
inline constexpr std::uint32_t driverKagSize = 512;
inline constexpr std::uint64_t systemItemSize = driverKagSize;
// The header partition of the constant rate path holds one index segment.
inline constexpr std::uint64_t constantRateIndexByteCount = driverKagSize;
inline constexpr std::uint64_t partitionPackLength = driverKagSize;
inline constexpr std::uint64_t d10DVHeaderByteCount = 15872;
inline constexpr std::uint64_t avcHeaderByteCount = 0x7FC00;
inline constexpr std::uint64_t avcReservedHeaderSpace = 0x7FE00;
inline constexpr std::uint64_t avcFooterIndexByteCount = 0x80000;
inline constexpr std::uint16_t olderModelVersion = 0x0102;

// Where the octets of an element come from.
enum class ElementSource : std::uint8_t {
  D10Picture,
  D10Sound,
  DVElement,
  MPEGPicture,
  RawPicture,
  AVCPicture,
  Sound,
  Ancillary
};
enum class ElementKind : std::uint8_t { Picture, Sound, Data, Compound };

struct ElementSlot {
  KLVKey key;
  ElementSource source;
  ElementKind kind;
  std::uint32_t channel = 0;
  // Key, length, value and fill: the room of the largest value the slot
  // takes.
  std::uint64_t paddedSize = 0;
  // The BER length form; KLVNoLengthForm leaves it to the coder.
  std::uint8_t lengthForm = KLVNoLengthForm;
};

// Which of the driver's two roads a master takes.
enum class DriverPath : std::uint8_t { ConstantRate, VariableRate };

// "valid essence format": the driver does not write Proxy.
DriverPath getDriverPath(const ZeltaMasterMetadata& master, std::uint32_t avcWrapping);

// The room an element of valueSize octets takes: key, length and value,
// and when that is off the grid a fill item of at least its own key and
// length up to the next multiple of the KAG.
std::uint64_t getPaddedSize(std::uint64_t valueSize, std::uint32_t lengthSize);

// The content package rate of the system item ("valid edit rate").
std::uint8_t getContentPackageRate(const MXFRational& editRate);

// The essence elements of an edit unit in writing order; the sizes are
// those of a constant rate file ("supported Orvane Raw profile and level",
// "supported display width").
std::vector<ElementSlot> getEditUnitLayout(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format);

// The essence container label of the system item.
KLVKey getSystemItemLabel(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format);
// Whether the format carries an ancillary data element.
bool hasDataElement(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format);

// The header metadata room of a constant rate file.
std::uint64_t getConstantRateHeaderByteCount(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format);
// The header metadata room of a variable rate file.
std::uint64_t getVariableRateHeaderByteCount(const ZeltaMasterMetadata& master, ZeltaEssenceFormat format);
// The index room of one body partition of a variable rate file ("valid edit
// rate").
std::uint32_t getBodyIndexByteCount(const MXFRational& editRate);

}  // namespace zelta

#endif
