#include "support/klv_streams.h"

#include <algorithm>
#include <cstring>

namespace zelta_test::klv {

CountingStreambuf::CountingStreambuf(const ByteVector& bytes, Seeking seeking) : bytes_(bytes), seeking_(seeking) {
  setg(&current_, &current_, &current_);
}

std::streamoff CountingStreambuf::position() const { return next_ - (egptr() - gptr()); }

void CountingStreambuf::moveTo(std::streamoff position) {
  next_ = position;
  setg(&current_, &current_, &current_);
}

CountingStreambuf::int_type CountingStreambuf::underflow() {
  ++reads_;
  if (next_ >= static_cast<std::streamoff>(bytes_.size())) return traits_type::eof();
  current_ = static_cast<char>(bytes_[static_cast<std::size_t>(next_++)]);
  setg(&current_, &current_, &current_ + 1);
  return traits_type::to_int_type(current_);
}

std::streamsize CountingStreambuf::xsgetn(char* s, std::streamsize n) {
  ++reads_;
  const std::streamoff from = position();
  const std::streamoff size = static_cast<std::streamoff>(bytes_.size());
  const std::streamsize count = from >= size ? 0 : std::min<std::streamoff>(n, size - from);
  if (count > 0) std::memcpy(s, bytes_.data() + from, static_cast<std::size_t>(count));
  moveTo(from + count);
  return count;
}

CountingStreambuf::pos_type CountingStreambuf::seekoff(off_type off, std::ios_base::seekdir dir,
                                                       std::ios_base::openmode) {
  if (seeking_ == Seeking::notSeekable) return pos_type(off_type(-1));
  off_type base = 0;
  if (dir == std::ios_base::cur) base = position();
  if (dir == std::ios_base::end) base = static_cast<off_type>(bytes_.size());
  if (base + off < 0) return pos_type(off_type(-1));
  moveTo(base + off);
  return pos_type(base + off);
}

CountingStreambuf::pos_type CountingStreambuf::seekpos(pos_type pos, std::ios_base::openmode which) {
  return seekoff(off_type(pos), std::ios_base::beg, which);
}

CountingStream::CountingStream(const ByteVector& bytes, Seeking seeking)
    : std::istream(nullptr), buffer_(bytes, seeking) {
  init(&buffer_);
}

FileLikeStreambuf::FileLikeStreambuf(const ByteVector& bytes, std::size_t bufferSize)
    : bytes_(bytes), buffer_(bufferSize) {
  setg(buffer_.data(), buffer_.data(), buffer_.data());
}

std::streamsize FileLikeStreambuf::pull(char* s, std::streamsize n) {
  const std::streamoff size = static_cast<std::streamoff>(bytes_.size());
  const std::streamsize count = next_ >= size ? 0 : std::min<std::streamoff>(n, size - next_);
  if (count > 0) std::memcpy(s, bytes_.data() + next_, static_cast<std::size_t>(count));
  next_ += count;
  octetsPulled_ += static_cast<std::uint64_t>(count);
  ++pulls_;
  return count;
}

FileLikeStreambuf::int_type FileLikeStreambuf::underflow() {
  if (gptr() < egptr()) return traits_type::to_int_type(*gptr());
  const std::streamsize count = pull(buffer_.data(), static_cast<std::streamsize>(buffer_.size()));
  setg(buffer_.data(), buffer_.data(), buffer_.data() + count);
  return count == 0 ? traits_type::eof() : traits_type::to_int_type(*gptr());
}

std::streamsize FileLikeStreambuf::xsgetn(char* s, std::streamsize n) {
  if (n < static_cast<std::streamsize>(buffer_.size())) return std::streambuf::xsgetn(s, n);
  const std::streamsize held = egptr() - gptr();
  std::memcpy(s, gptr(), static_cast<std::size_t>(held));
  setg(buffer_.data(), buffer_.data(), buffer_.data());
  return held + pull(s + held, n - held);
}

FileLikeStreambuf::pos_type FileLikeStreambuf::seekoff(off_type off, std::ios_base::seekdir dir,
                                                       std::ios_base::openmode) {
  off_type target = off;
  if (dir == std::ios_base::cur) target += position();
  if (dir == std::ios_base::end) target += static_cast<off_type>(bytes_.size());
  if (target < 0) return pos_type(off_type(-1));
  if (dir == std::ios_base::cur && off == 0) return pos_type(target);
  ++seeks_;
  next_ = target;
  setg(buffer_.data(), buffer_.data(), buffer_.data());
  return pos_type(target);
}

FileLikeStreambuf::pos_type FileLikeStreambuf::seekpos(pos_type pos, std::ios_base::openmode which) {
  return seekoff(off_type(pos), std::ios_base::beg, which);
}

FileLikeStream::FileLikeStream(const ByteVector& bytes, std::size_t bufferSize)
    : std::istream(nullptr), buffer_(bytes, bufferSize) {
  init(&buffer_);
}

ByteVector join(std::initializer_list<ByteVector> parts) {
  ByteVector out;
  for (const ByteVector& part : parts) out.insert(out.end(), part.begin(), part.end());
  return out;
}

void LocatedKLVHandler::note() {
  positions.push_back(locator ? static_cast<std::streamoff>(locator->getPosition()) : -1);
}

void LocatedKLVHandler::setLocator(Locator* l) {
  RecordingKLVHandler::setLocator(l);
  note();
}
void LocatedKLVHandler::startStream(bool a) {
  note();
  RecordingKLVHandler::startStream(a);
}
void LocatedKLVHandler::endStream(bool a) {
  note();
  RecordingKLVHandler::endStream(a);
}
void LocatedKLVHandler::setLengthForm(std::uint8_t f) {
  note();
  RecordingKLVHandler::setLengthForm(f);
}
bool LocatedKLVHandler::startIndividualItem(const KLVKey& k, std::uint64_t n, std::uint8_t*& b) {
  note();
  return RecordingKLVHandler::startIndividualItem(k, n, b);
}
void LocatedKLVHandler::endIndividualItem(const KLVKey& k) {
  note();
  RecordingKLVHandler::endIndividualItem(k);
}
bool LocatedKLVHandler::startLabel(const KLVKey& k) {
  note();
  return RecordingKLVHandler::startLabel(k);
}
void LocatedKLVHandler::endLabel(const KLVKey& k) {
  note();
  RecordingKLVHandler::endLabel(k);
}
bool LocatedKLVHandler::startUniversalSet(const KLVKey& k, std::uint64_t n) {
  note();
  return RecordingKLVHandler::startUniversalSet(k, n);
}
void LocatedKLVHandler::endUniversalSet(const KLVKey& k) {
  note();
  RecordingKLVHandler::endUniversalSet(k);
}
bool LocatedKLVHandler::startLocalSet(const KLVKey& k, std::uint64_t n, KLVTagType t, KLVLengthType l) {
  note();
  return RecordingKLVHandler::startLocalSet(k, n, t, l);
}
void LocatedKLVHandler::endLocalSet(const KLVKey& k) {
  note();
  RecordingKLVHandler::endLocalSet(k);
}
bool LocatedKLVHandler::startLocalItem(std::uint32_t t, std::uint64_t n, std::uint8_t*& b) {
  note();
  return RecordingKLVHandler::startLocalItem(t, n, b);
}
void LocatedKLVHandler::endLocalItem(std::uint32_t t) {
  note();
  RecordingKLVHandler::endLocalItem(t);
}
bool LocatedKLVHandler::startFixedLengthPack(const KLVKey& k, std::uint64_t n, std::uint8_t*& b) {
  note();
  return RecordingKLVHandler::startFixedLengthPack(k, n, b);
}
void LocatedKLVHandler::endFixedLengthPack(const KLVKey& k) {
  note();
  RecordingKLVHandler::endFixedLengthPack(k);
}
bool LocatedKLVHandler::startVariableLengthPack(const KLVKey& k, std::uint64_t n, KLVLengthType l) {
  note();
  return RecordingKLVHandler::startVariableLengthPack(k, n, l);
}
void LocatedKLVHandler::endVariableLengthPack(const KLVKey& k) {
  note();
  RecordingKLVHandler::endVariableLengthPack(k);
}
bool LocatedKLVHandler::startVariableLengthItem(std::uint64_t n, std::uint8_t*& b) {
  note();
  return RecordingKLVHandler::startVariableLengthItem(n, b);
}
void LocatedKLVHandler::endVariableLengthItem() {
  note();
  RecordingKLVHandler::endVariableLengthItem();
}
bool LocatedKLVHandler::startWrapper(const KLVKey& k, std::uint64_t n, bool w, std::uint8_t*& b) {
  note();
  return RecordingKLVHandler::startWrapper(k, n, w, b);
}
void LocatedKLVHandler::endWrapper(const KLVKey& k) {
  note();
  RecordingKLVHandler::endWrapper(k);
}
void LocatedKLVHandler::value(const std::uint8_t* d, std::streamsize n) {
  note();
  RecordingKLVHandler::value(d, n);
}

}  // namespace zelta_test::klv
