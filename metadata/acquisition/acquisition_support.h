// What the acquisition classes share: their keys as the tables spell them
// and the property order hint that their factories write.
#ifndef ZELTA_METADATA_ACQUISITION_ACQUISITION_SUPPORT_H
#define ZELTA_METADATA_ACQUISITION_ACQUISITION_SUPPORT_H

#include <array>
#include <cstdint>
#include <vector>

#include "metadata.h"
#include "metadata/property_table.h"

namespace zelta {

// 06 0E 2B 34 02 53 01 01 0C 02 01 01, the class octet, 01 00 00.
inline KLVKey acquisitionSetKey(std::uint8_t classOctet) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0C, 0x02, 0x01, 0x01,
                                             classOctet, 0x01, 0x00, 0x00});
}

// A property of version 0D with its static tag.
inline PropertyKey acquisitionKey(std::uint16_t tag, const std::array<std::uint8_t, 8>& item) {
  return {registeredPropertyKey(0x0D, item), tag};
}

// Enters the hint: the instance identifier, then the keys of order that the
// set holds, in that order. What the hint doesn't name follows in key order.
void writeOrderHint(MXFPropertyMap& properties, const std::vector<KLVKey>& order);

}  // namespace zelta

#endif
