#include "core/file_device_impl.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <ios>

namespace zelta {

using boost::iostreams::stream_offset;

void (*file_advice_observer)(stream_offset offset, stream_offset length, int advice) = nullptr;

namespace {

// The standard failure adds the error code's words to what(); clients of
// the device match the bare texts.
class file_device_failure : public std::ios_base::failure {
public:
  explicit file_device_failure(const char* text) : std::ios_base::failure(text), text_(text) {}
  const char* what() const noexcept override { return text_; }

private:
  const char* text_;
};

constexpr mode_t creationPermissions = 0666;

int openFlags(std::ios_base::openmode mode) {
  const bool in = (mode & std::ios_base::in) != 0;
  const bool out = (mode & std::ios_base::out) != 0;
  if (out && !in) return O_WRONLY | O_CREAT | O_TRUNC;
  if (out) return O_RDWR;
  if (in) return O_RDONLY;
  fail_file_device("bad openmode");
}

}  // namespace

void fail_file_device(const char* text) { throw file_device_failure(text); }

file_device::impl::impl(std::ios_base::openmode open_mode, int open_hints) : mode(open_mode), hints(open_hints) {}

file_device::impl::~impl() {
  if (fd >= 0) ::close(fd);
}

void file_device::impl::open(const std::string& path) {
  const int flags = openFlags(mode);
  fd = ::open64(path.c_str(), flags, creationPermissions);
  if (fd < 0) fail_file_device("bad open");
  if (hints & hint_unbuffered) advise(POSIX_FADV_NOREUSE);
  // Only the pair is advised, random first so that sequential is what
  // stands; a single access hint leaves the kernel's default read-ahead.
  if ((hints & hint_sequential) && (hints & hint_random)) {
    advise(POSIX_FADV_RANDOM);
    advise(POSIX_FADV_SEQUENTIAL);
  }
}

void file_device::impl::advise(int advice) {
  ::posix_fadvise(fd, 0, 0, advice);
  if (file_advice_observer) file_advice_observer(0, 0, advice);
}

void file_device::impl::set_partial_mode(stream_offset, stream_offset) {
  fail_file_device("partial mode not implemented");
}

void file_device::impl::close() {
  const int result = ::close(fd);
  fd = -1;
  if (result != 0) fail_file_device("bad close");
}

void file_device::impl::move_to(stream_offset position) {
  if (physical == position) return;
  if (::lseek64(fd, position, SEEK_SET) < 0) fail_file_device("bad seek");
  physical = position;
}

std::streamsize file_device::impl::write(const char* s, std::streamsize n) {
  move_to(logical);
  const ssize_t written = ::write(fd, s, static_cast<std::size_t>(n));
  if (written < 0) fail_file_device("bad write");
  physical += written;
  logical += written;
  file_size = std::max(file_size, logical);
  return written;
}

std::streampos file_device::impl::seek(stream_offset off, std::ios_base::seekdir way) {
  stream_offset base = logical;
  if (way == std::ios_base::beg) base = 0;
  if (way == std::ios_base::end) base = size();
  const stream_offset target = base + off;
  if (target < 0) fail_file_device("bad seek");
  logical = target;
  return boost::iostreams::offset_to_position(target);
}

stream_offset file_device::impl::size() const {
  if ((mode & std::ios_base::in) == 0) return file_size;
  struct stat64 status;
  if (::fstat64(fd, &status) != 0) fail_file_device("bad seek");
  return status.st_size;
}

void file_device::impl::truncate() {
  if (::ftruncate64(fd, logical) != 0) fail_file_device("bad truncate");
  file_size = logical;
}

}  // namespace zelta
