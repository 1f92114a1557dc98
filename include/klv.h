// Zelta: core values, value conversion, failure reporting and the KLV layer.
#ifndef ZELTA_KLV_H
#define ZELTA_KLV_H

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

// ---------------------------------------------------------------------------
// KLV events

// Tag types: octets 1, 2, 4. Length types: BER, fixed 1, 2, 4 octets.
typedef std::uint8_t KLVTagType;
typedef std::uint8_t KLVLengthType;
inline constexpr KLVTagType KLVTagType1 = 0;
inline constexpr KLVTagType KLVTagType2 = 1;
inline constexpr KLVTagType KLVTagType4 = 2;
inline constexpr KLVLengthType KLVLengthTypeBER = 0;
inline constexpr KLVLengthType KLVLengthType1 = 1;
inline constexpr KLVLengthType KLVLengthType2 = 2;
inline constexpr KLVLengthType KLVLengthType4 = 3;

// Octets of a tag type ("valid tag type") and of a fixed length type ("valid
// length type"); the label of a length type for messages.
ZELTA_EXPORT unsigned KLVTagTypeOctets(KLVTagType tagType);
ZELTA_EXPORT unsigned KLVFixedLengthTypeOctets(KLVLengthType lengthType);
ZELTA_EXPORT const char* KLVLengthTypeLabel(KLVLengthType lengthType);

// The BER form value that no stream ever has: the start of every current form.
inline constexpr std::uint8_t KLVNoLengthForm = 0x80;
// The long forms of four and of eight length octets after the first: the
// format's lengths of structure, metadata and index, and of essence that
// four octets cannot hold.
inline constexpr std::uint8_t KLVFourOctetLengthForm = 0x83;
inline constexpr std::uint8_t KLVEightOctetLengthForm = 0x87;

// Octets of a BER length of a form: 1 for short form, (form & 127) + 1 for
// long form ("valid BER length form").
ZELTA_EXPORT unsigned lengthFormOctets(std::uint8_t form);
// The same for length type BER, the fixed size otherwise.
ZELTA_EXPORT unsigned lengthTypeOctets(KLVLengthType lengthType, std::uint8_t form);

// Coding of a key by its octet 5. Each checks the key's family first ("valid
// local set key", "valid variable length pack key", "valid wrapper key") and
// answers false for an octet 5 that the coding does not allow.
ZELTA_EXPORT bool KLVLocalSetCoding(const KLVKey& key, KLVTagType& tagType, KLVLengthType& lengthType);
ZELTA_EXPORT bool KLVVariableLengthPackCoding(const KLVKey& key, KLVLengthType& lengthType);
ZELTA_EXPORT bool KLVWrapperCoding(const KLVKey& key, bool& isWrapper);

inline constexpr KLVKey KLVFillItemKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x01, 0x03, 0x01, 0x02, 0x10, 0x01, 0x00,
                                 0x00, 0x00}};

// The fill item key version, a stream attribute; 0 is unset.
ZELTA_EXPORT void setFillItemKeyVersion(std::ios_base& stream, std::uint8_t version);
ZELTA_EXPORT std::uint8_t getFillItemKeyVersion(std::ios_base& stream);

class ZELTA_EXPORT KLVHandler {
public:
  virtual ~KLVHandler();
  virtual void setLocator(Locator* locator) = 0;
  virtual void startStream(bool hasAccurateLengths) = 0;
  virtual void endStream(bool aborted) = 0;
  virtual void setLengthForm(std::uint8_t form) = 0;
  virtual bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endIndividualItem(const KLVKey& key) = 0;
  virtual bool startLabel(const KLVKey& key) = 0;
  virtual void endLabel(const KLVKey& key) = 0;
  virtual bool startUniversalSet(const KLVKey& key, std::uint64_t length) = 0;
  virtual void endUniversalSet(const KLVKey& key) = 0;
  virtual bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                             KLVLengthType lengthType) = 0;
  virtual void endLocalSet(const KLVKey& key) = 0;
  virtual bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endLocalItem(std::uint32_t tag) = 0;
  virtual bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endFixedLengthPack(const KLVKey& key) = 0;
  virtual bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) = 0;
  virtual void endVariableLengthPack(const KLVKey& key) = 0;
  virtual bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void endVariableLengthItem() = 0;
  virtual bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) = 0;
  virtual void endWrapper(const KLVKey& key) = 0;
  virtual void value(const std::uint8_t* data, std::streamsize size) = 0;
};

