// Labels as the tests spell them, compared with every octet, the version
// octet included.
#ifndef ZELTA_TESTS_KIT_KIT_LABELS_H
#define ZELTA_TESTS_KIT_KIT_LABELS_H

#include <array>
#include <cstdint>
#include <string>

#include "support/recording.h"

namespace zelta_test {

inline std::array<std::uint8_t, 16> octetsOf(const std::string& hex) { return keyOf(hex).octets(); }

}  // namespace zelta_test

#endif
