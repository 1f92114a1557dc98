// Texts of parse errors and warnings: a text alone, a text with a key, or a
// text with one octet in hexadecimal.
#ifndef ZELTA_KLV_MESSAGES_H
#define ZELTA_KLV_MESSAGES_H

#include <cstdint>
#include <string>

#include "klv.h"

namespace zelta::klv {

// text " - " and the key as sixteen dotted hexadecimal octets.
std::string withKey(const char* text, const KLVKey& key);
// text " - 0x" and the octet as two upper-case hexadecimal digits.
std::string withOctet(const char* text, std::uint8_t octet);

}  // namespace zelta::klv

#endif
