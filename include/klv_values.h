// Zelta: keys, identifiers and the small value types, their conversion to and
// from big-endian octets, text conversion, streams over memory, and failure
// reporting. Part of klv.h, which includes it.
#ifndef ZELTA_INCLUDE_KLV_VALUES_H
#define ZELTA_INCLUDE_KLV_VALUES_H

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <exception>
#include <ios>
#include <iosfwd>
#include <istream>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include <boost/iostreams/categories.hpp>
#include <boost/iostreams/stream.hpp>

#include "zelta_export.h"

typedef std::vector<std::uint8_t> ByteVector;

// ---------------------------------------------------------------------------
// Failure reporting by checks

namespace util {

// A broken rule of program logic, a caller's fault, or a malformed value in
// already delimited octets.
class ZELTA_EXPORT assertion_failure : public std::exception {
public:
  explicit assertion_failure(const std::string& condition);
  const char* what() const noexcept override;

private:
  std::string message_;
};

}  // namespace util

// Throws util::assertion_failure with the text when the condition is false.
// Texts say what must hold.
inline void check(bool condition, const char* text) {
  if (!condition) throw util::assertion_failure(text);
}
inline void check(bool condition, const std::string& text) {
  if (!condition) throw util::assertion_failure(text);
}

// ---------------------------------------------------------------------------
// Keys and identifiers

// A 16-octet SMPTE universal label. Octet 7, the registry version, takes no
// part in equality or order.
class ZELTA_EXPORT KLVKey {
public:
  static constexpr std::size_t size() { return 16; }

  constexpr KLVKey() : octets_{} {}
  constexpr explicit KLVKey(const std::array<std::uint8_t, 16>& octets) : octets_(octets) {}
  explicit KLVKey(const std::uint8_t* octets) { std::memcpy(octets_.data(), octets, 16); }

  constexpr std::uint8_t operator[](std::size_t i) const { return octets_[i]; }
  std::uint8_t& operator[](std::size_t i) { return octets_[i]; }
  const std::uint8_t* data() const { return octets_.data(); }
  std::uint8_t* data() { return octets_.data(); }
  const std::array<std::uint8_t, 16>& octets() const { return octets_; }

  bool operator==(const KLVKey& other) const {
    return std::memcmp(octets_.data(), other.octets_.data(), 7) == 0 &&
           std::memcmp(octets_.data() + 8, other.octets_.data() + 8, 8) == 0;
  }
  bool operator!=(const KLVKey& other) const { return !(*this == other); }
  bool operator<(const KLVKey& other) const {
    int c = std::memcmp(octets_.data(), other.octets_.data(), 7);
    if (c != 0) return c < 0;
    return std::memcmp(octets_.data() + 8, other.octets_.data() + 8, 8) < 0;
  }
  bool operator>(const KLVKey& other) const { return other < *this; }
  bool operator<=(const KLVKey& other) const { return !(other < *this); }
  bool operator>=(const KLVKey& other) const { return !(*this < other); }

private:
  std::array<std::uint8_t, 16> octets_;
};

// Sixteen upper-case two-digit hexadecimal octets joined by "."; the
// stream's flags and fill are left as they were.
ZELTA_EXPORT std::ostream& operator<<(std::ostream& out, const KLVKey& key);

// A key with a mask: a zero octet of the pattern, and octet 7 always, are
// wildcards.
class ZELTA_EXPORT KLVKeyPattern {
public:
  constexpr explicit KLVKeyPattern(const std::array<std::uint8_t, 16>& pattern)
      : pattern_(pattern), mask_(maskOf(pattern)) {}

