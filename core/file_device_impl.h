// The open file behind zelta::file_device and its copies.
#ifndef ZELTA_CORE_FILE_DEVICE_IMPL_H
#define ZELTA_CORE_FILE_DEVICE_IMPL_H

#include <cstddef>
#include <ios>
#include <memory>
#include <string>

#include "klv.h"

namespace zelta {

// Called after each posix_fadvise that a device makes, with its arguments.
// Null unless a test wants to see which advice reached the kernel.
extern void (*file_advice_observer)(boost::iostreams::stream_offset offset, boost::iostreams::stream_offset length,
                                    int advice);

// Throws a std::ios_base::failure whose what() is exactly the text.
[[noreturn]] void fail_file_device(const char* text);

struct ZELTA_LOCAL file_device::impl {
  impl(std::ios_base::openmode open_mode, int open_hints);
  ~impl();
  impl(const impl&) = delete;
  impl& operator=(const impl&) = delete;

  void open(const std::string& path);
  [[noreturn]] void set_partial_mode(boost::iostreams::stream_offset offset, boost::iostreams::stream_offset length);
  void close();

  std::streamsize read(char* s, std::streamsize n);
  std::streamsize write(const char* s, std::streamsize n);
  std::streampos seek(boost::iostreams::stream_offset off, std::ios_base::seekdir way);
  boost::iostreams::stream_offset size() const;
  void truncate();

  std::ios_base::openmode mode;
  int hints;
  int fd = -1;
  std::size_t alignment = 512;
  const std::streamsize optimal_buffer_size = 65536;
  // The aligned read buffer: what was allocated, where the aligned part
  // starts, and the end. Kept between reads; it only grows.
  std::unique_ptr<char[]> buffer;
  char* aligned_start = nullptr;
  char* buffer_end = nullptr;
  // Where the client thinks the stream stands, and where the descriptor does.
  boost::iostreams::stream_offset logical = 0;
  boost::iostreams::stream_offset physical = 0;
  // The largest position written.
  boost::iostreams::stream_offset file_size = 0;

private:
  void advise(int advice);
  void move_to(boost::iostreams::stream_offset position);
  std::size_t read_limit() const;
  std::streamsize read_aligned(char* s, std::streamsize n);
  std::streamsize read_direct(char* s, std::streamsize n);
  void reserve_aligned(std::size_t span);
};

}  // namespace zelta

#endif
