// Picture essence coding labels of the kit's formats, and the values that a
// label gives back.
#ifndef ZELTA_KIT_PICTURE_LABELS_H
#define ZELTA_KIT_PICTURE_LABELS_H

#include <cstdint>
#include <optional>

#include "kit.h"
#include "klv.h"

namespace zelta {

// The half size class: 540 lines a frame, 270 a field.
bool isHalfSizeHeight(std::uint32_t displayHeight, bool progressive);

// MPEG-2 by profile and level, the private forms at the half size, or a
// Simple Studio level ("recognized profileAndLevel").
KLVKey getMPEGPictureCoding(std::uint16_t profileAndLevel, bool simpleStudio, bool halfSize);
// One of the six Simple Studio labels.
bool isSimpleStudioCoding(const KLVKey& coding);

// What decides an AVC label besides the profile.
struct AVCPictureKind {
  std::uint8_t profileConstraint = 0;
  std::uint32_t bitRate = 0;
  std::uint32_t displayHeight = 0;
  bool progressive = false;
  MXFRational editRate;
};
// By profile, the intra bit, and for intra 4:2:2 and High 10 pictures the
// class of their bit rate, size and rate ("recognized profileAndLevel").
KLVKey getAVCPictureCoding(std::uint8_t profile, const AVCPictureKind& kind);

// What an AVC label says: a class label also names its bit rate class.
struct AVCCoding {
  std::uint8_t profile = 0;
  std::uint8_t profileConstraint = 0;
  std::uint32_t bitRateClass = 0;
};
// Nothing for a label that is not one of the kit's.
std::optional<AVCCoding> getAVCCoding(const KLVKey& coding);

// Raw codes both ways; code 0 is 801 ("recognized profileAndLevel").
KLVKey getRawPictureCoding(std::uint16_t code);
std::uint16_t getRawCode(const KLVKey& coding);
// What the builder takes a raw code of 0 for.
inline constexpr std::uint16_t defaultRawCode = 801;

}  // namespace zelta

#endif
