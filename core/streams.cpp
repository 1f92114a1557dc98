#include <cstring>

#include "core/get_area.h"
#include "klv.h"

namespace util {

vector_streambuf::vector_streambuf() = default;

vector_streambuf::vector_streambuf(const ByteVector& bytes) : vector_streambuf(bytes.data(), bytes.size()) {}

vector_streambuf::vector_streambuf(const std::uint8_t* data, std::size_t size) { reset(data, size); }

// The get area is the vector itself: the stream reads in place and never
// writes through these pointers.
void vector_streambuf::reset(const std::uint8_t* data, std::size_t size) {
  char* begin = const_cast<char*>(reinterpret_cast<const char*>(data));
  setg(begin, begin, begin + size);
}

vector_streambuf::pos_type vector_streambuf::seekoff(off_type off, std::ios_base::seekdir dir,
                                                     std::ios_base::openmode which) {
  const pos_type failed(off_type(-1));
  if (!(which & std::ios_base::in) || eback() == egptr()) return failed;
  off_type base = 0;
  if (dir == std::ios_base::cur)
    base = gptr() - eback();
  else if (dir == std::ios_base::end)
    base = egptr() - eback();
  // Offsets come from files: compare before adding, so no sum can overflow.
  const off_type size = egptr() - eback();
  if (off < -base || off > size - base) return failed;
  const off_type target = base + off;
  setg(eback(), eback() + target, egptr());
  return pos_type(target);
}

vector_streambuf::pos_type vector_streambuf::seekpos(pos_type pos, std::ios_base::openmode which) {
  return seekoff(off_type(pos), std::ios_base::beg, which);
}

std::streamsize vector_streambuf::showmanyc() {
  std::streamsize left = egptr() - gptr();
  return left > 0 ? left : -1;
}

vector_istream::vector_istream(const ByteVector& bytes) : std::istream(nullptr), buffer_(bytes) { init(&buffer_); }

vector_istream::vector_istream(const std::uint8_t* data, std::size_t size)
    : std::istream(nullptr), buffer_(data, size) {
  init(&buffer_);
}

void vector_istream::reset(const ByteVector& bytes) {
  buffer_.reset(bytes.data(), bytes.size());
  clear();
}

namespace {

struct Lender {
  vector_istream stream{nullptr, 0};
  bool lent = false;
};

Lender& lender() {
  thread_local Lender kept;
  return kept;
}

}  // namespace

LentInput::LentInput(const ByteVector& bytes) {
  Lender& kept = lender();
  if (kept.lent) {
    own_ = std::make_unique<vector_istream>(bytes);
    stream_ = own_.get();
    return;
  }
  kept.lent = true;
  kept.stream.reset(bytes);
  stream_ = &kept.stream;
}

LentInput::~LentInput() {
  if (!own_) lender().lent = false;
}

void getOctets(std::istream& in, std::uint8_t* octets, std::size_t count) {
  std::streambuf* buffer = in.rdbuf();
  const auto n = static_cast<std::streamsize>(count);
  if (in.rdstate() == std::ios_base::goodbit && buffer && zelta::GetArea::available(*buffer) >= n) {
    std::memcpy(octets, zelta::GetArea::next(*buffer), count);
    zelta::GetArea::move(*buffer, n);
    return;
  }
  in.read(reinterpret_cast<char*>(octets), n);
  check(in.gcount() == n, "successful get()");
}

void requireExhausted(std::istream& in) {
  check(in.peek() == std::istream::traits_type::eof(), "valid external length");
}

void requireWritten(std::ostream& out) { check(!out.fail(), "successful write()"); }

}  // namespace util
