// Zelta: the large-file device for Boost.Iostreams streams. Part of klv.h,
// which includes it.
#ifndef ZELTA_INCLUDE_KLV_FILE_DEVICE_H
#define ZELTA_INCLUDE_KLV_FILE_DEVICE_H

#include <ios>
#include <memory>
#include <string>

#include <boost/iostreams/categories.hpp>
#include <boost/iostreams/positioning.hpp>

#include "klv_values.h"

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