  // Every element of a file is matched against several families: eight
  // octets at a time, without a branch per octet.
  bool matches(const KLVKey& key) const {
    std::uint64_t k[2];
    std::uint64_t p[2];
    std::uint64_t m[2];
    std::memcpy(k, key.data(), 16);
    std::memcpy(p, pattern_.data(), 16);
    std::memcpy(m, mask_.data(), 16);
    return (((k[0] ^ p[0]) & m[0]) | ((k[1] ^ p[1]) & m[1])) == 0;
  }
  const std::array<std::uint8_t, 16>& pattern() const { return pattern_; }
  const std::array<std::uint8_t, 16>& mask() const { return mask_; }
  // Narrows or widens a family by hand.
  constexpr KLVKeyPattern withMask(std::size_t i, std::uint8_t m) const {
    KLVKeyPattern p = *this;
    p.mask_[i] = m;
    return p;
  }

private:
  static constexpr std::array<std::uint8_t, 16> maskOf(const std::array<std::uint8_t, 16>& p) {
    std::array<std::uint8_t, 16> m{};
    for (std::size_t i = 0; i < 16; ++i) m[i] = (i == 7 || p[i] == 0) ? 0x00 : 0xFF;
    return m;
  }
  std::array<std::uint8_t, 16> pattern_;
  std::array<std::uint8_t, 16> mask_;
};

// 16 opaque octets: instance, generation and error identifiers.
class ZELTA_EXPORT MXFUID {
public:
  constexpr MXFUID() : octets_{} {}
  constexpr explicit MXFUID(const std::array<std::uint8_t, 16>& octets) : octets_(octets) {}
  explicit MXFUID(const std::uint8_t* octets) { std::memcpy(octets_.data(), octets, 16); }

  constexpr std::uint8_t operator[](std::size_t i) const { return octets_[i]; }
  std::uint8_t& operator[](std::size_t i) { return octets_[i]; }
  const std::uint8_t* data() const { return octets_.data(); }
  std::uint8_t* data() { return octets_.data(); }
  const std::array<std::uint8_t, 16>& octets() const { return octets_; }

  bool operator==(const MXFUID& o) const { return octets_ == o.octets_; }
  bool operator!=(const MXFUID& o) const { return octets_ != o.octets_; }
  bool operator<(const MXFUID& o) const { return octets_ < o.octets_; }

private:
  std::array<std::uint8_t, 16> octets_;
};

class ZELTA_EXPORT MXFUIDGenerator {
public:
  virtual ~MXFUIDGenerator();
  virtual MXFUID generate() = 0;
};

// Identifiers as uuid_generate makes them.
class ZELTA_EXPORT ZeltaDefaultUIDGenerator : public MXFUIDGenerator {
public:
  MXFUID generate() override;
};

// SMPTE 330M unique material identifier: kind 0 basic (32 octets) or 1
// extended (64 octets).
struct ZELTA_EXPORT UMID {
  enum Kind : std::uint8_t { basic = 0, extended = 1 };

  UMID();
  UMID(Kind kind, const ByteVector& octets);

  // A new material number: the fixed label, the caller's material type,
  // creation method 0x23, instance 0 and 16 octets of uuid_generate.
  static UMID createNew(std::uint8_t materialType, Kind kind = basic);

  Kind kind;
  ByteVector octets;

  bool operator==(const UMID& o) const { return kind == o.kind && octets == o.octets; }
  bool operator!=(const UMID& o) const { return !(*this == o); }
};

struct ZELTA_EXPORT MXFRational {
  std::int32_t numerator = 0;
  std::int32_t denominator = 0;
  bool operator==(const MXFRational& o) const { return numerator == o.numerator && denominator == o.denominator; }
  bool operator!=(const MXFRational& o) const { return !(*this == o); }
};

struct ZELTA_EXPORT MXFTimestamp {
  std::uint16_t year = 0;
  std::uint8_t month = 0;
  std::uint8_t day = 0;
  std::uint8_t hour = 0;
  std::uint8_t minute = 0;
  std::uint8_t second = 0;
  std::uint8_t quarterMillisecond = 0;
  bool operator==(const MXFTimestamp& o) const;
  bool operator!=(const MXFTimestamp& o) const { return !(*this == o); }
};

struct ZELTA_EXPORT MXFProductVersion {
  std::uint16_t major = 0;
  std::uint16_t minor = 0;
  std::uint16_t tertiary = 0;
  std::uint16_t patch = 0;
  std::uint16_t release = 0;
  bool operator==(const MXFProductVersion& o) const;
  bool operator!=(const MXFProductVersion& o) const { return !(*this == o); }
};

