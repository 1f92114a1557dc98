#include <cstdint>
#include <istream>
#include <locale>
#include <ostream>
#include <string>

#include "klv.h"

namespace {

constexpr std::uint32_t leadingSurrogateFirst = 0xD800;
constexpr std::uint32_t trailingSurrogateFirst = 0xDC00;
constexpr std::uint32_t surrogateLast = 0xDFFF;
constexpr std::uint32_t firstSupplementary = 0x10000;
constexpr std::uint32_t lastCodePoint = 0x10FFFF;
// (code point >> 10) + this is the leading surrogate: 0xD800 - (0x10000 >> 10).
constexpr std::uint32_t leadingSurrogateOffset = 55232;

bool isLeadingSurrogate(std::uint32_t u) { return u >= leadingSurrogateFirst && u < trailingSurrogateFirst; }
bool isTrailingSurrogate(std::uint32_t u) { return u >= trailingSurrogateFirst && u <= surrogateLast; }

// Octets left in a stream that can seek; -1 for one that cannot say.
std::streamoff remainingOctets(std::istream& in) {
  if (!in.good()) return -1;
  std::streampos here = in.tellg();
  if (here == std::streampos(-1)) return -1;
  in.seekg(0, std::ios_base::end);
  std::streampos end = in.tellg();
  in.seekg(here);
  check(!in.fail(), "successful seekg()");
  return end == std::streampos(-1) ? -1 : static_cast<std::streamoff>(end - here);
}

bool atEnd(std::istream& in) { return in.peek() == std::istream::traits_type::eof(); }

}  // namespace

void internalize(std::istream& in, std::wstring& v) {
  v.clear();
  std::streamoff octets = remainingOctets(in);
  if (octets >= 0) {
    check(octets % 2 == 0, "correct size of UTF-16 string");
    v.reserve(static_cast<std::size_t>(octets / 2));
  }
  bool trailingDue = false;
  std::uint32_t leading = 0;
  while (!atEnd(in)) {
    std::uint32_t u = util::getBigEndian<std::uint16_t>(in);
    if (trailingDue) {
      check(isTrailingSurrogate(u), "expected UTF-16 trailing surrogate");
      std::uint32_t c = firstSupplementary + ((leading - leadingSurrogateFirst) << 10) + (u - trailingSurrogateFirst);
      v.push_back(static_cast<wchar_t>(c));
      trailingDue = false;
    } else if (isLeadingSurrogate(u)) {
      leading = u;
      trailingDue = true;
    } else {
      check(!isTrailingSurrogate(u), "expected UTF-16 character or leading surrogate");
      v.push_back(static_cast<wchar_t>(u));
    }
  }
  check(!trailingDue, "expected UTF-16 trailing surrogate");
}

void externalize(std::ostream& out, const std::wstring& v) {
  for (wchar_t w : v) {
    std::uint32_t c = static_cast<std::uint32_t>(w);
    if (c < firstSupplementary) {
      util::putBigEndian(out, static_cast<std::uint16_t>(c));
      continue;
    }
    check(c <= lastCodePoint, "expected legal UTF-32 code point");
    util::putBigEndian(out, static_cast<std::uint16_t>((c >> 10) + leadingSurrogateOffset));
    util::putBigEndian(out, static_cast<std::uint16_t>(trailingSurrogateFirst + (c & 0x3FF)));
  }
}

void internalize(std::istream& in, std::string& v) {
  v.clear();
  std::streamoff octets = remainingOctets(in);
  if (octets > 0) {
    v.resize(static_cast<std::size_t>(octets));
    in.read(&v[0], octets);
    check(in.gcount() == octets, "successful read()");
    return;
  }
  while (!atEnd(in)) v.push_back(static_cast<char>(util::getOctet(in)));
}

void externalize(std::ostream& out, const std::string& v) {
  out.write(v.data(), static_cast<std::streamsize>(v.size()));
}

namespace util {
namespace utf8 {

const char* exception::what() const noexcept { return "UTF-8 conversion failure"; }

const char* invalid_code_point::what() const noexcept { return "Invalid code point"; }

namespace {

// Octets of a sequence by its first octet, and the least code point that
// needs that many (anything less is an overlong form); 0 octets for an
// octet that cannot start a sequence.
struct SequenceForm {
  unsigned octets;
  std::uint32_t payload;
  std::uint32_t least;
};

SequenceForm formOf(std::uint8_t first) {
  if (first < 0x80) return {1, first, 0};
  if ((first & 0xE0) == 0xC0) return {2, first & 0x1Fu, 0x80};
  if ((first & 0xF0) == 0xE0) return {3, first & 0x0Fu, 0x800};
  if ((first & 0xF8) == 0xF0) return {4, first & 0x07u, firstSupplementary};
  return {0, 0, 0};
}

bool isScalarValue(std::uint32_t c) {
  return c <= lastCodePoint && !(c >= leadingSurrogateFirst && c <= surrogateLast);
}

}  // namespace

std::wstring decode(const std::string& text) {
  std::wstring result;
  result.reserve(text.size());
  std::size_t i = 0;
  while (i < text.size()) {
    SequenceForm form = formOf(static_cast<std::uint8_t>(text[i]));
    if (form.octets == 0 || text.size() - i < form.octets) throw invalid_code_point();
    std::uint32_t c = form.payload;
    for (unsigned k = 1; k < form.octets; ++k) {
      std::uint8_t next = static_cast<std::uint8_t>(text[i + k]);
      if ((next & 0xC0) != 0x80) throw invalid_code_point();
      c = (c << 6) | (next & 0x3Fu);
    }
    if (c < form.least || !isScalarValue(c)) throw invalid_code_point();
    result.push_back(static_cast<wchar_t>(c));
    i += form.octets;
  }
  return result;
}

std::string encode(const std::wstring& text) {
  std::string result;
  result.reserve(text.size());
  for (wchar_t w : text) {
    std::uint32_t c = static_cast<std::uint32_t>(w);
    if (!isScalarValue(c)) throw invalid_code_point();
    if (c < 0x80) {
      result.push_back(static_cast<char>(c));
    } else if (c < 0x800) {
      result.push_back(static_cast<char>(0xC0 | (c >> 6)));
      result.push_back(static_cast<char>(0x80 | (c & 0x3F)));
    } else if (c < firstSupplementary) {
      result.push_back(static_cast<char>(0xE0 | (c >> 12)));
      result.push_back(static_cast<char>(0x80 | ((c >> 6) & 0x3F)));
      result.push_back(static_cast<char>(0x80 | (c & 0x3F)));
    } else {
      result.push_back(static_cast<char>(0xF0 | (c >> 18)));
      result.push_back(static_cast<char>(0x80 | ((c >> 12) & 0x3F)));
      result.push_back(static_cast<char>(0x80 | ((c >> 6) & 0x3F)));
      result.push_back(static_cast<char>(0x80 | (c & 0x3F)));
    }
  }
  return result;
}

}  // namespace utf8
}  // namespace util

namespace loomlib {

istringstream_classic::istringstream_classic() { imbue(std::locale::classic()); }

istringstream_classic::istringstream_classic(const std::string& text) : std::istringstream(text) {
  imbue(std::locale::classic());
}

ostringstream_classic::ostringstream_classic() { imbue(std::locale::classic()); }

}  // namespace loomlib
