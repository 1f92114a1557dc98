// The octets that a stream buffer already holds ahead of its position.
#ifndef ZELTA_CORE_GET_AREA_H
#define ZELTA_CORE_GET_AREA_H

#include <streambuf>

namespace zelta {

// Reads and passes over what a stream buffer holds without calling into it:
// the stream's own buffer serves small octet runs without a virtual call,
// and, for a file, without a system call, and a skip that ends inside it
// keeps it instead of throwing it away. It derives from std::streambuf only
// to name the buffer's protected members, and is never made.
class GetArea : public std::streambuf {
public:
  GetArea() = delete;

  static std::streamsize available(std::streambuf& buffer) {
    return (buffer.*&GetArea::egptr)() - (buffer.*&GetArea::gptr)();
  }
  // The octets behind the position that are still in the buffer.
  static std::streamsize behind(std::streambuf& buffer) {
    return (buffer.*&GetArea::gptr)() - (buffer.*&GetArea::eback)();
  }
  static const char* next(std::streambuf& buffer) { return (buffer.*&GetArea::gptr)(); }
  // Moves the position by octets, forward at most available() and back at
  // most behind().
  static void move(std::streambuf& buffer, std::streamoff octets) {
    (buffer.*&GetArea::setg)((buffer.*&GetArea::eback)(), (buffer.*&GetArea::gptr)() + octets,
                             (buffer.*&GetArea::egptr)());
  }
};

}  // namespace zelta

#endif
