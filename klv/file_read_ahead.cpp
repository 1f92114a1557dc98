#include "klv/file_read_ahead.h"

#include <sys/stat.h>
#include <sys/uio.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <locale>

namespace zelta::klv {

namespace {

// The first piece of read-ahead after a jump: about what the keys and
// lengths of a few elements take, so that a walk that skips large values
// reads little more than a walk of keys and lengths.
constexpr std::size_t smallestPiece = 128;
// What the read-ahead that comes with a large value adds to the last run of
// small elements: enough for fill items that vary with the alignment, little
// of the next large value.
constexpr std::size_t runMargin = 512;
// Pieces double up to this while the elements stay small; the cost of a
// system call is then small beside the copy.
constexpr std::size_t largestPiece = std::size_t(128) << 10;
// A value whose unread rest reaches this goes straight to the caller: it
// would cost more to copy it once more than to make a system call of its own.
constexpr std::streamsize directOctets = std::streamsize(16) << 10;

#if defined(__GLIBCXX__)
// The descriptor of a libstdc++ file stream's file, named through a derived
// class, as only a derived class may.
class DescriptorOf : public std::filebuf {
public:
  DescriptorOf() = delete;
  static int of(std::filebuf& buffer) { return (buffer.*&DescriptorOf::_M_file).fd(); }
};
#endif

// The file under a client's stream, when it is a file stream that can be
// read by position from where the stream stands; else -1.
int fileDescriptor(std::istream& client, std::streamoff& position) {
#if defined(__GLIBCXX__)
  auto* file = dynamic_cast<std::filebuf*>(client.rdbuf());
  if (!file || !file->is_open()) return -1;
  if (!std::use_facet<std::codecvt<char, char, std::mbstate_t>>(file->getloc()).always_noconv()) return -1;
  // Output still in the stream's buffer belongs in the file first.
  if (file->pubsync() != 0) return -1;
  // A pipe has no position, and its octets can be read only once.
  position = file->pubseekoff(0, std::ios_base::cur, std::ios_base::in);
  if (position < 0) return -1;
  return DescriptorOf::of(*file);
#else
  (void)client;
  (void)position;
  return -1;
#endif
}

}  // namespace

FileReadAhead::FileReadAhead(int descriptor, std::streamoff position)
    : descriptor_(descriptor),
      next_(position),
      runStart_(position),
      piece_(smallestPiece),
      buffer_(new char_type[largestPiece]) {
  drop();
}

FileReadAhead::int_type FileReadAhead::underflow() {
  if (gptr() < egptr()) return traits_type::to_int_type(*gptr());
  ssize_t got;
  do {
    got = ::pread(descriptor_, buffer_.get(), piece_, next_);
  } while (got < 0 && errno == EINTR);
  piece_ = std::min(piece_ * 2, largestPiece);
  if (got <= 0) {
    drop();
    return traits_type::eof();
  }
  setg(buffer_.get(), buffer_.get(), buffer_.get() + got);
  next_ += got;
  return traits_type::to_int_type(*gptr());
}

std::streamsize FileReadAhead::copyOut(char_type* s, std::streamsize n) {
  const std::streamsize count = std::min<std::streamsize>(n, egptr() - gptr());
  std::memcpy(s, gptr(), static_cast<std::size_t>(count));
  setg(eback(), gptr() + count, egptr());
  return count;
}

// The rest of a large value, whose first held octets came from the
// read-ahead, with the read-ahead of what follows it. The elements between
// two large values tend to repeat, as edit units do: the read-ahead is as
// long as the last such run, up to where its large value began, so that the
// next run comes in this same call and the next large value's octets do not.
std::streamsize FileReadAhead::readDirect(char_type* s, std::streamsize held, std::streamsize n) {
  const auto run = static_cast<std::size_t>(next_ - held - runStart_);
  iovec pieces[2] = {{s + held, static_cast<std::size_t>(n)},
                     {buffer_.get(), std::clamp(run + runMargin, runMargin, largestPiece)}};
  runStart_ = next_ + n;
  piece_ = smallestPiece;
  ssize_t got;
  do {
    got = ::preadv(descriptor_, pieces, 2, next_);
  } while (got < 0 && errno == EINTR);
  if (got <= 0) return 0;
  next_ += got;
  if (got > n) {
    setg(buffer_.get(), buffer_.get(), buffer_.get() + (got - n));
    return n;
  }
  // Cut short: the file ends inside the value, or the call was interrupted.
  std::streamsize count = got;
  while (count < n) {
    do {
      got = ::pread(descriptor_, s + held + count, static_cast<std::size_t>(n - count), next_);
    } while (got < 0 && errno == EINTR);
    if (got <= 0) break;
    next_ += got;
    count += got;
  }
  return count;
}

std::streamsize FileReadAhead::xsgetn(char_type* s, std::streamsize n) {
  std::streamsize count = copyOut(s, n);
  if (n - count >= directOctets) return count + readDirect(s, count, n - count);
  while (count < n && underflow() != traits_type::eof()) count += copyOut(s + count, n - count);
  return count;
}

FileReadAhead::pos_type FileReadAhead::seekoff(off_type off, std::ios_base::seekdir dir,
                                               std::ios_base::openmode which) {
  const pos_type failed(off_type(-1));
  if (!(which & std::ios_base::in)) return failed;
  off_type base = 0;
  if (dir == std::ios_base::cur) {
    base = position();
  } else if (dir == std::ios_base::end) {
    struct stat status;
    if (::fstat(descriptor_, &status) != 0) return failed;
    base = status.st_size;
  }
  const off_type target = base + off;
  if (target < 0) return failed;
  const off_type areaStart = next_ - (egptr() - eback());
  if (target >= areaStart && target <= next_) {
    setg(eback(), eback() + (target - areaStart), egptr());
  } else {
    next_ = target;
    runStart_ = target;
    piece_ = smallestPiece;
    drop();
  }
  return pos_type(target);
}

FileReadAhead::pos_type FileReadAhead::seekpos(pos_type pos, std::ios_base::openmode which) {
  return seekoff(off_type(pos), std::ios_base::beg, which);
}

ReadAheadScope::ReadAheadScope(std::istream& stream) : stream_(stream) {
  std::streamoff position = 0;
  const int descriptor = fileDescriptor(stream, position);
  if (descriptor < 0) return;
  readAhead_ = std::make_unique<FileReadAhead>(descriptor, position);
  own_ = stream.rdbuf(readAhead_.get());
}

// Nothing may escape here: the read's own outcome, normal or not, is on its
// way to the caller.
ReadAheadScope::~ReadAheadScope() {
  if (!readAhead_) return;
  try {
    std::ios_base::iostate state = stream_.rdstate();
    stream_.rdbuf(own_);
    if (own_->pubseekoff(readAhead_->position(), std::ios_base::beg, std::ios_base::in) == std::streampos(-1))
      state |= std::ios_base::badbit;
    stream_.setstate(state);
  } catch (...) {
  }
}

}  // namespace zelta::klv