// A 12-bit mantissa and a signed exponent from -8 to 7.
struct ZELTA_EXPORT Decimal16 {
  std::uint16_t mantissa = 0;
  std::int8_t exponent = 0;
  bool operator==(const Decimal16& o) const { return mantissa == o.mantissa && exponent == o.exponent; }
  bool operator!=(const Decimal16& o) const { return !(*this == o); }
};

// IEEE 754 half precision held apart; built from a float it saturates at
// 65504 instead of becoming infinite.
struct ZELTA_EXPORT Binary16 {
  Binary16() = default;
  explicit Binary16(float value);
  float toFloat() const;

  bool sign = false;
  std::uint16_t mantissa = 0;
  std::uint8_t exponent = 0;
  bool operator==(const Binary16& o) const {
    return sign == o.sign && mantissa == o.mantissa && exponent == o.exponent;
  }
  bool operator!=(const Binary16& o) const { return !(*this == o); }
};

// ---------------------------------------------------------------------------
// Failure reporting to the client

// A stream position, -1 when unknown.
class ZELTA_EXPORT Locator {
public:
  virtual ~Locator();
  virtual const std::streampos& getPosition() = 0;
};

class ZELTA_EXPORT ErrorHandler {
public:
  virtual ~ErrorHandler();
  virtual void setLocator(Locator* locator) = 0;
  virtual void start() = 0;
  virtual void end() = 0;
  virtual void warning(const MXFUID& identifier, const std::string& message) = 0;
  virtual void error(const MXFUID& identifier, const std::string& message) = 0;
  virtual void fatalError(const MXFUID& identifier, const std::string& message) = 0;
};

// Error identifiers: a family, a code and a fixed tail.
constexpr MXFUID ZeltaErrorId(std::uint8_t family0, std::uint8_t family1, std::uint8_t code0,
                              std::uint8_t code1) {
  return MXFUID(std::array<std::uint8_t, 16>{family0, family1, code0, code1, 0x95, 0xD8, 0x11, 0xE1, 0xBB,
                                             0xB2, 0x10, 0x9A, 0xDD, 0x4A, 0xC6, 0x8C});
}

// Family roots.
inline constexpr MXFUID streamFamilyId = ZeltaErrorId(0x4C, 0x4A, 0x00, 0x00);
inline constexpr MXFUID klvFamilyId = ZeltaErrorId(0x4C, 0x4B, 0x00, 0x00);
inline constexpr MXFUID structureFamilyId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x00);
inline constexpr MXFUID genericContainerFamilyId = ZeltaErrorId(0x4C, 0x4D, 0x00, 0x00);
inline constexpr MXFUID sdticpFamilyId = ZeltaErrorId(0x4C, 0x4E, 0x00, 0x00);
inline constexpr MXFUID modelFamilyId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x00);
inline constexpr MXFUID kitValidatorFamilyId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x00);
inline constexpr MXFUID proxySystemFamilyId = ZeltaErrorId(0x4C, 0x51, 0x00, 0x00);

inline constexpr MXFUID streamFailureId = ZeltaErrorId(0x4C, 0x4A, 0x00, 0x01);
inline constexpr MXFUID klvCodingErrorId = ZeltaErrorId(0x4C, 0x4B, 0x00, 0x01);
inline constexpr MXFUID berLengthErrorId = ZeltaErrorId(0x4C, 0x4B, 0x00, 0x02);
inline constexpr MXFUID klvLengthErrorId = ZeltaErrorId(0x4C, 0x4B, 0x00, 0x03);
inline constexpr MXFUID fillItemKeyVersionId = ZeltaErrorId(0x4C, 0x4B, 0x00, 0x04);

// ---------------------------------------------------------------------------
// Streams over memory and text

