// Input streams over spelled bytes that count how often they are read, with
// or without the ability to seek, and small helpers to run a KLV read.
#ifndef ZELTA_TESTS_SUPPORT_KLV_STREAMS_H
#define ZELTA_TESTS_SUPPORT_KLV_STREAMS_H

#include <initializer_list>
#include <istream>
#include <streambuf>
#include <string>
#include <vector>

#include "klv.h"
#include "support/recording.h"

namespace zelta_test::klv {

enum class Seeking {
  seekable,     // relative and absolute seeks, also beyond the end as a file allows
  notSeekable,  // every seek answers -1, as on a pipe
};

// Hands out one octet per underflow and any number per xsgetn, from bytes
// it does not own; reads() counts both, so a test sees every trip to the
// "device".
class CountingStreambuf : public std::streambuf {
public:
  CountingStreambuf(const ByteVector& bytes, Seeking seeking);
  int reads() const { return reads_; }

protected:
  int_type underflow() override;
  std::streamsize xsgetn(char* s, std::streamsize n) override;
  pos_type seekoff(off_type off, std::ios_base::seekdir dir, std::ios_base::openmode which) override;
  pos_type seekpos(pos_type pos, std::ios_base::openmode which) override;

private:
  std::streamoff position() const;
  void moveTo(std::streamoff position);

  const ByteVector& bytes_;
  Seeking seeking_;
  std::streamoff next_ = 0;  // first octet not yet in the get area
  char current_ = 0;         // the get area of one octet
  int reads_ = 0;
};

class CountingStream : public std::istream {
public:
  explicit CountingStream(const ByteVector& bytes, Seeking seeking = Seeking::seekable);
  int reads() const { return buffer_.reads(); }

private:
  CountingStreambuf buffer_;
};

// A file stream over spelled bytes, as the C++ library makes one: a buffer
// of the given size that each underflow fills from the "file", reads larger
// than the buffer straight into the caller's memory, and seeks that throw the
// buffer away, but for the question where it stands. It counts what went to
// the "file": octets, calls that brought octets, and seeks.
class FileLikeStreambuf : public std::streambuf {
public:
  FileLikeStreambuf(const ByteVector& bytes, std::size_t bufferSize);
  std::uint64_t octetsPulled() const { return octetsPulled_; }
  int pulls() const { return pulls_; }
  int seeks() const { return seeks_; }

protected:
  int_type underflow() override;
  std::streamsize xsgetn(char* s, std::streamsize n) override;
  pos_type seekoff(off_type off, std::ios_base::seekdir dir, std::ios_base::openmode which) override;
  pos_type seekpos(pos_type pos, std::ios_base::openmode which) override;

private:
  std::streamoff position() const { return next_ - (egptr() - gptr()); }
  std::streamsize pull(char* s, std::streamsize n);

  const ByteVector& bytes_;
  std::vector<char> buffer_;
  std::streamoff next_ = 0;  // first octet not yet pulled
  std::uint64_t octetsPulled_ = 0;
  int pulls_ = 0;
  int seeks_ = 0;
};

class FileLikeStream : public std::istream {
public:
  FileLikeStream(const ByteVector& bytes, std::size_t bufferSize);
  const FileLikeStreambuf& file() const { return buffer_; }

private:
  FileLikeStreambuf buffer_;
};

ByteVector join(std::initializer_list<ByteVector> parts);

// A recording handler that also writes down, beside each event, the position
// that its locator gave at that event (-1 before it has one).
class LocatedKLVHandler : public zelta_test::RecordingKLVHandler {
public:
  using RecordingKLVHandler::RecordingKLVHandler;

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
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) override;
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

  std::vector<std::streamoff> positions;  // one per entry of events

private:
  void note();
};

// The identifier and text of the parse error that a call raised; fails the
// test when none was raised.
struct Failure {
  MXFUID identifier;
  std::string message;
};
template <typename Call>
Failure parseErrorOf(Call call) {
  try {
    call();
  } catch (const KLVElement::parse_error& e) {
    return Failure{e.getIdentifier(), e.what()};
  }
  return Failure{MXFUID(), "no parse_error"};
}

// The text of the assertion failure that a call raised.
template <typename Call>
std::string assertionOf(Call call) {
  try {
    call();
  } catch (const util::assertion_failure& e) {
    return e.what();
  }
  return "no assertion_failure";
}

}  // namespace zelta_test::klv

#endif
