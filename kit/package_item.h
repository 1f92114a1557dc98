// The one individual item that the kit's files carry beside their metadata
// sets.
#ifndef ZELTA_KIT_PACKAGE_ITEM_H
#define ZELTA_KIT_PACKAGE_ITEM_H

#include <array>

#include "klv.h"

namespace zelta {

// 06 0E 2B 34 01 01 01 05 03 01 02 20 01 00 00 00; reading ignores the
// version octet, as every key comparison does.
inline constexpr KLVKey packageItemKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x05,
                                                                    0x03, 0x01, 0x02, 0x20, 0x01, 0x00, 0x00, 0x00});

}  // namespace zelta

#endif
