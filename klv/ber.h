// Reading a BER-coded length, telling a handler when the form changes.
#ifndef ZELTA_KLV_BER_H
#define ZELTA_KLV_BER_H

#include <cstdint>
#include <istream>

#include "klv.h"

namespace zelta::klv {

// Reads one BER length. When its form differs from currentForm, the form is
// stored there and handler.setLengthForm fires before the length is
// returned. Throws parse_error for a long form of 0 or more than 8 octets and
// for a short read.
std::uint64_t readBERLength(std::istream& stream, std::uint8_t& currentForm, KLVHandler& handler);

}  // namespace zelta::klv

#endif
