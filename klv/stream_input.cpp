#include "klv/stream_input.h"

#include <algorithm>
#include <array>
#include <limits>

namespace zelta::klv {

namespace {

constexpr std::streamsize chunkOctets = 65536;
constexpr std::uint64_t largestOffset = static_cast<std::uint64_t>(std::numeric_limits<std::streamoff>::max());

// What the stream's buffer holds ahead, or 0 when the stream may not be read.
std::streamsize buffered(std::istream& stream) {
  std::streambuf* buffer = heldBy(stream);
  return buffer ? GetArea::available(*buffer) : 0;
}

// A seek would throw away what the stream's buffer holds; a skip that ends
// inside it is made there. A seek goes to the stream's buffer straight, as
// seekg() would after lifting the end-of-file bit.
void seekForward(std::istream& stream, std::streamoff octets) {
  if (stream.eof()) stream.clear(stream.rdstate() & ~std::ios_base::eofbit);
  if (stream.fail() ||
      stream.rdbuf()->pubseekoff(octets, std::ios_base::cur, std::ios_base::in) == std::streampos(-1)) {
    stream.setstate(std::ios_base::failbit);
    throw KLVElement::parse_error(streamFailureId, "unsuccessful seekg()");
  }
}

void ignoreForward(std::istream& stream, std::streamsize octets) {
  stream.ignore(octets);
  // ignore() looks one octet beyond the count and may meet the end there.
  if (stream.eof() && stream.gcount() == octets) stream.clear(stream.rdstate() & ~std::ios_base::eofbit);
  if (!stream.good()) throw KLVElement::parse_error(streamFailureId, "unsuccessful ignore()");
}

void skipPiece(std::istream& stream, std::streamoff octets, bool seekable) {
  if (octets <= buffered(stream)) {
    GetArea::move(*stream.rdbuf(), octets);
  } else if (seekable) {
    seekForward(stream, octets);
  } else {
    ignoreForward(stream, octets);
  }
}

}  // namespace

bool isSeekable(std::istream& stream) {
  std::streambuf* buffer = stream.rdbuf();
  if (!buffer) return false;
  try {
    return buffer->pubseekoff(0, std::ios_base::cur, std::ios_base::in) != std::streampos(-1);
  } catch (...) {
    return false;
  }
}

void readFromStream(std::istream& stream, std::uint8_t* octets, std::streamsize n) {
  stream.read(reinterpret_cast<char*>(octets), n);
  if (stream.gcount() != n) throw KLVElement::parse_error(streamFailureId, "unsuccessful read()");
}

std::uint64_t readBigEndianFromStream(std::istream& stream, unsigned octets) {
  std::array<std::uint8_t, 8> bytes;
  readFromStream(stream, bytes.data(), octets);
  return bigEndian(bytes.data(), octets);
}

// As peek() would, without its sentry on a good stream: the end sets the
// end-of-file bit.
bool atEnd(std::istream& stream) {
  std::streambuf* buffer = heldBy(stream);
  if (!buffer) return stream.peek() == std::istream::traits_type::eof();
  if (GetArea::available(*buffer) > 0 || buffer->sgetc() != std::istream::traits_type::eof()) return false;
  stream.setstate(std::ios_base::eofbit);
  return true;
}

void takeValue(std::istream& stream, KLVHandler& handler, std::uint64_t length, std::uint8_t* buffer) {
  if (buffer) {
    const std::streamsize size = static_cast<std::streamsize>(length);
    readOctets(stream, buffer, size);
    handler.value(buffer, size);
    return;
  }
  // What the stream holds already goes to the handler from where it lies.
  std::array<std::uint8_t, chunkOctets> chunk;
  while (length > 0) {
    const std::streamsize n = static_cast<std::streamsize>(std::min<std::uint64_t>(length, chunkOctets));
    if (n <= buffered(stream)) {
      // The stream moves first, so that it stands behind the octets, as
      // after a read, while the handler has them.
      std::streambuf& source = *stream.rdbuf();
      const auto* held = reinterpret_cast<const std::uint8_t*>(GetArea::next(source));
      GetArea::move(source, n);
      handler.value(held, n);
    } else {
      readOctets(stream, chunk.data(), n);
      handler.value(chunk.data(), n);
    }
    length -= static_cast<std::uint64_t>(n);
  }
}

void skipValue(std::istream& stream, std::uint64_t length, bool seekable) {
  // Lengths beyond the largest offset take two pieces.
  if (length > largestOffset) {
    skipPiece(stream, static_cast<std::streamoff>(largestOffset), seekable);
    length -= largestOffset;
  }
  if (length > 0) skipPiece(stream, static_cast<std::streamoff>(length), seekable);
}

void transferValue(std::istream& stream, KLVHandler& handler, bool taken, std::uint64_t length, std::uint8_t* buffer,
                   bool seekable) {
  if (taken)
    takeValue(stream, handler, length, buffer);
  else
    skipValue(stream, length, seekable);
}

}  // namespace zelta::klv
