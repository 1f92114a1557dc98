#include "klv/ber.h"

#include "klv/messages.h"
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

}  // namespace

std::uint64_t readBERLength(std::istream& stream, std::uint8_t& currentForm, KLVHandler& handler) {
  std::uint8_t first = 0;
  readOctets(stream, &first, 1);
  if ((first & 0x80) == 0) {
    noteForm(shortForm, currentForm, handler);
    return first;
  }
  const unsigned octets = first & 0x7F;
  if (octets < 1 || octets > longestForm)
    throw KLVElement::parse_error(berLengthErrorId, withOctet("invalid BER long form", first));
  const std::uint64_t length = readBigEndian(stream, octets);
  noteForm(first, currentForm, handler);
  return length;
}

}  // namespace zelta::klv