namespace util {

// Read-only stream buffer over bytes it does not own.
class ZELTA_EXPORT vector_streambuf : public std::streambuf {
public:
  vector_streambuf();
  explicit vector_streambuf(const ByteVector& bytes);
  vector_streambuf(const std::uint8_t* data, std::size_t size);
  // Reads other bytes from their start.
  void reset(const std::uint8_t* data, std::size_t size);

protected:
  pos_type seekoff(off_type off, std::ios_base::seekdir dir,
                   std::ios_base::openmode which = std::ios_base::in) override;
  pos_type seekpos(pos_type pos, std::ios_base::openmode which = std::ios_base::in) override;
  std::streamsize showmanyc() override;
};

// Input stream over a byte vector, without copying.
class ZELTA_EXPORT vector_istream : public std::istream {
public:
  explicit vector_istream(const ByteVector& bytes);
  vector_istream(const std::uint8_t* data, std::size_t size);
  // Reads other bytes from their start, with a clear state.
  void reset(const ByteVector& bytes);

private:
  vector_streambuf buffer_;
};

// Boost.Iostreams sink that appends to a byte vector.
class ZELTA_EXPORT byte_vector_device {
public:
  typedef char char_type;
  typedef boost::iostreams::sink_tag category;

  explicit byte_vector_device(ByteVector& bytes) : bytes_(&bytes) {}
  std::streamsize write(const char* s, std::streamsize n) {
    bytes_->insert(bytes_->end(), reinterpret_cast<const std::uint8_t*>(s),
                   reinterpret_cast<const std::uint8_t*>(s) + n);
    return n;
  }

private:
  ByteVector* bytes_;
};

namespace utf8 {

class ZELTA_EXPORT exception : public std::exception {
public:
  const char* what() const noexcept override;
};

class ZELTA_EXPORT invalid_code_point : public exception {
public:
  const char* what() const noexcept override;
};

// UTF-8 octets to code points; throws invalid_code_point on a sequence that
// is no valid code point.
ZELTA_EXPORT std::wstring decode(const std::string& text);
// Code points to UTF-8; throws invalid_code_point for a surrogate or a value
// beyond U+10FFFF.
ZELTA_EXPORT std::string encode(const std::wstring& text);

}  // namespace utf8

}  // namespace util

namespace loomlib {

// String streams that never depend on the process's locale.
class ZELTA_EXPORT istringstream_classic : public std::istringstream {
public:
  istringstream_classic();
  explicit istringstream_classic(const std::string& text);
};

class ZELTA_EXPORT ostringstream_classic : public std::ostringstream {
public:
  ostringstream_classic();
};

}  // namespace loomlib

// ---------------------------------------------------------------------------
// Conversion of values to and from big-endian octets
//
// Stream forms read or write one value; the byte vector forms wrap them:
// internalize requires the octets to be used up ("valid external length"),
// externalize appends, after clearing when reset is true.

namespace util {

template <typename T>
struct external_size;  // octets of the external form of fixed-size types
template <> struct external_size<std::uint8_t> { static constexpr std::uint32_t value = 1; };
template <> struct external_size<std::int8_t> { static constexpr std::uint32_t value = 1; };
template <> struct external_size<bool> { static constexpr std::uint32_t value = 1; };
template <> struct external_size<std::uint16_t> { static constexpr std::uint32_t value = 2; };
template <> struct external_size<std::int16_t> { static constexpr std::uint32_t value = 2; };
template <> struct external_size<std::uint32_t> { static constexpr std::uint32_t value = 4; };
template <> struct external_size<std::int32_t> { static constexpr std::uint32_t value = 4; };
template <> struct external_size<std::uint64_t> { static constexpr std::uint32_t value = 8; };
template <> struct external_size<std::int64_t> { static constexpr std::uint32_t value = 8; };
template <> struct external_size<MXFRational> { static constexpr std::uint32_t value = 8; };
template <> struct external_size<MXFTimestamp> { static constexpr std::uint32_t value = 8; };
template <> struct external_size<MXFProductVersion> { static constexpr std::uint32_t value = 10; };
template <> struct external_size<KLVKey> { static constexpr std::uint32_t value = 16; };
template <> struct external_size<MXFUID> { static constexpr std::uint32_t value = 16; };
template <> struct external_size<Decimal16> { static constexpr std::uint32_t value = 2; };
template <> struct external_size<Binary16> { static constexpr std::uint32_t value = 2; };

// Exactly count octets ("successful get()"), from what the stream's buffer
// holds when it holds them: values are read a few octets at a time.
ZELTA_EXPORT void getOctets(std::istream& in, std::uint8_t* octets, std::size_t count);

inline std::uint8_t getOctet(std::istream& in) {
  std::uint8_t octet = 0;
  getOctets(in, &octet, 1);
  return octet;
}

inline void putOctet(std::ostream& out, std::uint8_t octet) {
  out.put(static_cast<char>(octet));
}

template <typename T>
T getBigEndian(std::istream& in) {
  typedef typename std::make_unsigned<T>::type U;
  std::uint8_t octets[sizeof(T)];
  getOctets(in, octets, sizeof(T));
  U v = 0;
  for (std::size_t i = 0; i < sizeof(T); ++i) v = static_cast<U>((v << 8) | octets[i]);
  return static_cast<T>(v);
}

template <typename T>
void putBigEndian(std::ostream& out, T value) {
  typedef typename std::make_unsigned<T>::type U;
  U v = static_cast<U>(value);
  for (std::size_t i = sizeof(T); i-- > 0;) putOctet(out, static_cast<std::uint8_t>(v >> (8 * i)));
}

}  // namespace util

