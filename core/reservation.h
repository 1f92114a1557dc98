// How much memory a length read from a file may reserve ahead.
#ifndef ZELTA_CORE_RESERVATION_H
#define ZELTA_CORE_RESERVATION_H

#include <algorithm>
#include <cstddef>
#include <cstdint>

namespace zelta {

// A length from a file is a hint for a buffer only: a damaged one must not
// make the reader allocate what the stream never holds. Buffers grow past
// this as octets arrive.
inline constexpr std::uint64_t largestReservation = 65536;

inline std::size_t reservationFor(std::uint64_t length) {
  return static_cast<std::size_t>(std::min(length, largestReservation));
}

}  // namespace zelta

#endif
