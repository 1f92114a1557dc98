// How the kit spells the registry's labels: the common head, the version
// octet and the eight octets that tell them apart.
#ifndef ZELTA_KIT_LABELS_H
#define ZELTA_KIT_LABELS_H

#include <array>
#include <cstdint>

#include "klv.h"

namespace zelta {

// 06 0E 2B 34 04 01 01 version, then the tail.
constexpr KLVKey registryLabel(std::uint8_t version, const std::array<std::uint8_t, 8>& tail) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, version, tail[0], tail[1],
                                             tail[2], tail[3], tail[4], tail[5], tail[6], tail[7]});
}

constexpr std::size_t labelVersionOctet = 7;

}  // namespace zelta

#endif
