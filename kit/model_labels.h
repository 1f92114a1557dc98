// The labels and constants by which the kit's models are told apart: data
// definitions, the descriptive scheme and its payload, and the codings that
// only the builder writes and the extraction looks for.
#ifndef ZELTA_KIT_MODEL_LABELS_H
#define ZELTA_KIT_MODEL_LABELS_H

#include <array>
#include <cstdint>
#include <string>

#include "kit/labels.h"

namespace zelta {

constexpr KLVKey dataDefinition(std::uint8_t group, std::uint8_t kind) {
  return registryLabel(0x01, {0x01, 0x03, 0x02, group, kind, 0x00, 0x00, 0x00});
}

inline constexpr KLVKey timecodeDataDefinition = dataDefinition(0x01, 0x01);
inline constexpr KLVKey descriptiveDataDefinition = dataDefinition(0x01, 0x10);
inline constexpr KLVKey pictureDataDefinition = dataDefinition(0x02, 0x01);
inline constexpr KLVKey soundDataDefinition = dataDefinition(0x02, 0x02);
inline constexpr KLVKey dataDataDefinition = dataDefinition(0x02, 0x03);

// Compared whole but for the version octet.
inline constexpr KLVKey textBasedDMScheme = registryLabel(0x0C, {0x0D, 0x01, 0x04, 0x01, 0x04, 0x01, 0x01, 0x00});
// What the descriptive text of a kit's file is.
inline constexpr KLVKey descriptiveTextPayloadScheme(std::array<std::uint8_t, 16>{
    0x8A, 0x39, 0x08, 0x00, 0x46, 0x78, 0x03, 0x1C, 0x78, 0x6D, 0x4D, 0x20, 0x82, 0x80, 0x11, 0xDE});
inline const std::wstring descriptiveTextMIMEType = L"text/xml";

// The dark property of a proxy picture descriptor that holds its decoder
// specific information.
inline constexpr KLVKey proxyDecoderSpecificInfoKey =
    registryLabel(0x01, {0x0E, 0x06, 0x06, 0x02, 0x02, 0x01, 0x00, 0x00});
inline constexpr KLVKey proxyPictureCoding = registryLabel(0x03, {0x04, 0x01, 0x02, 0x02, 0x01, 0x20, 0x02, 0x04});
inline constexpr KLVKey proxySoundCompression = registryLabel(0x03, {0x04, 0x02, 0x02, 0x02, 0x03, 0x01, 0x01, 0x00});
inline constexpr KLVKey avcSoundCompression = registryLabel(0x0A, {0x04, 0x02, 0x02, 0x01, 0x01, 0x00, 0x00, 0x00});

// What the extraction answers for the bit rate of a proxy picture, whose
// descriptor holds none.
inline constexpr std::uint32_t proxyBitRate = 1500000;

// Proxy sound: eight channels in four stereo tracks of 8 bits.
inline constexpr std::uint32_t proxyChannelsPerTrack = 2;
inline constexpr std::uint32_t proxyQuantizationBits = 8;

}  // namespace zelta

#endif