// Ignores every event and declines every value.
class ZELTA_EXPORT DullKLVHandler : public KLVHandler {
public:
  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;
};

class ZELTA_EXPORT KLVFilter : public KLVHandler {
public:
  virtual void setHandler(KLVHandler* handler) = 0;
  virtual KLVHandler* getHandler() const = 0;
};

// Passes every event on unchanged to the next handler ("handler is present").
class ZELTA_EXPORT DullKLVFilter : public KLVFilter {
public:
  DullKLVFilter();
  explicit DullKLVFilter(KLVHandler* handler);

  void setHandler(KLVHandler* handler) override;
  // The handler that it holds: every event of every filter asks for it, so
  // it is answered here, and no subclass answers otherwise.
  KLVHandler* getHandler() const final {
    check(handler_ != nullptr, "handler is present");
    return handler_;
  }

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  KLVHandler* handler_;
};

// ---------------------------------------------------------------------------
// Locators

// A position that stays at zero.
class ZELTA_EXPORT NullLocator : public Locator {
public:
  const std::streampos& getPosition() override;

private:
  std::streampos position_ = 0;
};

// A position that its owner refreshes from a stream.
class ZELTA_EXPORT InputLocator : public Locator {
public:
  const std::streampos& getPosition() override;
  void setPosition(const std::streampos& position) { position_ = position; }

private:
  std::streampos position_ = -1;
};

// ---------------------------------------------------------------------------
// Position filters and the fill item key check

// What counting a position needs of the coding, for KLVCountingFilter: the
// octets of the key and length before a value, of the tag and length before
// an item, and the length of a value that the handler declined, which the
// position passes at the element's end.
class ZELTA_EXPORT KLVPrefixCount {
public:
  static constexpr std::streamoff keyOctets = 16;

  void setLengthForm(std::uint8_t form);
  // Items of a local set or variable length pack follow, until endItems.
  void startItems(unsigned tagOctets, KLVLengthType lengthType);
  void endItems() { itemLengthIsBER_ = false; }
  // Key and BER length.
  std::streamoff elementPrefix() const { return keyOctets + lengthOctets_; }
  // Tag and length of an item.
  std::streamoff itemPrefix() const { return tagOctets_ + itemLengthOctets_; }
  // The prefix that the length last read closes.
  std::streamoff currentPrefix() const { return itemLengthIsBER_ ? itemPrefix() : elementPrefix(); }
  unsigned lengthOctets() const { return lengthOctets_; }
  // Passes taken on, and keeps the length of a declined value.
  bool noteStart(bool taken, std::uint64_t length) {
    skipped_ = taken ? 0 : length;
    return taken;
  }
  // The declined length, once.
  std::streamoff takeSkipped() {
    const auto skipped = static_cast<std::streamoff>(skipped_);
    skipped_ = 0;
    return skipped;
  }
  void reset();

private:
  unsigned lengthOctets_ = 0;
  unsigned tagOctets_ = 0;
  unsigned itemLengthOctets_ = 0;
  bool itemLengthIsBER_ = false;
  std::uint64_t skipped_ = 0;
};

// The events of KLVTeller and KLVMonitor: each start moves the position past
// the key and length or the tag and length, each value past its octets, and
// each end past a value that the handler declined; how a move is made is the
// subclass's.
class ZELTA_EXPORT KLVCountingFilter : public DullKLVFilter {
public:
  explicit KLVCountingFilter(KLVHandler* handler) : DullKLVFilter(handler) {}

  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

protected:
  virtual void advance(std::streamoff octets) = 0;
  // Moves past a declined value.
  void endElement() { advance(count_.takeSkipped()); }

