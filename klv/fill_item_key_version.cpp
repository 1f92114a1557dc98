#include <mutex>

#include "klv.h"

namespace {

// One slot for the whole process, allocated on first use.
int fillItemKeyVersionSlot() {
  static std::once_flag once;
  static int slot = 0;
  std::call_once(once, [] { slot = std::ios_base::xalloc(); });
  return slot;
}

}  // namespace

void setFillItemKeyVersion(std::ios_base& stream, std::uint8_t version) {
  stream.iword(fillItemKeyVersionSlot()) = version;
}

std::uint8_t getFillItemKeyVersion(std::ios_base& stream) {
  return static_cast<std::uint8_t>(stream.iword(fillItemKeyVersionSlot()));
}
