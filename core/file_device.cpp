#include <memory>
#include <string>

#include "core/file_device_impl.h"
#include "klv.h"

namespace zelta {

using boost::iostreams::stream_offset;

namespace {

// Only the first bit and those above 128 may change once the file is open.
constexpr int changeableHints = ~0xFE;

}  // namespace

file_device::file_device() = default;

file_device::file_device(const std::string& path, std::ios_base::openmode mode, int hints) {
  open(path, mode, hints);
}

file_device::file_device(const std::wstring& path, std::ios_base::openmode mode, int hints) {
  open(path, mode, hints);
}

void file_device::open(const std::string& path, std::ios_base::openmode mode, int hints) {
  auto opening = std::make_shared<impl>(mode, hints);
  opening->open(path);
  impl_ = opening;
}

void file_device::open(const std::wstring& path, std::ios_base::openmode mode, int hints) {
  open(util::utf8::encode(path), mode, hints);
}

void file_device::open(stream_offset offset, stream_offset length, const std::string& path,
                       std::ios_base::openmode mode, int hints) {
  impl opening(mode, hints);
  opening.open(path);
  opening.set_partial_mode(offset, length);
}

void file_device::open(stream_offset offset, stream_offset length, const std::wstring& path,
                       std::ios_base::openmode mode, int hints) {
  open(offset, length, util::utf8::encode(path), mode, hints);
}

bool file_device::is_open() const { return impl_ && impl_->fd >= 0; }

file_device::impl& file_device::opened() const {
  if (!is_open()) fail_file_device("not open");
  return *impl_;
}

void file_device::close() { opened().close(); }

std::streamsize file_device::read(char_type* s, std::streamsize n) { return opened().read(s, n); }

std::streamsize file_device::write(const char_type* s, std::streamsize n) { return opened().write(s, n); }

std::streampos file_device::seek(stream_offset off, std::ios_base::seekdir way) { return opened().seek(off, way); }

stream_offset file_device::size() const { return opened().size(); }

void file_device::truncate() { opened().truncate(); }

std::streamsize file_device::optimal_buffer_size() const { return opened().optimal_buffer_size; }

int file_device::hints() const { return opened().hints; }

void file_device::hints(int value) { hints(value, ~0); }

void file_device::hints(int value, int mask) {
  impl& device = opened();
  const int changed = mask & changeableHints;
  device.hints = (device.hints & ~changed) | (value & changed);
}

}  // namespace zelta