  KLVPrefixCount count_;
};

// Takes the position from the input stream at the ends of a stream and counts
// it from the coding at the events between; the position at a start event is
// the first octet of the value.
class ZELTA_EXPORT KLVTeller : public KLVCountingFilter {
public:
  KLVTeller(std::istream& stream, KLVHandler* handler = nullptr);
  Locator* getLocator();

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;

protected:
  void advance(std::streamoff octets) override;

private:
  void refresh();
  std::istream* stream_;
  InputLocator locator_;
  // A position of -1 is told instead.
  std::streamoff position_ = -1;
};

// Computes the position from the events alone, for pipes and output chains.
class ZELTA_EXPORT KLVMonitor : public KLVCountingFilter {
public:
  class MonitoredLocator : public Locator {
  public:
    const std::streampos& getPosition() override;
    void reset() { position_ = 0; }
    void advance(std::streamoff octets) { position_ += octets; }

  private:
    std::streampos position_ = 0;
  };

  explicit KLVMonitor(KLVHandler* handler = nullptr);
  Locator* getLocator();
  MonitoredLocator& getMonitoredLocator() { return locator_; }
  // Octets of the current BER length ("BER length form has been reported").
  unsigned getLengthOctets() const;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;

protected:
  void advance(std::streamoff octets) override;

private:
  MonitoredLocator locator_;
};

// Warns once per stream of a fill item key whose version octet is not the
// stream's, or not 1 or 2 when the stream has none.
class ZELTA_EXPORT KLVFillItemKeyFilter : public DullKLVFilter {
public:
  KLVFillItemKeyFilter(KLVHandler* handler, std::uint8_t fillItemKeyVersion, ErrorHandler* errorHandler);

  void startStream(bool hasAccurateLengths) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;

private:
  void inspect(const KLVKey& key);
  std::uint8_t version_;
  ErrorHandler* errorHandler_;
  bool warned_ = false;
};

// ---------------------------------------------------------------------------
// Reading

class ZELTA_EXPORT KLVElement {
public:
  // A fault of the data or the stream, with its identifier.
  class parse_error : public std::runtime_error {
  public:
    parse_error(const MXFUID& identifier, const std::string& message);
    const MXFUID& getIdentifier() const { return identifier_; }

  private:
    MXFUID identifier_;
  };

  // The element for a key by its octets 4 and 5; throws parse_error for a
  // key the coding does not allow.
  static std::unique_ptr<KLVElement> create(const KLVKey& key, std::istream& stream, KLVHandler& handler,
                                            std::uint8_t& currentForm, Locator& locator, bool seekable);

  // The element kinds are the library's own; the class is abstract.
  KLVElement(const KLVKey& key, std::istream& stream, KLVHandler& handler, std::uint8_t& currentForm,
             Locator& locator, bool seekable);
  virtual ~KLVElement();
  virtual void parse() = 0;

  const KLVKey& getKey() const { return key_; }

protected:
  KLVKey key_;
  std::istream* stream_;
  KLVHandler* handler_;
  std::uint8_t* currentForm_;
  Locator* locator_;
  bool seekable_;
};

class ZELTA_EXPORT KLVReader {
public:
  virtual ~KLVReader();
  virtual void setHandler(KLVHandler* handler) = 0;
  virtual KLVHandler* getHandler() const = 0;
  virtual void setErrorHandler(ErrorHandler* errorHandler) = 0;
  virtual ErrorHandler* getErrorHandler() const = 0;
  virtual void read(std::istream& stream) = 0;
  // Stops after the first top-level element that ends at or beyond stop; -1
  // reads to the end.
  virtual void read(std::istream& stream, std::streampos stop) = 0;
};

