#include "klv/ber.h"

#include <endian.h>

#include <cstring>

#include "core/reports.h"
#include "klv/stream_input.h"

namespace zelta::klv {

namespace {

constexpr std::uint8_t shortForm = 1;
constexpr unsigned longestForm = 8;

void noteForm(std::uint8_t form, std::uint8_t& currentForm, KLVHandler& handler) {
  if (form == currentForm) return;
  currentForm = form;
  handler.setLengthForm(form);
}

[[noreturn]] void invalidLongForm(std::uint8_t first) {
  throw KLVElement::parse_error(berLengthErrorId, detailed("invalid BER long form", octetText(first)));
}

// The longest length lies in the stream's buffer: read in place, with one
// load of eight octets for any long form.
std::uint64_t readHeldLength(std::streambuf& buffer, std::uint8_t& currentForm, KLVHandler& handler) {
  const auto* held = reinterpret_cast<const unsigned char*>(GetArea::next(buffer));
  const std::uint8_t first = held[0];
  if ((first & 0x80) == 0) {
    GetArea::move(buffer, 1);
    noteForm(shortForm, currentForm, handler);
    return first;
  }
  const unsigned octets = first & 0x7F;
  if (octets < 1 || octets > longestForm) invalidLongForm(first);
  std::uint64_t eight = 0;
  std::memcpy(&eight, held + 1, sizeof eight);
  const std::uint64_t length = be64toh(eight) >> (8 * (longestForm - octets));
  GetArea::move(buffer, 1 + octets);
  noteForm(first, currentForm, handler);
  return length;
}

}  // namespace

std::uint64_t readBERLength(std::istream& stream, std::uint8_t& currentForm, KLVHandler& handler) {
  std::streambuf* buffer = heldBy(stream);
  if (buffer && GetArea::available(*buffer) > static_cast<std::streamsize>(longestForm))
    return readHeldLength(*buffer, currentForm, handler);
  std::uint8_t first = 0;
  readOctets(stream, &first, 1);
  if ((first & 0x80) == 0) {
    noteForm(shortForm, currentForm, handler);
    return first;
  }
  const unsigned octets = first & 0x7F;
  if (octets < 1 || octets > longestForm) invalidLongForm(first);
  const std::uint64_t length = readBigEndian(stream, octets);
  noteForm(first, currentForm, handler);
  return length;
}

}  // namespace zelta::klv
