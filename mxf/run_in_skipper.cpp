#include <cstddef>
#include <stdexcept>
#include <string>

#include "core/reports.h"
#include "klv/stream_input.h"
#include "mxf.h"

namespace {

// The first 11 octets of a partition pack key, the version octet included:
// a run-in is matched more strictly than a key anywhere else.
constexpr std::size_t targetOctets = 11;
constexpr std::uint8_t target[targetOctets] = {0x06, 0x0E, 0x2B, 0x34, 0x02, 0x05, 0x01, 0x01, 0x0D, 0x01, 0x02};

}  // namespace

MXFRunInSkipper::MXFRunInSkipper() = default;

MXFRunInSkipper::~MXFRunInSkipper() = default;

void MXFRunInSkipper::setErrorHandler(ErrorHandler* errorHandler) { errorHandler_ = errorHandler; }

std::uint32_t MXFRunInSkipper::skip(std::istream& stream, std::uint32_t maximum) {
  const auto fatal = [this](const MXFUID& identifier, const char* text) {
    zelta::Reports(errorHandler_).fatalError(identifier, text);
    throw std::runtime_error(text);
  };
  if (!stream.good()) fatal(streamFailureId, "input stream is not good()");
  std::uint64_t count = 0;
  std::size_t matched = 0;
  while (matched < targetOctets && count - matched <= maximum) {
    const std::istream::int_type c = stream.get();
    if (c == std::istream::traits_type::eof()) break;
    ++count;
    const auto octet = static_cast<std::uint8_t>(c);
    if (octet == target[matched])
      ++matched;
    else
      matched = octet == target[0] ? 1 : 0;
  }
  if (matched < targetOctets) {
    if (stream.good() || stream.eof()) fatal(runInErrorId, "invalid run-in");
    fatal(streamFailureId, "unsuccessful get()");
  }
  // The key goes back to the stream, for the KLV reader to find: within the
  // stream's buffer when it still holds it, as a seek would throw the buffer
  // away.
  const auto runIn = static_cast<std::uint32_t>(count - targetOctets);
  if (zelta::klv::backWithinBuffer(stream, static_cast<std::streamoff>(targetOctets))) return runIn;
  if (zelta::klv::isSeekable(stream)) {
    stream.clear(stream.rdstate() & ~std::ios_base::eofbit);
    stream.seekg(-static_cast<std::streamoff>(targetOctets), std::ios_base::cur);
    if (stream.fail()) fatal(streamFailureId, "unsuccessful seekg()");
  } else {
    for (std::size_t i = targetOctets; i-- > 0;) {
      stream.putback(static_cast<char>(target[i]));
      if (stream.fail()) fatal(streamFailureId, "unsuccessful putback()");
    }
  }
  return runIn;
}