// Reads a file stream (a std::filebuf, whatever its buffer) from the file
// by position: while read runs, the stream reads through a buffer of the
// reader's, which is what rdbuf() answers then; when read returns, the
// stream has its own buffer back and stands where the read stopped.
class ZELTA_EXPORT GenericKLVReader : public KLVReader {
public:
  GenericKLVReader();
  void setHandler(KLVHandler* handler) override;
  KLVHandler* getHandler() const override;
  void setErrorHandler(ErrorHandler* errorHandler) override;
  ErrorHandler* getErrorHandler() const override;
  void read(std::istream& stream) override;
  void read(std::istream& stream, std::streampos stop) override;

private:
  KLVHandler* handler_;
  ErrorHandler* errorHandler_;
};

// ---------------------------------------------------------------------------
// Writing

// Turns KLV events back into octets. Its start events take every value by
// `value` events; the producer chooses the BER form by setLengthForm.
class ZELTA_EXPORT GenericKLVWriter : public KLVHandler {
public:
  explicit GenericKLVWriter(std::ostream& stream);

  std::uint8_t getLengthForm() const;
  unsigned getLongFormOctets() const;  // "long form"
  void setTagType(KLVTagType tagType);
  KLVTagType getTagType() const;
  void setLengthType(KLVLengthType lengthType);
  KLVLengthType getLengthType() const;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  void writeKey(const KLVKey& key);
  void writeBERLength(std::uint64_t length);
  void writeItemLength(std::uint64_t length);

  std::ostream* stream_;
  std::uint8_t fillItemKeyVersion_ = 255;
  bool started_ = false;
  bool buffered_ = false;
  std::uint8_t currentForm_ = KLVNoLengthForm;
  KLVTagType tagType_ = KLVTagType1;
  KLVLengthType lengthType_ = KLVLengthTypeBER;
};

// Calls beforeEvent, the next handler and afterEvent around every event.
class ZELTA_EXPORT ActionKLVFilter : public DullKLVFilter {
public:
  using DullKLVFilter::DullKLVFilter;
  virtual void beforeEvent() = 0;
  virtual void afterEvent() = 0;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;
};

// Forwards every event to what getHandler answers at that moment.
class ZELTA_EXPORT KLVForwarder : public KLVHandler {
public:
  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

  virtual KLVHandler* getHandler() = 0;
};

// Producers' helpers that drive any handler.
ZELTA_EXPORT void writeIndividualItem(KLVHandler& handler, const KLVKey& key, const std::uint8_t* data,
                                      std::uint64_t length);
ZELTA_EXPORT void writeFixedLengthPack(KLVHandler& handler, const KLVKey& key, const ByteVector& bytes);
typedef std::vector<std::pair<std::uint32_t, ByteVector>> KLVLocalItems;
ZELTA_EXPORT void writeLocalSet(KLVHandler& handler, const KLVKey& key, const KLVLocalItems& items, std::uint8_t form);
// A fill item of value length `length` under the form.
ZELTA_EXPORT void writeFillItem(KLVHandler& handler, std::uint64_t length, std::uint8_t form);

// ---------------------------------------------------------------------------
// Padding, stream joining and verification

// Pads what passes between startFilledItem and endFilledItem to alignment
// (mode 0) or to an exact length (mode 1) with one fill item.
class ZELTA_EXPORT KLVFiller : public DullKLVFilter {
public:
  enum FillMode { alignmentMode = 0, exactLengthMode = 1 };

  explicit KLVFiller(KLVHandler* handler = nullptr);

  virtual Locator* getLocator();  // "locator is present"
  virtual void setFillMode(int mode, std::uint64_t alignment, std::uint64_t paddedLength);
  virtual int getFillMode() const;
  virtual std::uint64_t getAlignment() const;
  virtual std::uint64_t getPaddedLength() const;
  virtual void startFilledItem();
  virtual void endFilledItem();