inline void internalize(std::istream& in, std::uint8_t& v) { v = util::getOctet(in); }
inline void internalize(std::istream& in, std::int8_t& v) { v = static_cast<std::int8_t>(util::getOctet(in)); }
inline void internalize(std::istream& in, bool& v) { v = util::getOctet(in) != 0; }
inline void internalize(std::istream& in, std::uint16_t& v) { v = util::getBigEndian<std::uint16_t>(in); }
inline void internalize(std::istream& in, std::int16_t& v) { v = util::getBigEndian<std::int16_t>(in); }
inline void internalize(std::istream& in, std::uint32_t& v) { v = util::getBigEndian<std::uint32_t>(in); }
inline void internalize(std::istream& in, std::int32_t& v) { v = util::getBigEndian<std::int32_t>(in); }
inline void internalize(std::istream& in, std::uint64_t& v) { v = util::getBigEndian<std::uint64_t>(in); }
inline void internalize(std::istream& in, std::int64_t& v) { v = util::getBigEndian<std::int64_t>(in); }
ZELTA_EXPORT void internalize(std::istream& in, MXFRational& v);
ZELTA_EXPORT void internalize(std::istream& in, MXFTimestamp& v);
ZELTA_EXPORT void internalize(std::istream& in, MXFProductVersion& v);
ZELTA_EXPORT void internalize(std::istream& in, KLVKey& v);
ZELTA_EXPORT void internalize(std::istream& in, MXFUID& v);
// 32 octets, and 32 more when the stream holds more: basic or extended.
ZELTA_EXPORT void internalize(std::istream& in, UMID& v);
ZELTA_EXPORT void internalize(std::istream& in, Decimal16& v);
ZELTA_EXPORT void internalize(std::istream& in, Binary16& v);
// Big-endian UTF-16 to code points, surrogate pairs joined; reads to the end.
ZELTA_EXPORT void internalize(std::istream& in, std::wstring& v);
// Octets as they stand; reads to the end.
ZELTA_EXPORT void internalize(std::istream& in, std::string& v);

