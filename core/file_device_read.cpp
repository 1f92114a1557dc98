#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "core/file_device_impl.h"

namespace zelta {

using boost::iostreams::stream_offset;

namespace {

constexpr std::size_t fullReadLimit = 1048576;

std::size_t roundUp(std::size_t value, std::size_t alignment) {
  return (value + alignment - 1) / alignment * alignment;
}

}  // namespace

std::streamsize file_device::impl::read(char* s, std::streamsize n) {
  if (n == 0) return 0;
  if (hints & hint_unbuffered) return read_aligned(s, n);
  return read_direct(s, n);
}

std::size_t file_device::impl::read_limit() const {
  return (hints & hint_limited_read) ? alignment : fullReadLimit;
}

std::streamsize file_device::impl::read_direct(char* s, std::streamsize n) {
  move_to(logical);
  const std::size_t wanted = std::min(static_cast<std::size_t>(n), read_limit());
  const ssize_t got = ::read(fd, s, wanted);
  if (got < 0) fail_file_device("bad read");
  if (got == 0) return -1;
  physical += got;
  logical += got;
  return got;
}

// Whole aligned blocks from the block that holds the logical position; the
// caller gets what lies from that position on.
std::streamsize file_device::impl::read_aligned(char* s, std::streamsize n) {
  const stream_offset blockStart = logical - logical % static_cast<stream_offset>(alignment);
  move_to(blockStart);
  const std::size_t remainder = static_cast<std::size_t>(logical - blockStart);
  const std::size_t span = roundUp(remainder + std::min(static_cast<std::size_t>(n), read_limit()), alignment);
  reserve_aligned(span);
  const ssize_t got = ::read(fd, aligned_start, span);
  if (got < 0) fail_file_device("bad read");
  physical += got;
  if (static_cast<std::size_t>(got) <= remainder) return -1;
  const std::size_t copied = std::min(static_cast<std::size_t>(n), static_cast<std::size_t>(got) - remainder);
  std::memcpy(s, aligned_start + remainder, copied);
  logical += static_cast<stream_offset>(copied);
  return static_cast<std::streamsize>(copied);
}

void file_device::impl::reserve_aligned(std::size_t span) {
  if (static_cast<std::size_t>(buffer_end - aligned_start) >= span) return;
  if ((alignment & (alignment - 1)) != 0) fail_file_device("bad alignment (not a power of 2)");
  const std::size_t allocated = span + alignment;
  buffer.reset(new char[allocated]);
  const std::uintptr_t start = reinterpret_cast<std::uintptr_t>(buffer.get());
  const std::uintptr_t mask = alignment - 1;
  aligned_start = reinterpret_cast<char*>((start + mask) & ~mask);
  buffer_end = buffer.get() + allocated;
}

}  // namespace zelta