  void setLocator(Locator* locator) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;

private:
  Locator* locator_ = nullptr;
  std::uint8_t currentForm_ = KLVNoLengthForm;
  int mode_ = alignmentMode;
  std::uint64_t alignment_ = 0;
  std::uint64_t paddedLength_ = 0;
  std::streampos start_ = 0;
  bool inFilledItem_ = false;
};

// Pads a whole stream: the fill comes last in it.
class ZELTA_EXPORT KLVStreamPadder : public KLVFiller {
public:
  using KLVFiller::KLVFiller;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
};

// Hides stream boundaries, so that producers can write in turn into one
// continuing stream.
class ZELTA_EXPORT KLVStreamFilter : public DullKLVFilter {
public:
  using DullKLVFilter::DullKLVFilter;
  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
};

// Compares the keys and lengths of a producer's events with a stream that
// already holds them; throws VerifyingKLVHandler::exception at the first
// difference.
class ZELTA_EXPORT VerifyingKLVHandler : public KLVHandler {
public:
  class exception : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
  };

  explicit VerifyingKLVHandler(std::istream& stream, KLVHandler* handler = nullptr);

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  bool verify(const KLVKey& key, std::uint64_t length, bool hasLength);

  std::istream* stream_;
  KLVHandler* handler_;
  std::uint8_t currentForm_ = KLVNoLengthForm;
};

// Moves the stream to the next 06 0E 2B 34 within limit octets (-1: no
// limit); false at the end of the stream or past the limit.
ZELTA_EXPORT bool findKey(std::istream& stream, std::streamoff limit);

// ---------------------------------------------------------------------------
// Timecode
//
// A count is the number of units from 00:00:00:00; a unit is a frame, or a
// field when a frame counts two units. Failures are std::runtime_error, and
// std::logic_error for the guard of normalize.

class ZELTA_EXPORT TimecodeCalculator {
public:
  virtual ~TimecodeCalculator();
  // The field output is skipped when null.
  virtual void toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes, std::uint8_t& seconds,
                          std::uint8_t& frames, std::uint8_t* field = nullptr) const = 0;
  virtual std::uint32_t toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                                std::uint8_t field) const = 0;
  virtual bool isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                       std::uint8_t field) const = 0;
  virtual bool isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                         std::uint8_t field) const = 0;
  // The count wrapped into one day.
  virtual std::uint32_t normalize(std::int32_t count) const = 0;
  virtual std::uint32_t getCountPerDay() const = 0;
};

// Every frame number exists. unitsPerFrame 0 means 1.
class ZELTA_EXPORT RegularTimecodeCalculator : public TimecodeCalculator {
public:
  RegularTimecodeCalculator(std::uint8_t rate, std::uint8_t unitsPerFrame);

  void toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes, std::uint8_t& seconds,
                  std::uint8_t& frames, std::uint8_t* field = nullptr) const override;
  std::uint32_t toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                        std::uint8_t field) const override;
  bool isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
               std::uint8_t field) const override;
  bool isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                 std::uint8_t field) const override;
  std::uint32_t normalize(std::int32_t count) const override;
  std::uint32_t getCountPerDay() const override;

private:
  std::uint32_t unitsPerFrame_;
  std::uint32_t framesPerSecond_;
  std::uint32_t framesPerMinute_;
  std::uint32_t framesPerHour_;
  std::uint32_t framesPerDay_;
};

// NTSC drop frame counting: the first d frame numbers of every minute but
// each tenth do not exist, d being 2 at base 30 and 4 at base 60.
class ZELTA_EXPORT NTSCDropFrameCalculator : public TimecodeCalculator {
public:
  NTSCDropFrameCalculator(std::uint8_t rate, std::uint8_t unitsPerFrame);

  void toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes, std::uint8_t& seconds,
                  std::uint8_t& frames, std::uint8_t* field = nullptr) const override;
  // Checks the range only: a dropped number moves up to the next one that
  // exists.
  std::uint32_t toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                        std::uint8_t field) const override;
  bool isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
               std::uint8_t field) const override;
  bool isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                 std::uint8_t field) const override;
  std::uint32_t normalize(std::int32_t count) const override;
  std::uint32_t getCountPerDay() const override;

