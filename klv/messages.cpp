#include "klv/messages.h"

#include <cstdio>
#include <sstream>

namespace zelta::klv {

std::string withKey(const char* text, const KLVKey& key) {
  std::ostringstream out;
  out << text << " - " << key;
  return out.str();
}

std::string withOctet(const char* text, std::uint8_t octet) {
  char digits[3];
  std::snprintf(digits, sizeof digits, "%02X", static_cast<unsigned>(octet));
  return std::string(text) + " - 0x" + digits;
}

}  // namespace zelta::klv
