// Reading the octets of keys, lengths, tags and values, where a short read or
// a failed skip is a parse error of the stream.
#ifndef ZELTA_KLV_STREAM_INPUT_H
#define ZELTA_KLV_STREAM_INPUT_H

#include <cstdint>
#include <cstring>
#include <istream>

#include "core/get_area.h"
#include "klv.h"

namespace zelta::klv {

// The first four octets of every SMPTE key.
inline constexpr std::uint8_t smptePrefix[4] = {0x06, 0x0E, 0x2B, 0x34};

// Whether the stream's buffer can tell where it is: a zero relative seek that
// does not answer -1. A buffer that cannot is read as a pipe.
bool isSeekable(std::istream& stream);

// The stream's buffer when octets may be taken from what it holds, else
// null.
inline std::streambuf* heldBy(std::istream& stream) {
  return stream.rdstate() == std::ios_base::goodbit ? stream.rdbuf() : nullptr;
}

// Exactly n octets by one read of the stream ("unsuccessful read()").
void readFromStream(std::istream& stream, std::uint8_t* octets, std::streamsize n);

// Exactly n octets: from the stream's buffer when it holds them, which is
// where nearly every key and length comes from, else by one read.
inline void readOctets(std::istream& stream, std::uint8_t* octets, std::streamsize n) {
  std::streambuf* buffer = heldBy(stream);
  if (buffer && n <= GetArea::available(*buffer)) {
    if (n == 0) return;
    std::memcpy(octets, GetArea::next(*buffer), static_cast<std::size_t>(n));
    GetArea::move(*buffer, n);
    return;
  }
  readFromStream(stream, octets, n);
}

// The number that 1 to 8 octets spell, the first the most significant.
inline std::uint64_t bigEndian(const unsigned char* octets, unsigned count) {
  std::uint64_t value = 0;
  for (unsigned i = 0; i < count; ++i) value = (value << 8) | octets[i];
  return value;
}

// A big-endian number of 1 to 8 octets by one read of the stream.
std::uint64_t readBigEndianFromStream(std::istream& stream, unsigned octets);

// A big-endian number of 1 to 8 octets, taken where the stream's buffer
// holds it.
inline std::uint64_t readBigEndian(std::istream& stream, unsigned octets) {
  std::streambuf* buffer = heldBy(stream);
  if (!buffer || octets > GetArea::available(*buffer)) return readBigEndianFromStream(stream, octets);
  const std::uint64_t value = bigEndian(reinterpret_cast<const unsigned char*>(GetArea::next(*buffer)), octets);
  GetArea::move(*buffer, octets);
  return value;
}

// A key of 16 octets.
inline KLVKey readKey(std::istream& stream) {
  KLVKey key;
  readOctets(stream, key.data(), KLVKey::size());
  return key;
}
// Moves back over octets just read when the stream's buffer still holds
// them, which keeps the buffer that a seek would throw away; false, and no
// move, when it does not.
inline bool backWithinBuffer(std::istream& stream, std::streamoff octets) {
  std::streambuf* buffer = stream.rdbuf();
  if (!buffer || GetArea::behind(*buffer) < octets) return false;
  GetArea::move(*buffer, -octets);
  return true;
}

// Whether no octet follows; asks the stream only when its buffer is empty.
bool atEnd(std::istream& stream);

// Delivers a value that the handler took: into its buffer with one read or
// copied from the stream's buffer, and one value event; else in chunks of at
// most 64 KiB, from where the stream's buffer holds them or from a buffer of
// our own.
void takeValue(std::istream& stream, KLVHandler& handler, std::uint64_t length, std::uint8_t* buffer);
// Passes over a declined value: inside the stream's buffer when it ends
// there, else by relative seek when the stream can seek, else by ignore().
void skipValue(std::istream& stream, std::uint64_t length, bool seekable);
// takeValue when taken, else skipValue.
void transferValue(std::istream& stream, KLVHandler& handler, bool taken, std::uint64_t length, std::uint8_t* buffer,
                   bool seekable);

}  // namespace zelta::klv

#endif