inline void externalize(std::ostream& out, std::uint8_t v) { util::putOctet(out, v); }
inline void externalize(std::ostream& out, std::int8_t v) { util::putOctet(out, static_cast<std::uint8_t>(v)); }
inline void externalize(std::ostream& out, bool v) { util::putOctet(out, v ? 1 : 0); }
inline void externalize(std::ostream& out, std::uint16_t v) { util::putBigEndian(out, v); }
inline void externalize(std::ostream& out, std::int16_t v) { util::putBigEndian(out, v); }
inline void externalize(std::ostream& out, std::uint32_t v) { util::putBigEndian(out, v); }
inline void externalize(std::ostream& out, std::int32_t v) { util::putBigEndian(out, v); }
inline void externalize(std::ostream& out, std::uint64_t v) { util::putBigEndian(out, v); }
inline void externalize(std::ostream& out, std::int64_t v) { util::putBigEndian(out, v); }
ZELTA_EXPORT void externalize(std::ostream& out, const MXFRational& v);
ZELTA_EXPORT void externalize(std::ostream& out, const MXFTimestamp& v);
ZELTA_EXPORT void externalize(std::ostream& out, const MXFProductVersion& v);
ZELTA_EXPORT void externalize(std::ostream& out, const KLVKey& v);
ZELTA_EXPORT void externalize(std::ostream& out, const MXFUID& v);
ZELTA_EXPORT void externalize(std::ostream& out, const UMID& v);
ZELTA_EXPORT void externalize(std::ostream& out, const Decimal16& v);
ZELTA_EXPORT void externalize(std::ostream& out, const Binary16& v);
ZELTA_EXPORT void externalize(std::ostream& out, const std::wstring& v);
ZELTA_EXPORT void externalize(std::ostream& out, const std::string& v);

// A batch: uint32 count, uint32 item size, the items. Each item is read by
// its own rule and then skipped to the declared item size.
template <typename T>
void internalize(std::istream& in, std::vector<T>& items) {
  std::uint32_t count = 0;
  std::uint32_t itemSize = 0;
  internalize(in, count);
  internalize(in, itemSize);
  items.clear();
  if (count == 0) return;
  // The count comes from the octets: reserve no more than they can hold.
  const std::streamsize available = in.rdbuf() ? in.rdbuf()->in_avail() : 0;
  if (available > 0 && itemSize > 0)
    items.reserve(std::min<std::uint64_t>(count, static_cast<std::uint64_t>(available) / itemSize));
  for (std::uint32_t i = 0; i < count; ++i) {
    std::streampos start = in.tellg();
    T item;
    internalize(in, item);
    std::streamoff used = in.tellg() - start;
    check(used <= static_cast<std::streamoff>(itemSize), "valid external length");
    if (used < static_cast<std::streamoff>(itemSize)) {
      in.seekg(static_cast<std::streamoff>(itemSize) - used, std::ios_base::cur);
      check(!in.fail(), "successful seekg()");
    }
    items.push_back(item);
  }
}

template <typename T>
void externalize(ByteVector& bytes, const T& value, bool reset);

// Items are written at the fixed size of their type ("valid entry
// externalize()").
template <typename T>
void externalize(std::ostream& out, const std::vector<T>& items) {
  constexpr std::uint32_t itemSize = util::external_size<T>::value;
  externalize(out, static_cast<std::uint32_t>(items.size()));
  externalize(out, itemSize);
  ByteVector item;
  for (const T& value : items) {
    externalize(item, value, true);
    check(item.size() == itemSize, "valid entry externalize()");
    out.write(reinterpret_cast<const char*>(item.data()), itemSize);
  }
}

namespace util {
// Requires an input stream to be used up.
ZELTA_EXPORT void requireExhausted(std::istream& in);
// Requires the last write to have succeeded.
ZELTA_EXPORT void requireWritten(std::ostream& out);

// The stream over a byte vector that internalize reads. Making a
// std::istream looks up the locale's facets, which costs more than reading
// most values: each thread keeps one stream and lends it out, and only an
// internalize within another makes a stream of its own.
class ZELTA_EXPORT LentInput {
public:
  explicit LentInput(const ByteVector& bytes);
  LentInput(const LentInput&) = delete;
  LentInput& operator=(const LentInput&) = delete;
  ~LentInput();
  std::istream& stream() { return *stream_; }

private:
  std::unique_ptr<vector_istream> own_;
  vector_istream* stream_;
};
}  // namespace util

template <typename T>
void internalize(const ByteVector& bytes, T& value) {
  util::LentInput in(bytes);
  internalize(in.stream(), value);
  util::requireExhausted(in.stream());
}

template <typename T>
void externalize(ByteVector& bytes, const T& value, bool reset) {
  if (reset) bytes.clear();
  boost::iostreams::stream<util::byte_vector_device> out(bytes);
  externalize(out, value);
  out.flush();
  util::requireWritten(out);
}

#endif
