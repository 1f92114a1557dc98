#include "core/reports.h"

#include <cstdio>

namespace zelta {

std::string detailed(const std::string& text, const std::string& detail) { return text + " - " + detail; }

std::string keyText(const KLVKey& key) {
  loomlib::ostringstream_classic out;
  out << key;
  return out.str();
}

std::string octetText(std::uint8_t octet) { return hexText(octet, 2); }

std::string hexText(std::uint64_t value, int digits) {
  char text[24];
  std::snprintf(text, sizeof text, "0x%0*llX", digits, static_cast<unsigned long long>(value));
  return text;
}

std::string tagText(std::uint32_t tag) {
  char text[8];
  std::snprintf(text, sizeof text, "%02X.%02X", (tag >> 8) & 0xFFu, tag & 0xFFu);
  return text;
}

std::string identifierText(const MXFUID& identifier) {
  static const char digits[] = "0123456789abcdef";
  std::string text;
  for (std::size_t i = 0; i < 16; ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text += '-';
    text += digits[identifier[i] >> 4];
    text += digits[identifier[i] & 0x0F];
  }
  return text;
}

}  // namespace zelta