private:
  std::uint32_t unitsPerFrame_;
  std::uint32_t droppedPerMinute_;
  std::uint32_t framesPerSecond_;
  std::uint32_t framesPerMinute_;
  std::uint32_t framesPerTenMinutes_;
  std::uint32_t framesPerDay_;
};

// The caller owns the result. Drop frame needs a multiple of 30 ("valid drop
// frame rate"); unitsPerFrame 0 means 1.
ZELTA_EXPORT TimecodeCalculator* createTimecodeCalculator(std::uint8_t rate, bool dropFrame,
                                                          std::uint8_t unitsPerFrame);
// Two units a frame when fieldCounting is true.
ZELTA_EXPORT TimecodeCalculator* createTimecodeCalculator(std::uint8_t rate, bool dropFrame, bool fieldCounting);
// A rational frame rate: only multiples of 30000/1001 drop frames.
ZELTA_EXPORT TimecodeCalculator* createTimecodeCalculator(int numerator, int denominator);

// ---------------------------------------------------------------------------
// File device

namespace zelta {

// A large-file device for Boost.Iostreams streams: 64-bit positions, a read
// size suited to the storage and read-ahead hints. Copies share one open
// file. Every failure is a std::ios_base::failure whose what() is the bare
// text ("not open", "bad read", ...).
class ZELTA_EXPORT file_device {
public:
  typedef char char_type;
  struct category : boost::iostreams::seekable_device_tag,
                    boost::iostreams::closable_tag,
                    boost::iostreams::optimally_buffered_tag {};

  // Hint bits. Only hint_limited_read and the bits above 128 may change
  // after open.
  static constexpr int hint_limited_read = 1;  // a read asks for 512 octets, not 1048576
  static constexpr int hint_unbuffered = 2;    // aligned reads, and no reuse advised
  static constexpr int hint_sequential = 4;
  static constexpr int hint_random = 8;

  struct impl;

  file_device();
  explicit file_device(const std::string& path, std::ios_base::openmode mode = std::ios_base::in | std::ios_base::out,
                       int hints = 0);
  explicit file_device(const std::wstring& path, std::ios_base::openmode mode = std::ios_base::in | std::ios_base::out,
                       int hints = 0);

  // The device keeps the new file only when opening succeeded.
  void open(const std::string& path, std::ios_base::openmode mode = std::ios_base::in | std::ios_base::out,
            int hints = 0);
  void open(const std::wstring& path, std::ios_base::openmode mode = std::ios_base::in | std::ios_base::out,
            int hints = 0);
  // A stretch of a file: not implemented, so it always fails after the file
  // has opened ("partial mode not implemented").
  void open(boost::iostreams::stream_offset offset, boost::iostreams::stream_offset length, const std::string& path,
            std::ios_base::openmode mode = std::ios_base::in | std::ios_base::out, int hints = 0);
  void open(boost::iostreams::stream_offset offset, boost::iostreams::stream_offset length, const std::wstring& path,
            std::ios_base::openmode mode = std::ios_base::in | std::ios_base::out, int hints = 0);
  bool is_open() const;
  void close();

  // -1 at the end of the file.
  std::streamsize read(char_type* s, std::streamsize n);
  std::streamsize write(const char_type* s, std::streamsize n);
  // Moves the logical position only; the end is size().
  std::streampos seek(boost::iostreams::stream_offset off, std::ios_base::seekdir way);
  // The largest position written for a write-only file, else the file's size.
  boost::iostreams::stream_offset size() const;
  // Cuts the file at the logical position.
  void truncate();

  std::streamsize optimal_buffer_size() const;
  int hints() const;
  void hints(int value);
  void hints(int value, int mask);

private:
  impl& opened() const;

  std::shared_ptr<impl> impl_;
};

}  // namespace zelta

#endif
